#pragma once

#include <QString>

// The on-screen keyboard without its widgets: what the 55 keys say and do on each page, and where
// the arrow keys move the focus. Keys are numbered row by row from the top left:
//
//    0..11   26 letters (9, 9 and 8 of them),   digits in the
//   12..23   or what the page has instead       three columns
//   24..34                                      on the right
//   35..46   pages and common signs
//   47..54   cursor, space, new line, "DEL", "Enter"

constexpr int kKeyCount = 55;
constexpr int kFirstKeyOfRow[] = {0, 12, 24, 35, 47, kKeyCount};
constexpr int kKeyRows = 5;

enum KeyIndex {
    LettersKey = 35,
    SymbolsKey = 36,
    AccentsKey = 37,
    CursorLeftKey = 47,
    CursorRightKey = 48,
    CursorUpKey = 49,
    CursorDownKey = 50,
    SpaceKey = 51,
    NewLineKey = 52,
    DeleteKey = 53,
    EnterKey = 54,
};

// Pages come in pairs, of which one key shows the first and then the other.
enum class KeyboardPage { Small, Capital, Symbols, Smileys, SmallAccents, CapitalAccents };
constexpr int kPageCount = 6;

// The key that the focus goes to from this key for an arrow key of the remote (Qt::Key).
int movedKeyFocus(int index, int arrow);

// What a key shows on a page; empty for the keys that show a picture.
QString keyLabel(KeyboardPage page, int index);
// What a key types on a page; empty for the keys that do something else.
QString keyText(KeyboardPage page, int index);

// Whether the texts of the key depend on the page.
bool isPageKey(int index);
// The page to turn to when this key (LettersKey, SymbolsKey or AccentsKey) is pressed.
KeyboardPage pageAfterKey(KeyboardPage page, int index);
// The other page of the pair: capitals and back.
KeyboardPage otherOfPair(KeyboardPage page);
// The page so many places further on, round and round.
KeyboardPage turnedPage(KeyboardPage page, int steps);
// A short sample of what is on the page.
QString pageName(KeyboardPage page);
