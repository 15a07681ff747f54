#include "ui/cachedlist.h"

#include "data/packagemanager.h"

// The look that fetches the page behind it comes last: a request for that page would take the place
// of the one for the list.
Package *cachedList(PackageProperty &property)
{
    const Package *package = PackageManager::cached(property);
    if (!package)
        return nullptr;
    const bool beginsLater =
        property.mType == TYPE_FEATURED_PHOTOS && package->mProperty.mStartIndex > 1;
    if (package->mIsFeed && !beginsLater)
        return PackageManager::getPackage(property);
    PackageManager::removeCache(property);
    return nullptr;
}
