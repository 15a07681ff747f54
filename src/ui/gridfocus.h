#pragma once

#include <functional>

// Where the focus of the thumbnail grid goes: plain arithmetic, apart from the widgets.
namespace gridfocus {

// What a key is judged by. Indexes count from 0, the start index from 1.
struct Situation
{
    int index = 0;       // focused cell
    int count = 0;       // cells, hidden ones included
    int columns = 1;     // 1 to 4
    int packageType = 0; // of the list shown
    int startIndex = 1;  // of the page shown
    int records = 0;     // held in the list
};

enum class Move {
    Drop,          // the key does nothing
    ToOwner,       // the owning screen handles the key
    Focus,         // target takes the focus
    PageUp,        // ask for the previous page; target takes the focus if there is one
    PageDown,      // ask for the next page; likewise
    PreviousBlock, // ask for the previous block of search results
    NextBlock,     // ask for the next block
    Enter,         // the cell is pressed
};

struct Step
{
    Move move = Move::Drop;
    int target = -1;
    Move otherwise = Move::Drop; // when the target cannot take the focus
};

// What an arrow, page or Select key does; Drop for every other key.
Step step(int key, const Situation &at);

// The index to use instead of one whose cell is hidden.
int repaired(int index, int count, int columns, const std::function<bool(int)> &isHidden);

// The vertical geometry of the grid, in pixels.
struct Rows
{
    int height = 0;     // of one row
    int contentTop = 0; // of the content in the viewport: 0 or less
    int viewport = 0;   // height of the viewport
};

// Scroll position that shows the row after Up, Down and every other move; -1: stay.
int scrollUp(int row, const Rows &rows);
int scrollDown(int row, const Rows &rows);
int scrollInto(int row, const Rows &rows);

} // namespace gridfocus
