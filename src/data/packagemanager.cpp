#include "data/packagemanager.h"

#include "base/log.h"
#include "data/feedtranslation.h"
#include "data/replybody.h"
#include "data/urlcreator.h"
#include "network/connection.h"
#include "network/systemconfig.h"

#include <malloc.h>

PackageManager::RemovalHook PackageManager::mRemovalHook = nullptr;
bool PackageManager::mIsSignInRefused = false;
QHash<QString, Package *> PackageManager::mCachedPackageHash;
QHash<QString, QPointer<Connection>> PackageManager::mDownlodingConnectionHash;
QHash<QString, PackageProperty> PackageManager::mDownlodingPropertyHash;
QHash<QString, PackageManager::Callback> PackageManager::mCallbackFunHash;
QList<PackageProperty> PackageManager::mRecentlyAccessPackagePropertyList;
QList<PackageProperty> PackageManager::mRecentlyDownloadedPackagePropertyList;

namespace {

bool isFirstPage(const PackageProperty &property)
{
    return property.mStartIndex < property.mItemsPerPage;
}

void release(Connection *connection)
{
    connection->setCallback(nullptr);
    Connection::removeConnection(connection);
}

} // namespace

Package *PackageManager::getPackage(PackageProperty &property)
{
    const auto cached = mCachedPackageHash.constFind(cacheKey(property));
    if (cached == mCachedPackageHash.constEnd())
        return nullptr;
    Package *package = *cached;
    if (!package) {
        markAccessed(property);
        return nullptr;
    }
    const int count = package->count();
    if (count > 0 && count < property.mStartIndex && property.mType != SEARCH_MORE_PHOTOS_LIST) {
        logLine("mStartIndex bigger than data count!", property.mStartIndex, " > ", count);
        return nullptr;
    }
    const qint64 age = package->mProperty.mDownloadTime.secsTo(QDateTime::currentDateTimeUtc());
    if (isFirstPage(property) && age >= SystemConfig::pageCacheSeconds()) {
        logLine("package data timeout! mStartIndex =", property.mStartIndex);
        forget(property);
        return nullptr;
    }
    prepareFollowingPage(property, *package);
    return package;
}

const Package *PackageManager::cached(const PackageProperty &property)
{
    return mCachedPackageHash.value(cacheKey(property));
}

// Fetches the page behind the one that is about to be shown, unless it is there.
void PackageManager::prepareFollowingPage(const PackageProperty &property, const Package &package)
{
    if (property.mType != FEATURED_PHOTOS_LIST)
        return;
    const qint64 next = qint64(property.mStartIndex) + property.mItemsPerPage;
    if (package.count() < next && next < package.mTotalCount)
        prepareNextDatas(property, static_cast<int>(next));
}

bool PackageManager::downloadPage(PackageProperty &property, Callback callback)
{
    const QString key = cacheKey(property);
    const auto running = mCallbackFunHash.find(key);
    if (running != mCallbackFunHash.end()) {
        // A page fetched ahead must not take the answer away from a screen that waits for it.
        if (callback)
            *running = callback;
        return true;
    }
    QString url = UrlCreator::getUrl(property);
    logLine("downloadPackage packageUrl=", url);
    if (url.isEmpty())
        return false;
    // Lists that differ only in ids which their address leaves out are requests of their own: the
    // fragment, which is not sent, tells them apart.
    while (mDownlodingConnectionHash.contains(url))
        url += QLatin1Char('#');

    Connection *connection = startRequest(url);
    if (!connection)
        return false;
    mDownlodingPropertyHash.insert(url, property);
    mDownlodingConnectionHash.insert(url, connection);
    mCallbackFunHash.insert(key, callback);
    logLine("PackageManager::downloadPage return TRUE");
    return true;
}

Connection *PackageManager::startRequest(const QString &url)
{
    Connection *connection = Connection::createConfiguredConnection();
    if (!connection) {
        logLine("failed to createConnection in PackageManager::downloadPage");
        return nullptr;
    }
    connection->setCallback(&PackageManager::networkCallback);
    if (connection->get(url) == NET_SUCCESS)
        return connection;
    logLine("failed to conn->get(", url, ") in PackageManager::downloadPage");
    release(connection);
    return nullptr;
}

void PackageManager::prepareNextDatas(PackageProperty property, int startIndex)
{
    if (property.mType != FEATURED_PHOTOS_LIST) {
        logLine("PackageManager::prepareNextDatas do not need prepare data for other type:",
                property.mType);
        return;
    }
    logLine("PackageManager::prepareNextDatas auto download!! startIndex=", startIndex);
    property.mStartIndex = startIndex;
    downloadPage(property, nullptr);
}

void PackageManager::networkCallback(QString url, CallbackType type, int)
{
    if (type == CALLBACK_ERROR) {
        logLine("networkCallback CALLBACK_Error : URL = ", url);
        handleDownloadError(url);
    } else if (type == CALLBACK_FINISHED) {
        handleDownloadFinished(url);
    }
}

// Takes everything that is known of a request out of the tables, for it has ended. Without a
// connection or a property there is nothing to answer, and only the log tells.
PackageManager::Request PackageManager::takeRequest(const QString &url, const char *where)
{
    Request request;
    request.connection = mDownlodingConnectionHash.take(url);
    if (!request.connection) {
        logLine("No cached Connection for URL : ", url, " in PackageManager::", where);
        return request;
    }
    request.property = mDownlodingPropertyHash.take(url);
    if (request.property.mType == INVALID_LIST) {
        logLine("No cached property for URL : ", url, " in PackageManager::", where);
        return request;
    }
    request.callback = mCallbackFunHash.take(cacheKey(request.property));
    return request;
}

void PackageManager::handleDownloadFinished(const QString &url)
{
    Request request = takeRequest(url, "handleDownloadFinished");
    if (!request.connection)
        return;
    PackageProperty &property = request.property;
    if (property.mType == INVALID_LIST) {
        release(request.connection);
        return;
    }
    const ReplyBody body = ReplyBody::read(*request.connection, "PackageManager");
    release(request.connection);

    mIsSignInRefused = false;
    ErrorCode code = body.code();
    if (code == NET_SUCCESS)
        code = storeFeed(property, body.bytes());
    if (request.callback)
        request.callback(property, code);
    // The call-back may have cleared everything, which ends fetching ahead as well.
    if (code == NET_SUCCESS && property.mType == FEATURED_PHOTOS_LIST && isFirstPage(property) &&
        mCachedPackageHash.contains(cacheKey(property)))
        prepareNextDatas(property, property.mStartIndex + property.mItemsPerPage);
}

// Turns the text into records, as a list of its own or behind the pages that are there, and caches
// them. Fills in what the property's owner is told: the time and the feed's total count.
ErrorCode PackageManager::storeFeed(PackageProperty &property, const QByteArray &feedText)
{
    Package *package = mCachedPackageHash.value(cacheKey(property));
    const bool isFurtherPage = package && package->mProperty.mStartIndex != property.mStartIndex;
    const ErrorCode code = isFurtherPage ? appendPackage(property, feedText, &package)
                                         : createPackage(property, feedText, &package);
    if (code != NET_SUCCESS) {
        logLine("Failed to createPage with code", code);
        return code;
    }
    property.mDownloadTime = QDateTime::currentDateTime();
    if (hasTotalCount(property.mType))
        property.mTotalCount = package->mTotalCount;
    if (isFurtherPage)
        package->mProperty.mDownloadTime = property.mDownloadTime;
    else
        package->mProperty = property;
    addToCache(property, package, isFurtherPage);
    return NET_SUCCESS;
}

void PackageManager::handleDownloadError(const QString &url)
{
    Request request = takeRequest(url, "handleDownloadError");
    if (!request.connection)
        return;
    const ErrorCode code = request.connection->errorCode();
    mIsSignInRefused = request.connection->isSignInRefused();
    Connection::removeConnection(request.connection);
    if (request.property.mType == INVALID_LIST)
        return;
    if (request.callback)
        request.callback(request.property, code);
    else
        logLine("Failed to find callback in PackageManager::handleDownloadError for url", url);
}

bool PackageManager::canBeRemovedByNewlyArrivedPackage(PackageProperty &property, int arrivedType)
{
    logLine("canBeRemovedByNewlyArrivedPackage mtype=", property.mType,
            "; ArriveType=", arrivedType);
    const bool isDetailOfPhoto =
        arrivedType == PHOTO_COMMENTS_LIST || arrivedType == PHOTO_TAGS_LIST;
    const bool isKnown =
        arrivedType >= FEATURED_PHOTOS_LIST && arrivedType <= SEARCH_MORE_PHOTOS_LIST;
    return property.mType == arrivedType || (isKnown && !isDetailOfPhoto);
}

void PackageManager::addToCache(PackageProperty &property, Package *package, bool appended)
{
    const QString key = cacheKey(property);
    removeStalePackages(property, package);
    removeSurplusPackages(property, package);

    Package *previous = mCachedPackageHash.value(key);
    mCachedPackageHash.insert(key, package);
    if (previous != package)
        discard(previous);
    if (appended || previous)
        mRecentlyDownloadedPackagePropertyList.removeAll(property);
    mRecentlyDownloadedPackagePropertyList.append(appended ? package->mProperty : property);
    markAccessed(property);
}

void PackageManager::markAccessed(const PackageProperty &property)
{
    mRecentlyAccessPackagePropertyList.removeAll(property);
    mRecentlyAccessPackagePropertyList.append(property);
}

// The two log texts say the opposite of what happened; whoever reads the logs knows them so.
void PackageManager::removeStalePackages(const PackageProperty &arrived, const Package *kept)
{
    const QDateTime now = QDateTime::currentDateTimeUtc();
    const int lifetime = SystemConfig::pageCacheSeconds();
    for (int i = 0; i < mRecentlyDownloadedPackagePropertyList.size();) {
        PackageProperty entry = mRecentlyDownloadedPackagePropertyList.at(i);
        if (entry.mDownloadTime.addSecs(lifetime) >= now) {
            logLine("packageManager.cpp type=", entry.mType, "timeout!!");
            return;
        }
        logLine("packageManager.cpp do not timeout");
        if (canBeRemovedByNewlyArrivedPackage(entry, arrived.mType) &&
            entry.mStartIndex == arrived.mStartIndex && isOther(entry, kept))
            forget(entry);
        else
            ++i;
    }
}

void PackageManager::removeSurplusPackages(const PackageProperty &arrived, const Package *kept)
{
    const int most = SystemConfig::pageCacheNumber();
    int i = 0;
    while (mCachedPackageHash.size() >= most && i < mRecentlyAccessPackagePropertyList.size()) {
        logLine("packageManager.cpp 2 while");
        PackageProperty entry = mRecentlyAccessPackagePropertyList.at(i);
        if (canBeRemovedByNewlyArrivedPackage(entry, arrived.mType) && isOther(entry, kept))
            forget(entry);
        else
            ++i;
    }
}

// False for the entry of the package itself, when an arrived page goes into a cached one.
bool PackageManager::isOther(const PackageProperty &entry, const Package *package)
{
    return mCachedPackageHash.value(cacheKey(entry)) != package;
}

// Drops the list from the cache and from both recency lists.
void PackageManager::forget(PackageProperty property)
{
    removeCache(property);
    mRecentlyAccessPackagePropertyList.removeAll(property);
    mRecentlyDownloadedPackagePropertyList.removeAll(property);
}

void PackageManager::removeCache(PackageProperty &property)
{
    logLine("packagemanager.cpp removeCache! Type = ", property.mType);
    discard(mCachedPackageHash.take(cacheKey(property)));
}

void PackageManager::discard(Package *package)
{
    if (package && mRemovalHook)
        mRemovalHook(package);
    delete package;
}

void PackageManager::setRemovalHook(RemovalHook hook)
{
    mRemovalHook = hook;
}

void PackageManager::clearAll()
{
    const auto packages = mCachedPackageHash;
    mCachedPackageHash.clear();
    for (Package *package : packages)
        discard(package);
    mRecentlyAccessPackagePropertyList.clear();
    mRecentlyDownloadedPackagePropertyList.clear();

    const auto connections = mDownlodingConnectionHash;
    mDownlodingConnectionHash.clear();
    mDownlodingPropertyHash.clear();
    mCallbackFunHash.clear();
    for (const QPointer<Connection> &connection : connections) {
        if (connection)
            release(connection);
    }
    malloc_trim(0);
}
