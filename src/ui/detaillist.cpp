#include "ui/detaillist.h"

#include "data/packagemanager.h"
#include "ui/cachedlist.h"
#include "ui/detailpaging.h"
#include "ui/detailphoto.h"
#include "ui/paging.h"

#include <algorithm>

void DetailList::open(Package *package, int firstNumber)
{
    mPackage = package;
    mProperty = package ? package->mProperty : PackageProperty();
    mFirstNumber = firstNumber;
    mTotal = mEnd = 0;
}

// Blocks of further search results share one entry of the cache, which does not tell the block it
// holds: once lost, a block is fetched anew.
Package *DetailList::package()
{
    if (!mPackage && mProperty.mType != TYPE_SEARCH_MORE_PHOTOS)
        mPackage = cachedPackage();
    return mPackage;
}

// The list from its beginning.
Package *DetailList::cachedPackage() const
{
    PackageProperty first = mProperty;
    first.mStartIndex = 1;
    return cachedList(first);
}

int DetailList::heldEnd()
{
    const Package *held = package();
    return mFirstNumber - 1 + (held ? held->count() : 0);
}

const OrvalaPhoto *DetailList::photo(int number)
{
    const Package *held = package();
    return held ? held->record<OrvalaPhoto>(recordIndex(number)) : nullptr;
}

int DetailList::total()
{
    if (const Package *held = package()) {
        const bool isWhole = type() != TYPE_FEATURED_PHOTOS && !paging::isSearch(type());
        mTotal = isWhole ? held->count() : std::max(held->mTotalCount, heldEnd());
    }
    return mEnd > 0 ? std::min(mEnd, mTotal) : mTotal;
}

int DetailList::find(const DetailPhoto &photo)
{
    const Package *held = package();
    for (int i = 0; held && i < held->count(); ++i) {
        const auto *record = held->record<OrvalaPhoto>(i);
        if (record && photo.isOf(*record))
            return number(i);
    }
    return 0;
}

PackageProperty DetailList::requestFor(int number)
{
    mPackageAtRequest = package();
    mEndAtRequest = heldEnd();
    PackageProperty request = mProperty;
    request.mStartIndex = 1;
    if (type() == TYPE_FEATURED_PHOTOS) {
        request.mStartIndex = heldEnd() + 1;
    } else if (paging::isSearch(type())) {
        const int block = paging::blockStart((number - 1) / paging::blockSize);
        if (block == 1 && type() == TYPE_SEARCH_PHOTOS)
            return request;
        request.mType = TYPE_SEARCH_MORE_PHOTOS;
        request.mStartIndex = block;
    }
    return request;
}

bool DetailList::take(const PackageProperty &arrived)
{
    if (arrived.mType == TYPE_SEARCH_MORE_PHOTOS) {
        PackageProperty block = arrived;
        mPackage = PackageManager::getPackage(block);
        mProperty = arrived;
        mFirstNumber = arrived.mStartIndex;
    }
    const Package *now = package();
    const bool isNew = now && (now != mPackageAtRequest || heldEnd() != mEndAtRequest);
    const bool isShortBlock = paging::isSearch(type()) && now && now->count() < paging::blockSize;
    if (!isNew || isShortBlock)
        mEnd = heldEnd(); // the service has less than it says
    return isNew;
}

void DetailList::prepareFollowing(int number)
{
    PackageProperty page = mProperty;
    page.mStartIndex = detailpaging::pageStart(type(), number);
    // Asking for the first page would drop a list that has grown stale.
    if (type() == TYPE_FEATURED_PHOTOS && page.mStartIndex > 1)
        PackageManager::getPackage(page);
}
