#include "ui/detailpaging.h"

#include "data/packageproperty.h"
#include "ui/paging.h"

#include <algorithm>

namespace detailpaging {

int pageStart(int packageType, int number)
{
    const bool isSearch =
        packageType == TYPE_SEARCH_PHOTOS || packageType == TYPE_SEARCH_MORE_PHOTOS;
    const int index = number - 1;
    const int block = isSearch ? index / paging::blockSize * paging::blockSize : 0;
    return block + (index - block) / paging::pageSize * paging::pageSize + 1;
}

int stripStart(int number, int total, int places)
{
    return std::max(1, std::min(number - places / 2, total - places + 1));
}

int stripPlaces(int width, int cellWidth, int gap)
{
    const int places = (width + gap) / (cellWidth + gap);
    return std::max(1, places % 2 == 0 ? places - 1 : places);
}

} // namespace detailpaging
