#pragma once

#include <QDateTime>
#include <QString>

// The kinds of list that the service gives. The second name of a value is the one the screens use.
enum PackageType : int {
    INVALID_LIST = 0,
    FEATURED_PHOTOS_LIST = 1,
    ALBUMS_LIST = 2,
    ALBUM_PHOTOS_LIST = 3,
    SEARCH_PHOTOS_LIST = 4,
    PHOTO_COMMENTS_LIST = 5,
    PHOTO_TAGS_LIST = 6,
    FAVORITE_PEOPLE_LIST = 7,
    SEARCH_MORE_PHOTOS_LIST = 8,

    TYPE_FEATURED_PHOTOS = FEATURED_PHOTOS_LIST,
    TYPE_ALBUM_LIST = ALBUMS_LIST,
    TYPE_ALBUM_PHOTOS = ALBUM_PHOTOS_LIST,
    TYPE_SEARCH_PHOTOS = SEARCH_PHOTOS_LIST,
    TYPE_FAVORITE_PEOPLE = FAVORITE_PEOPLE_LIST,
    TYPE_SEARCH_MORE_PHOTOS = SEARCH_MORE_PHOTOS_LIST,
};

// Whether the service tells how many records the whole list has.
bool hasTotalCount(int packageType);

// One request for a page of a list.
struct PackageProperty
{
    int mType = INVALID_LIST;
    QString mUserId;
    QString mAlbumId;
    QString mPhotoId;
    QString mSearchedStr;
    QDateTime mDownloadTime; // when the package was last downloaded; set by the package manager
    int mStartIndex = 1;     // 1-based index of the first wanted record
    int mItemsPerPage = 8;
    int mTotalCount = 0; // records of the whole list, if it has one; set by the package manager
};

// True when both ask for the same list; the page asked for takes no part.
bool operator==(const PackageProperty &a, const PackageProperty &b);
inline bool operator!=(const PackageProperty &a, const PackageProperty &b)
{
    return !(a == b);
}

// Key of the list in the package cache: all pages of one list share it.
QString cacheKey(const PackageProperty &property);
