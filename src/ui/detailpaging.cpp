#include "ui/detailpaging.h"

#include "ui/paging.h"

#include <algorithm>

namespace detailpaging {

int pageStart(int packageType, int number)
{
    const int index = number - 1;
    const int block =
        paging::isSearch(packageType) ? index / paging::blockSize * paging::blockSize : 0;
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
