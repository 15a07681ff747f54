#include "ui/cachedlist.h"

#include "data/packagemanager.h"

Package *cachedList(PackageProperty &property)
{
    Package *package = PackageManager::getPackage(property);
    if (!package || package->mIsFeed)
        return package;
    PackageManager::removeCache(property);
    return nullptr;
}
