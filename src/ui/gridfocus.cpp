#include "ui/gridfocus.h"

#include "common/ui/remotekeys.h"
#include "data/packageproperty.h"
#include "ui/paging.h"

#include <algorithm>

namespace gridfocus {

namespace {

bool startsLaterBlock(const Situation &at)
{
    return at.packageType == TYPE_SEARCH_MORE_PHOTOS && at.startIndex != 1 &&
           at.startIndex % paging::blockSize == 1;
}

Step pageUpTo(int target, const Situation &at)
{
    if (startsLaterBlock(at))
        return {Move::PreviousBlock};
    return {Move::PageUp, target};
}

Step left(const Situation &at)
{
    if (at.index > 0)
        return {Move::Focus, at.index - 1};
    return pageUpTo(at.count - 1, at);
}

Step right(const Situation &at)
{
    if (at.index == at.count - 1)
        return {Move::PageDown, 0};
    return {Move::Focus, at.index + 1,
            paging::isSearch(at.packageType) ? Move::NextBlock : Move::Drop};
}

Step pageDown(const Situation &at)
{
    if (paging::isSearch(at.packageType) &&
        at.startIndex % paging::blockSize + paging::pageSize > at.records)
        return {Move::NextBlock};
    return {Move::PageDown, 0};
}

Step up(const Situation &at)
{
    if (at.index < at.columns)
        return {Move::ToOwner};
    const bool hasEarlier = at.packageType == TYPE_SEARCH_MORE_PHOTOS ||
                            (at.packageType == TYPE_SEARCH_PHOTOS && at.startIndex != 1);
    return {Move::Focus, at.index - at.columns, hasEarlier ? Move::PreviousBlock : Move::Drop};
}

Step down(const Situation &at)
{
    const int columns = at.columns;
    if (at.index / columns == (at.count - 1) / columns)
        return {Move::PageDown, 0};
    int target = at.index + columns;
    if (target >= at.count)
        target = columns * (at.count / columns); // the first cell of the last row
    return {Move::Focus, target, paging::isSearch(at.packageType) ? Move::NextBlock : Move::Drop};
}

bool isInside(int top, const Rows &rows)
{
    const int shown = rows.contentTop + top;
    return 0 < shown && shown < rows.viewport - rows.height;
}

int aboveLowerEdge(int top, const Rows &rows)
{
    return std::max(0, top + rows.height - rows.viewport + 4);
}

} // namespace

Step step(int key, const Situation &at)
{
    switch (key) {
    case DEVICE_LEFT_KEY:
        return left(at);
    case DEVICE_RIGHT_KEY:
        return right(at);
    case DEVICE_UP_KEY:
        return up(at);
    case DEVICE_DOWN_KEY:
        return down(at);
    case DEVICE_PAGEUP_KEY:
        return pageUpTo(0, at);
    case DEVICE_PAGEDOWN_KEY:
        return pageDown(at);
    case DEVICE_SELECT_KEY:
        return {Move::Enter, at.index};
    default:
        return {};
    }
}

int repaired(int index, int count, int columns, const std::function<bool(int)> &isHidden)
{
    if (index < count && !isHidden(index))
        return index;
    if (columns < 1)
        return 0;
    const int lastRow = (count / columns - 1) * columns;
    const int moved = index >= lastRow ? index - lastRow : index;
    return moved < 0 || moved >= count || isHidden(moved) ? 0 : moved;
}

int scrollUp(int row, const Rows &rows)
{
    const int top = rows.height * row;
    return isInside(top, rows) ? -1 : top;
}

int scrollDown(int row, const Rows &rows)
{
    const int top = rows.height * row;
    return isInside(top, rows) ? -1 : aboveLowerEdge(top, rows);
}

int scrollInto(int row, const Rows &rows)
{
    const int top = rows.height * row;
    const int shown = rows.contentTop + top;
    if (shown < 0)
        return top;
    return shown + rows.height > rows.viewport ? aboveLowerEdge(top, rows) : -1;
}

} // namespace gridfocus
