#include "ui/paging.h"

#include "data/packageproperty.h"

namespace paging {

namespace {

Page pageOf(int record)
{
    if (record < 1)
        return {};
    return {true, record - (record - 1) % pageSize};
}

} // namespace

bool isSearch(int packageType)
{
    return packageType == TYPE_SEARCH_PHOTOS || packageType == TYPE_SEARCH_MORE_PHOTOS;
}

Page pageUp(int startIndex, int arg)
{
    if (arg != onePage)
        return pageOf(arg);
    if (startIndex <= pageSize)
        return {};
    return {true, startIndex - pageSize};
}

Page pageDown(int startIndex, int total, int arg)
{
    if (arg != onePage)
        return pageOf(arg);
    if (startIndex + pageSize > total)
        return {};
    return {true, startIndex + pageSize};
}

int recordIndex(int packageType, int startIndex, int cell)
{
    const int first = packageType == TYPE_SEARCH_MORE_PHOTOS ? startIndex % blockSize : startIndex;
    return first + cell - 1;
}

int neighbourBlock(int block, bool next, int total)
{
    if (next)
        return blockStart(block + 1) > total ? block : block + 1;
    return block > 0 ? block - 1 : 0;
}

int blockStart(int block)
{
    return blockSize * block + 1;
}

} // namespace paging
