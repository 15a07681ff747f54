#include "ui/homestate.h"

#include "base/log.h"
#include "ui/detailpaging.h"
#include "ui/paging.h"

namespace {

// Lists of which the service tells the total; the others come whole.
bool hasFeedTotal(int type)
{
    return type == TYPE_FEATURED_PHOTOS || paging::isSearch(type);
}

} // namespace

bool HomeState::enterMenu(const PackageProperty &property)
{
    const bool changed = property.mType != mCurrentProperty.mType;
    mSelectedAlbumIndex = 0;
    if (changed) {
        logLine("apackage type has changed");
        mSelectedPersonIndex = 0;
        mSelectedPersonStart = 1;
    }
    mCurrentProperty = property;
    mInitIndex = -1;
    mInitStart = 1;
    mIsSearchShown = false;
    mBlock = 0;
    mIsFromFavorites = property.mType == TYPE_FAVORITE_PEOPLE;
    if (mIsFromFavorites) {
        mSelectedPersonIndex = 0;
        mSelectedPersonStart = 1;
    }
    return changed;
}

void HomeState::openAlbum(int cell, const Album &album)
{
    logLine("Back up the select album index");
    mSelectedAlbumIndex = cell;
    mAlbumList = mCurrentProperty;
    mInitStart = 1;
    mCurrentProperty.mStartIndex = 1;
    mCurrentProperty.mType = TYPE_ALBUM_PHOTOS;
    mCurrentProperty.mUserId = album.userId();
    mCurrentProperty.mAlbumId = album.albumId();
}

void HomeState::openPerson(int cell, const FavoritePeople &person)
{
    mSelectedAlbumIndex = 0;
    mSelectedPersonIndex = cell;
    mSelectedPersonStart = mCurrentProperty.mStartIndex;
    mInitStart = 1;
    mCurrentProperty = PackageProperty();
    mCurrentProperty.mType = TYPE_ALBUM_LIST;
    mCurrentProperty.mUserId = person.user();
}

HomeState::Back HomeState::back() const
{
    const int type = mCurrentProperty.mType;
    if (type == TYPE_ALBUM_PHOTOS)
        return Back::Albums;
    if (type == TYPE_ALBUM_LIST && mIsFromFavorites)
        return Back::People;
    return isSearch() && mIsSearchShown ? Back::SearchBar : Back::SignOut;
}

void HomeState::backToAlbums()
{
    mCurrentProperty = mAlbumList;
    mCurrentProperty.mStartIndex = 1;
    mInitIndex = mSelectedAlbumIndex;
    mInitStart = mAlbumList.mStartIndex;
}

void HomeState::backToPeople()
{
    mCurrentProperty = PackageProperty();
    mCurrentProperty.mType = TYPE_FAVORITE_PEOPLE;
    mCurrentProperty.mUserId = QStringLiteral("default");
    mInitIndex = mSelectedPersonIndex;
    mInitStart = mSelectedPersonStart;
}

void HomeState::startSearch(const QString &text)
{
    mCurrentProperty = PackageProperty();
    mCurrentProperty.mType = TYPE_SEARCH_PHOTOS;
    mCurrentProperty.mSearchedStr = text;
    mIsSearchShown = true;
    mBlock = 0;
    mInitStart = 1;
}

void HomeState::backToSearchBar()
{
    mCurrentProperty.mType = TYPE_SEARCH_PHOTOS;
    mCurrentProperty.mStartIndex = 1;
    mIsSearchShown = false;
    mBlock = 0;
}

bool HomeState::changeBlock(bool next)
{
    const int block = paging::neighbourBlock(mBlock, next, mTotalPhotoNum);
    if (!isSearch() || block == mBlock)
        return false;
    mBlock = block;
    mCurrentProperty.mType = TYPE_SEARCH_MORE_PHOTOS;
    mCurrentProperty.mStartIndex = paging::blockStart(block);
    mInitStart = 1;
    return true;
}

void HomeState::followTo(int number)
{
    mCurrentProperty.mStartIndex = detailpaging::pageStart(mCurrentProperty.mType, number);
    if (!isSearch())
        return;
    mBlock = (number - 1) / paging::blockSize;
    if (mBlock > 0)
        mCurrentProperty.mType = TYPE_SEARCH_MORE_PHOTOS;
}

void HomeState::updateInitIndex(int number)
{
    if (number < 1)
        return;
    const int before = mCurrentProperty.mStartIndex;
    followTo(number);
    const int start = mCurrentProperty.mStartIndex;
    if (start > before)
        logLine("HomeWidget::updateInitIndex() Page DOWN!!!");
    else if (start < before)
        logLine("HomeWidget::updateInitIndex() Page UP!!!");
    else
        logLine("HomeWidget::updateInitIndex() do not switch page");
    mInitIndex = number - start;
}

bool HomeState::takeFirstCellWish()
{
    const bool isWished = mIsReturnFromDetail || mIsPageDown;
    if (mCurrentProperty.mType != TYPE_FEATURED_PHOTOS || !isWished)
        return false;
    mIsReturnFromDetail = mIsPageDown = false;
    return true;
}

bool HomeState::pageUp(int arg)
{
    const bool startsBlock = isSearch() && mCurrentProperty.mStartIndex % paging::blockSize == 1;
    if (startsBlock && arg == paging::onePage)
        return false;
    const paging::Page page = paging::pageUp(mCurrentProperty.mStartIndex, arg);
    if (!page.exists)
        return false;
    mIsPageDown = false;
    mCurrentProperty.mStartIndex = page.startIndex;
    return true;
}

bool HomeState::pageDown(int arg, const Package *package)
{
    if (isSearch() && arg == paging::onePage && package &&
        recordIndex(paging::pageSize) >= package->count())
        return false; // the next page is the next block's
    const paging::Page page = paging::pageDown(mCurrentProperty.mStartIndex, total(package), arg);
    if (!page.exists)
        return false;
    mIsPageDown = true;
    mCurrentProperty.mStartIndex = page.startIndex;
    return true;
}

bool HomeState::canRestart() const
{
    return mCurrentProperty.mStartIndex > 1 && mInitStart == 1;
}

bool HomeState::turnToMissingPage(const Package &package)
{
    if (mCurrentProperty.mType != TYPE_FEATURED_PHOTOS || mInitStart <= package.count() ||
        package.count() < mCurrentProperty.mStartIndex || package.count() >= package.mTotalCount)
        return false;
    mCurrentProperty.mStartIndex = package.count() + 1;
    return true;
}

void HomeState::selectRecord(int number)
{
    const int indexInPage = (qMax(1, number) - 1) % paging::pageSize;
    // Further search results are held from the beginning of their block on.
    const int before = mCurrentProperty.mType == TYPE_SEARCH_MORE_PHOTOS
                           ? mCurrentProperty.mStartIndex - 1 -
                                 (mCurrentProperty.mStartIndex - 1) % paging::blockSize
                           : 0;
    mIsPageDown = false;
    mInitIndex = indexInPage;
    mCurrentProperty.mStartIndex = before + qMax(1, number) - indexInPage;
}

void HomeState::packageArrived(const Package &package)
{
    const int type = mCurrentProperty.mType;
    if (hasFeedTotal(type))
        mTotalPhotoNum = package.mTotalCount;
    if (mInitStart > 1 && paging::recordIndex(type, mInitStart, 0) < package.count())
        mCurrentProperty.mStartIndex = mInitStart;
    mInitStart = 1;
}

void HomeState::moveTo(int cell, const Package *package)
{
    mPhotoIndexInTotal = recordIndex(cell) + 1;
    const bool isFeatured = mCurrentProperty.mType == TYPE_FEATURED_PHOTOS;
    mPhotoDataCount = isFeatured ? mTotalPhotoNum : package ? package->count() : 0;
    if (mPhotoDataCount == 0)
        logLine("enter mPhotoDataCount is 0");
}

void HomeState::restart()
{
    mInitStart = mCurrentProperty.mStartIndex;
    mCurrentProperty.mStartIndex = paging::blockStart(mBlock);
}

int HomeState::recordIndex(int cell) const
{
    return paging::recordIndex(mCurrentProperty.mType, mCurrentProperty.mStartIndex, cell);
}

int HomeState::firstNumber() const
{
    return mCurrentProperty.mStartIndex - recordIndex(0);
}

bool HomeState::isSearch() const
{
    return paging::isSearch(mCurrentProperty.mType);
}

int HomeState::total(const Package *package) const
{
    if (hasFeedTotal(mCurrentProperty.mType))
        return mTotalPhotoNum;
    return package ? package->count() : 0;
}

bool HomeState::isPhotoList() const
{
    const int type = mCurrentProperty.mType;
    return type == TYPE_ALBUM_PHOTOS || hasFeedTotal(type);
}

bool HomeState::isWholeList() const
{
    const int type = mCurrentProperty.mType;
    return type == TYPE_ALBUM_LIST || type == TYPE_ALBUM_PHOTOS || type == TYPE_FAVORITE_PEOPLE ||
           isSearch();
}
