#pragma once

#include "network/errorcode.h"

#include <QByteArray>
#include <QCache>
#include <QHash>
#include <QList>
#include <QPixmap>
#include <QPointer>
#include <QString>

class Connection;

// Downloads pictures a few at a time, queues the rest, decodes them and keeps them in a cache
// bounded by bytes. Everyone who asked for a URL is called back once. GUI thread only.
class PhotoManager
{
public:
    using Callback = void (*)(QString &url, ErrorCode code);

    // Sets the cache's capacity from the configuration and lets freed pictures go back to the
    // system; called once at start.
    static void init();

    // True unless a connection could not be created or started; then nothing calls back.
    static bool downloadPhoto(const QString &url, Callback callback);
    // The call-back no longer waits for the URL; a download for which nobody waits is ended, and
    // the next queued one begins.
    static void withdraw(const QString &url, Callback callback);
    // The cached picture, with the device pixel ratio of the interface's scale, or null. The cache
    // may delete it with the next picture that arrives: never keep the pointer over the event loop.
    static QPixmap *getPhoto(const QString &url);

    static void networkCallback(QString url, CallbackType type, int param);
    // Forgets the queued URLs with their call-backs, not the running ones.
    static void cancelDownloadWaitingPhoto();
    // Ends everything and empties the cache, without calling back; gives the memory back to the
    // system.
    static void clearAll();

    static void handleDownloadFinished(const QString &url);
    static void handleDownloadError(const QString &url);
    // Decodes a picture (owned by the caller), or null: not a picture, broken, or larger than 64
    // megapixels, which the header tells before anything is decoded.
    static QPixmap *createPhoto(const char *data, qint64 length);

private:
    static Connection *createConnection();
    static bool hasFreeConnection();
    static bool startDownload(const QString &url);
    static ErrorCode takePicture(const QString &url, QPointer<Connection> &connection);
    // Starts the next queued URLs, first on the connection that has become free (or null).
    static void downloadWaitingPhoto(Connection *connection);
    static void notify(const QString &url, ErrorCode code);

    static QCache<QString, QPixmap> mPhotoCache;
    static QHash<QString, QPointer<Connection>> mDownlodingConnectionHash;
    static QHash<QString, QString> mDownlodingURLHash;
    static QMultiHash<QString, Callback> mCallbackFunHash;
    static QList<QString> mNeedDownloadPhotoUrlList;
    static int mClearCount; // tells a call-back's caller that everything was cleared meanwhile
};
