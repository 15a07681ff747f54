#pragma once

#include "network/errorcode.h"

#include <QByteArray>
#include <QList>
#include <QNetworkProxy>
#include <QNetworkReply>
#include <QObject>
#include <QPointer>
#include <QSslError>
#include <QString>
#include <QTimer>
#include <QUrl>

#include <memory>

class Inflater;
class QNetworkAccessManager;

// One HTTP(S) request object. An asynchronous GET reports to a plain function, keyed by the URL
// text that the owner gave; POST and DELETE block in a local event loop under a time-out.
//
//   owner                  Connection                       event loop
//   createConnection() --> pool
//   setCallback(cb)
//   get(url) ------------> GET --------------------------->
//                          cb(url, READY_READ | PROGRESS) <-- data
//                          [redirect: next GET, same key]  <-- 3xx
//                          cb(url, ERROR), cb(url, FINISHED) <-- end
//   getAvailable(), readData(), removeConnection()  (inside the call-back)
//
// Everything happens on the GUI thread. While a synchronous request waits, other events are
// delivered: its owner must expect to be re-entered or deleted. Answers are capped (see
// setMaximumSize): a larger one is aborted and its code is NET_CANCELED. A GET that goes without a
// byte for "Network/SilenceSeconds" is given up with NET_TIMEOUT.
class Connection : public QObject
{
    Q_OBJECT

public:
    using Callback = void (*)(QString url, CallbackType type, int param);

    // The pool: one process-wide list, in creation order.
    static Connection *createConnection();
    static Connection *createConnection(const QString &proxy); // "host:port"
    static Connection *createConnection(const QString &host, const QString &port);
    // With the configured proxy when there is one, without otherwise.
    static Connection *createConfiguredConnection();
    static Connection *findConnection(const QString &url);
    // Takes the connection out of the pool and schedules its deletion; false if it was not in it.
    // A request under way is aborted and reports nothing more. Removed while it reports its error,
    // it still reports the finish that belongs to it, before removal can be noticed elsewhere.
    static bool removeConnection(Connection *connection);
    static void removeAllConnections();
    // Empties the pool without deleting anything.
    static void clearConnections();
    // Closes the sockets that ended requests have left open for the next ones; for the moment when
    // the network link goes down, since they lead nowhere then.
    static void closeIdleSockets();

    ~Connection() override;

    bool setCallback(Callback callback);
    // Starts an asynchronous GET; NET_SUCCESS, or NET_FAILED when it could not be wired: then no
    // call-back ever comes. Without "Network/SilenceSeconds" no time-out applies.
    ErrorCode get(const QString &url);
    // Code of the last request, for the owner to ask after its end.
    ErrorCode errorCode() const { return mErrorCode; }

    // Whether the last GET failed because the server wants another sign-in (status 401), which has
    // no code of its own.
    bool isSignInRefused() const { return mIsSignInRefused; }

    // Synchronous requests: block until the answer is complete, the time-out expires or the program
    // exits (NET_CANCELED).
    ErrorCode post(const QString &url, const char *data, qint64 length);
    ErrorCode post(const QString &url, const QString &contentType, const char *data, qint64 length);
    ErrorCode post(const QString &url, const QString &contentType, const QByteArray &body);
    ErrorCode deleteResource(const QString &url);

    // Bytes that can be read now, or -1 without a reply.
    qint64 getAvailable() const;
    // Copies up to length bytes; the count, or -1 when nothing or too little is there.
    qint64 readData(char *buffer, qint64 length);

    void setReadBufferSize(qint64 size);
    void setTimeout(int milliseconds) { mTimeout = milliseconds; }
    // Most bytes (after decompression) that an answer may have; 32 MB at first.
    void setMaximumSize(qint64 bytes) { mMaximumSize = bytes; }

    bool setProxy(const QString &proxy);
    bool setProxy(const QString &host, const QString &port);

    QString url() const { return mUrl; }

public slots:
    void init();
    void handleSslErrors(QNetworkReply *reply, const QList<QSslError> &errors);
    void handleError(QNetworkReply::NetworkError code);
    void handleDownloadProgress(qint64 bytesReceived, qint64 bytesTotal);
    void handleReadyRead();
    void handleFinishedData();
    void setProxy();
    void returnCallback(CallbackType type, int param);
    ErrorCode syncRequest();

private:
    Connection();

    void leavePool();
    void release();
    ErrorCode startGet(const QUrl &url);
    ErrorCode wait(QNetworkReply *reply);
    void adopt(QNetworkReply *reply);
    void dropReply();
    bool takeArrived();
    void follow(const QUrl &target);
    void failRedirect();
    void fail(QNetworkReply::NetworkError code, const QString &text);

    QPointer<QNetworkAccessManager> mManager;
    QString mProxyHost;
    quint16 mProxyPort = 0;
    QNetworkProxy mProxy;
    ErrorCode mErrorCode = NET_SUCCESS;
    QPointer<QNetworkReply> mReply;
    QString mUrl;
    int mTimeout = 40000;
    Callback mCallback = nullptr;
    qint64 mMaximumSize = 32 * 1024 * 1024;
    std::unique_ptr<Inflater> mInflater; // of a compressed reply
    QByteArray mBody;                    // of a compressed reply, as far as it has come
    qint64 mTaken = 0;                   // bytes of the current reply that the owner has read
    int mHops = 0;                       // redirects of the current request
    QTimer mNextHop;
    bool mIsTooLarge = false; // the current reply was aborted for its size
    bool mIsRemoved = false;
    bool mIsSignInRefused = false;
};
