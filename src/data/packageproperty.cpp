#include "data/packageproperty.h"

namespace {

bool isSearch(int type)
{
    return type == SEARCH_PHOTOS_LIST || type == SEARCH_MORE_PHOTOS_LIST;
}

} // namespace

bool hasTotalCount(int packageType)
{
    return packageType == FEATURED_PHOTOS_LIST || isSearch(packageType);
}

bool operator==(const PackageProperty &a, const PackageProperty &b)
{
    if (a.mType != b.mType)
        return false;
    if (isSearch(a.mType))
        return a.mSearchedStr == b.mSearchedStr;
    if (a.mType == FEATURED_PHOTOS_LIST)
        return true;
    return a.mUserId == b.mUserId && a.mAlbumId == b.mAlbumId && a.mPhotoId == b.mPhotoId;
}

QString cacheKey(const PackageProperty &property)
{
    const QString type = QLatin1String("_Type:") + QString::number(property.mType);
    if (isSearch(property.mType))
        return type + QLatin1String("; _SearchedStr:") + property.mSearchedStr;
    if (property.mType == FEATURED_PHOTOS_LIST)
        return type + QLatin1String("; _ItemsPage:") + QString::number(property.mItemsPerPage);
    return type + QLatin1String("; _UserId:") + property.mUserId + QLatin1String("; _AlbumId:") +
           property.mAlbumId + QLatin1String("; _PhotoId:") + property.mPhotoId;
}
