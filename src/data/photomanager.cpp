#include "data/photomanager.h"

#include "base/log.h"
#include "data/picturereader.h"
#include "data/replybody.h"
#include "network/connection.h"
#include "network/systemconfig.h"

#include <limits>
#include <malloc.h>
#include <memory>

QCache<QString, QPixmap> PhotoManager::mPhotoCache(10 * 1024 * 1024);
QHash<QString, QPointer<Connection>> PhotoManager::mDownlodingConnectionHash;
QHash<QString, QString> PhotoManager::mDownlodingURLHash;
QMultiHash<QString, PhotoManager::Callback> PhotoManager::mCallbackFunHash;
QList<QString> PhotoManager::mNeedDownloadPhotoUrlList;
int PhotoManager::mClearCount = 0;

namespace {

const qint64 maximumPictureBytes = 64 * 1024 * 1024;
// Above thumbnails, which come and go by the page and would cost most of their time in new memory.
const int mappedBlockBytes = 640 * 1024;

int clampedToInt(qint64 value)
{
    return static_cast<int>(qMin<qint64>(value, std::numeric_limits<int>::max()));
}

int costOf(const QPixmap &picture)
{
    return clampedToInt(qint64(picture.width()) * picture.height() * picture.depth() / 8);
}

void release(Connection *connection)
{
    if (!connection)
        return;
    connection->setCallback(nullptr);
    Connection::removeConnection(connection);
}

} // namespace

void PhotoManager::init()
{
    mPhotoCache.setMaxCost(clampedToInt(SystemConfig::imageCacheSize()));
    // Photos get memory of their own from the system, which has it back as soon as the cache
    // drops them. Left to itself the allocator would soon keep them in a heap full of holes.
    mallopt(M_MMAP_THRESHOLD, mappedBlockBytes);
}

Connection *PhotoManager::createConnection()
{
    Connection *connection = Connection::createConfiguredConnection();
    if (!connection)
        return nullptr;
    connection->setMaximumSize(maximumPictureBytes);
    if (connection->setCallback(&PhotoManager::networkCallback))
        return connection;
    release(connection);
    return nullptr;
}

// At least one picture at a time, whatever is configured: otherwise all would wait for ever.
bool PhotoManager::hasFreeConnection()
{
    return mDownlodingConnectionHash.size() < qMax(1, SystemConfig::photoDownloaderNumber());
}

bool PhotoManager::downloadPhoto(const QString &url, Callback callback)
{
    if (mCallbackFunHash.contains(url)) {
        if (!mCallbackFunHash.contains(url, callback))
            mCallbackFunHash.insert(url, callback);
        return true;
    }
    if (hasFreeConnection()) {
        if (!startDownload(url))
            return false;
    } else {
        mNeedDownloadPhotoUrlList.append(url);
    }
    mCallbackFunHash.insert(url, callback);
    mDownlodingURLHash.insert(url, url);
    return true;
}

bool PhotoManager::startDownload(const QString &url)
{
    Connection *connection = createConnection();
    if (!connection) {
        logLine("failed to createConnection in PhotoManager::downloadPhot");
        return false;
    }
    if (connection->get(url) != NET_SUCCESS) {
        logLine("failed to conn->get(", url, ") in  PhotoManager::downloadPhoto");
        release(connection);
        return false;
    }
    mDownlodingConnectionHash.insert(url, connection);
    logLine("PhotoManager::downloadPhoto return TRUE");
    return true;
}

QPixmap *PhotoManager::getPhoto(const QString &url)
{
    return mPhotoCache.object(url);
}

void PhotoManager::networkCallback(QString url, CallbackType type, int)
{
    if (type == CALLBACK_ERROR) {
        logLine("networkCallback CALLBACK_Error : URL = ", url);
        handleDownloadError(url);
    } else if (type == CALLBACK_FINISHED) {
        handleDownloadFinished(url);
    }
}

void PhotoManager::handleDownloadFinished(const QString &url)
{
    QPointer<Connection> connection = mDownlodingConnectionHash.value(url);
    if (!connection) {
        logLine("No cached Connection for URL : ", url, " in PageManager::handleDownloadFinished");
        downloadWaitingPhoto(nullptr);
        return;
    }
    const ErrorCode code = takePicture(url, connection);
    mDownlodingConnectionHash.remove(url);
    notify(url, code);
    downloadWaitingPhoto(connection);
}

// Reads and decodes what has arrived, into the cache. After a failed read the connection is of no
// more use: it is released and the pointer cleared.
ErrorCode PhotoManager::takePicture(const QString &url, QPointer<Connection> &connection)
{
    const ReplyBody body = ReplyBody::read(*connection, "PageManager");
    if (body.code() != NET_SUCCESS) {
        release(connection);
        connection.clear();
        return body.code();
    }
    const QByteArray bytes = body.bytes();
    QPixmap *picture = createPhoto(bytes.constData(), bytes.size());
    if (!picture)
        return NET_REJECTED;
    // As labels want it; set when it is shown, it would cost a copy each time.
    picture->setDevicePixelRatio(SystemConfig::scale());
    const int cost = costOf(*picture);
    if (!mPhotoCache.insert(url, picture, cost))
        logLine("failed to cache photo:", url, "; result :", "false", "; size = ", cost);
    return NET_SUCCESS;
}

void PhotoManager::handleDownloadError(const QString &url)
{
    const QPointer<Connection> connection = mDownlodingConnectionHash.take(url);
    if (!connection) {
        logLine("No cached Connection for URL : ", url, " in PageManager::handleDownloadError");
    } else {
        const ErrorCode code = connection->errorCode();
        Connection::removeConnection(connection);
        notify(url, code);
    }
    downloadWaitingPhoto(nullptr);
}

void PhotoManager::notify(const QString &url, ErrorCode code)
{
    const QList<Callback> callbacks = mCallbackFunHash.values(url);
    mCallbackFunHash.remove(url);
    const QString handedBack = mDownlodingURLHash.take(url);
    const int cleared = mClearCount;
    for (auto callback = callbacks.crbegin(); callback != callbacks.crend(); ++callback) {
        if (cleared != mClearCount)
            return;
        QString copy = handedBack;
        if (*callback)
            (*callback)(copy, code);
    }
}

void PhotoManager::downloadWaitingPhoto(Connection *connection)
{
    QPointer<Connection> free = connection;
    while (!mNeedDownloadPhotoUrlList.isEmpty() && hasFreeConnection()) {
        if (!free)
            free = createConnection();
        if (!free) {
            logLine("failed to createConnection in PhotoManager::downloadWaitingPhoto");
            return;
        }
        const QString url = mNeedDownloadPhotoUrlList.takeFirst();
        if (free->get(url) == NET_SUCCESS) {
            logLine("PhotoManager::downloadWaitingPhoto URL:", url);
            mDownlodingConnectionHash.insert(url, free);
            return;
        }
        logLine("failed to conn->get(", url, ") in  PhotoManager::downloadWaitingPhoto");
        const ErrorCode code = free->errorCode();
        release(free);
        free.clear();
        notify(url, code);
    }
    release(free);
}

void PhotoManager::withdraw(const QString &url, Callback callback)
{
    if (mCallbackFunHash.remove(url, callback) == 0 || mCallbackFunHash.contains(url))
        return;
    mDownlodingURLHash.remove(url);
    mNeedDownloadPhotoUrlList.removeAll(url);
    if (Connection *connection = mDownlodingConnectionHash.take(url)) {
        release(connection);
        downloadWaitingPhoto(nullptr);
    }
}

void PhotoManager::cancelDownloadWaitingPhoto()
{
    while (!mNeedDownloadPhotoUrlList.isEmpty()) {
        const QString url = mNeedDownloadPhotoUrlList.takeFirst();
        mDownlodingURLHash.remove(url);
        mCallbackFunHash.remove(url);
        logLine("cancelDownloadWaitingPhoto URL: ", url);
    }
}

void PhotoManager::clearAll()
{
    ++mClearCount;
    cancelDownloadWaitingPhoto();
    const auto connections = mDownlodingConnectionHash;
    mDownlodingConnectionHash.clear();
    mDownlodingURLHash.clear();
    mCallbackFunHash.clear();
    for (const QPointer<Connection> &connection : connections)
        release(connection);
    mPhotoCache.clear();
    malloc_trim(0);
}

QPixmap *PhotoManager::createPhoto(const char *data, qint64 length)
{
    if (!data || length <= 0) {
        logLine("invalid parameter in createPhot");
        return nullptr;
    }
    if (length <= std::numeric_limits<int>::max()) {
        auto picture = std::make_unique<QPixmap>(
            readPicture(QByteArray::fromRawData(data, static_cast<int>(length))));
        if (!picture->isNull())
            return picture.release();
    }
    logLine("Failed to decode photo data in createPhot");
    return nullptr;
}
