#include "network/connection.h"

#include "base/log.h"
#include "network/inflater.h"
#include "network/managerpark.h"
#include "network/replyerror.h"
#include "network/systemconfig.h"
#include "network/tlssessions.h"

#include <QEventLoop>
#include <QNetworkAccessManager>
#include <QNetworkRequest>

#include <algorithm>
#include <iterator>

namespace {

// Redirects beyond the first few wait a little each, so that a loop of them costs next to nothing.
constexpr int promptHops = 20;
constexpr int lateHopMilliseconds = 250;

// A text with a percent sign, unless at its start, is already encoded.
QUrl urlOf(const QString &text)
{
    return text.indexOf(QLatin1Char('%')) >= 1 ? QUrl::fromEncoded(text.toUtf8()) : QUrl(text);
}

QNetworkRequest requestFor(const QUrl &url)
{
    QNetworkRequest request(url);
    // What the toolkit would ask for too; asked for here, it leaves the bytes as they come.
    request.setRawHeader("Accept-Encoding", "gzip, deflate");
    TlsSessions::offer(request);
    return request;
}

bool isWebAddress(const QUrl &url)
{
    return url.isValid() &&
           (url.scheme() == QLatin1String("http") || url.scheme() == QLatin1String("https")) &&
           !url.host().isEmpty();
}

ErrorCode codeOfReply(const QNetworkReply &reply)
{
    logLine("Connection::syncRequest() network has reply!!!");
    logLine("errorcode=", int(reply.error()));
    TlsSessions::remember(reply);
    const ErrorCode code = synchronousErrorCode(reply.error());
    if (code == NET_SUCCESS)
        logLine("Connection::syncRequest() SUCCESS");
    else if (code == NET_FAILED)
        logLine("Connection::syncRequest NET_FAILED");
    return code;
}

} // namespace

Connection::Connection()
{
    mNextHop.setSingleShot(true);
    init();
}

Connection::~Connection()
{
    leavePool();
    dropReply();
    if (!mManager)
        return;
    disconnect(mManager, nullptr, this, nullptr);
    ManagerPark::park(mManager);
}

// Deletion is deferred, silence is not: nothing is reported from here on.
void Connection::release()
{
    mIsRemoved = true;
    mNextHop.stop();
    dropReply();
    deleteLater();
}

void Connection::init()
{
    if (mManager)
        return;
    mManager = ManagerPark::take();
    mManager->setParent(this);
    connect(mManager, &QNetworkAccessManager::sslErrors, this, &Connection::handleSslErrors);
}

bool Connection::setCallback(Callback callback)
{
    mCallback = callback;
    return mCallback != nullptr;
}

bool Connection::setProxy(const QString &proxy)
{
    const int colon = proxy.indexOf(QLatin1Char(':'));
    return setProxy(proxy.left(colon), colon < 0 ? QString() : proxy.mid(colon + 1));
}

bool Connection::setProxy(const QString &host, const QString &port)
{
    const quint16 number = port.toUShort();
    logLine("mProxyHost=", host, "; mProxyPort=", number);
    if (host.isEmpty() || number == 0)
        return false;
    mProxyHost = host;
    mProxyPort = number;
    setProxy();
    return true;
}

// The proxy holds for the whole program; setting the same one again would only cost its sockets.
void Connection::setProxy()
{
    mProxy = QNetworkProxy(QNetworkProxy::HttpProxy, mProxyHost, mProxyPort);
    if (QNetworkProxy::applicationProxy() != mProxy)
        QNetworkProxy::setApplicationProxy(mProxy);
}

ErrorCode Connection::get(const QString &url)
{
    mUrl = url;
    mHops = 0;
    mNextHop.stop();
    return startGet(urlOf(url));
}

ErrorCode Connection::startGet(const QUrl &url)
{
    dropReply();
    mErrorCode = NET_SUCCESS;
    mIsSignInRefused = false;
    if (!mManager)
        return mErrorCode = NET_FAILED;
    QNetworkRequest request = requestFor(url);
    request.setTransferTimeout(SystemConfig::silenceSeconds() * 1000);
    adopt(mManager->get(request));
    const QMetaObject::Connection wires[] = {
        connect(mReply, &QNetworkReply::errorOccurred, this, &Connection::handleError),
        connect(mReply, &QNetworkReply::readyRead, this, &Connection::handleReadyRead),
        connect(mReply, &QNetworkReply::finished, this, &Connection::handleFinishedData),
        connect(mReply, &QNetworkReply::downloadProgress, this,
                &Connection::handleDownloadProgress),
    };
    if (std::all_of(std::begin(wires), std::end(wires),
                    [](const auto &wire) { return bool(wire); }))
        return NET_SUCCESS;
    dropReply();
    return mErrorCode = NET_FAILED;
}

void Connection::adopt(QNetworkReply *reply)
{
    mReply = reply;
    mInflater.reset();
    mBody.clear();
    mTaken = 0;
    mIsTooLarge = false;
}

// The reply may be in the middle of a signal: it is silenced at once and deleted later, which also
// ends its transfer.
void Connection::dropReply()
{
    if (!mReply)
        return;
    disconnect(mReply, nullptr, this, nullptr);
    mReply->deleteLater();
    mReply.clear();
}

void Connection::handleReadyRead()
{
    if (takeArrived())
        returnCallback(CALLBACK_READY_READ, 0);
}

// False if the answer has become too large and was aborted.
bool Connection::takeArrived()
{
    if (!mReply)
        return true;
    if (!mInflater)
        mInflater = Inflater::create(mReply->rawHeader("Content-Encoding"));
    if (mInflater)
        mInflater->feed(mReply->readAll(), mBody, mMaximumSize);
    if (mTaken + getAvailable() <= mMaximumSize && !(mInflater && mInflater->isBomb()))
        return true;
    mIsTooLarge = true;
    mReply->abort();
    return false;
}

void Connection::handleDownloadProgress(qint64 bytesReceived, qint64 bytesTotal)
{
    if (bytesReceived < 0)
        return;
    const qint64 announced =
        mReply ? mReply->header(QNetworkRequest::ContentLengthHeader).toLongLong() : 0;
    // At the end the toolkit makes up a total for an answer that never had one.
    const bool isMadeUp = mReply && announced <= 0 && bytesTotal == bytesReceived;
    if (bytesTotal <= 0)
        bytesTotal = announced;
    if (bytesTotal <= 0 || isMadeUp)
        return;
    const qint64 received = qMin(bytesReceived, bytesTotal);
    returnCallback(CALLBACK_PROGRESS, int(received * 100 / bytesTotal));
}

void Connection::handleError(QNetworkReply::NetworkError code)
{
    // The toolkit calls it cancelling, too, when it gives up a silent request.
    const bool isSilent = code == QNetworkReply::OperationCanceledError && !mIsTooLarge;
    fail(isSilent ? QNetworkReply::TimeoutError : code, mReply ? mReply->errorString() : QString());
}

void Connection::fail(QNetworkReply::NetworkError code, const QString &text)
{
    mErrorCode = asynchronousErrorCode(code);
    mIsSignInRefused = code == QNetworkReply::AuthenticationRequiredError;
    logLine("Network connection has an error occur:", text, "code=", int(code));
    if (code == QNetworkReply::UnknownContentError) {
        logLine("Connection::handleError ignor : QNetworkReply::UnknownContentError");
        return;
    }
    const QPointer<Connection> self(this);
    returnCallback(CALLBACK_ERROR, code);
    // Every error is followed by a finish, unless the key is in use again by now.
    if (self && mIsRemoved && !findConnection(mUrl))
        returnCallback(CALLBACK_FINISHED, 0);
}

void Connection::handleFinishedData()
{
    if (!mReply)
        return;
    TlsSessions::remember(*mReply);
    const QVariant target = mReply->attribute(QNetworkRequest::RedirectionTargetAttribute);
    if (target.isValid() && mReply->error() == QNetworkReply::NoError)
        follow(target.toUrl());
    else
        returnCallback(CALLBACK_FINISHED, 0);
}

void Connection::follow(const QUrl &target)
{
    const QUrl next = mReply->url().resolved(target);
    if (!target.isEmpty() && isWebAddress(next)) {
        dropReply();
        mNextHop.disconnect();
        connect(&mNextHop, &QTimer::timeout, this, [this, next] {
            if (startGet(next) != NET_SUCCESS)
                failRedirect();
        });
        mNextHop.start(mHops++ < promptHops ? 0 : lateHopMilliseconds);
        return;
    }
    failRedirect();
}

void Connection::failRedirect()
{
    const QPointer<Connection> self(this);
    fail(QNetworkReply::ProtocolInvalidOperationError, QStringLiteral("Redirect to nowhere"));
    if (self && !mIsRemoved)
        returnCallback(CALLBACK_FINISHED, 0);
}

void Connection::handleSslErrors(QNetworkReply *reply, const QList<QSslError> &errors)
{
    for (const QSslError &error : errors)
        logLine("Connection::handleSslErrors ssl error: ", error.errorString());
    if (!SystemConfig::verifyCertificates())
        reply->ignoreSslErrors();
}

void Connection::returnCallback(CallbackType type, int param)
{
    if (mCallback)
        mCallback(mUrl, type, param);
    else
        logLine(" Before call network GET function, the callback function must be set!!");
}

ErrorCode Connection::post(const QString &url, const char *data, qint64 length)
{
    // What the toolkit sends without a content type, said aloud to spare its warning.
    return post(url, QStringLiteral("application/x-www-form-urlencoded"), data, length);
}

ErrorCode Connection::post(const QString &url, const QString &contentType, const char *data,
                           qint64 length)
{
    // A copy: after a time-out the request goes on without the caller.
    return post(url, contentType, QByteArray(data, int(qMax(Q_INT64_C(0), length))));
}

ErrorCode Connection::post(const QString &url, const QString &contentType, const QByteArray &body)
{
    mUrl = url;
    QNetworkRequest request = requestFor(urlOf(url));
    request.setHeader(QNetworkRequest::ContentTypeHeader, contentType);
    return wait(mManager ? mManager->post(request, body) : nullptr);
}

ErrorCode Connection::deleteResource(const QString &url)
{
    mUrl = url;
    return wait(mManager ? mManager->deleteResource(requestFor(urlOf(url))) : nullptr);
}

ErrorCode Connection::wait(QNetworkReply *reply)
{
    mNextHop.stop();
    dropReply();
    adopt(reply);
    if (reply)
        connect(reply, &QNetworkReply::readyRead, this, &Connection::takeArrived);
    return syncRequest();
}

// Anything may happen while the loop runs: this object or its reply may go, another request may
// start, the program may be told to exit. Only what the locals say counts afterwards.
ErrorCode Connection::syncRequest()
{
    mErrorCode = NET_SUCCESS;
    const QPointer<QNetworkReply> reply = mReply;
    QEventLoop loop;
    QTimer timer;
    timer.setSingleShot(true);
    if (!reply || !connect(&timer, &QTimer::timeout, &loop, &QEventLoop::quit) ||
        !connect(reply, &QNetworkReply::finished, &loop, &QEventLoop::quit) ||
        !connect(reply, &QObject::destroyed, &loop, &QEventLoop::quit))
        return mErrorCode = NET_FAILED;

    const QPointer<Connection> self(this);
    logLine("mTimeout =", mTimeout);
    timer.start(qMax(0, mTimeout));
    if (!reply->isFinished())
        loop.exec();

    ErrorCode code = NET_CANCELED;
    if (reply && reply->isFinished()) {
        code = codeOfReply(*reply);
    } else if (reply && !timer.isActive()) {
        logLine("Connection::syncRequest() NET_TIMEOUT!!!");
        code = NET_TIMEOUT;
    }
    if (self)
        mErrorCode = code;
    return code;
}

qint64 Connection::getAvailable() const
{
    if (!mReply)
        return -1;
    return mInflater ? mBody.size() - mTaken : mReply->bytesAvailable();
}

qint64 Connection::readData(char *buffer, qint64 length)
{
    const qint64 available = getAvailable();
    logLine("availableSize =", available, " len=", length);
    if (available <= 0 || !buffer || length < 0)
        return -1;
    const qint64 wanted = qMin(available, length);
    qint64 count = wanted;
    if (mInflater)
        std::copy_n(mBody.constData() + mTaken, wanted, buffer);
    else
        count = mReply->read(buffer, wanted);
    mTaken += qMax(Q_INT64_C(0), count);
    if (length >= available)
        logLine("read data from buffer to byteArray, lenght=", count);
    return count < wanted ? -1 : count;
}

void Connection::setReadBufferSize(qint64 size)
{
    if (mReply)
        mReply->setReadBufferSize(size);
}
