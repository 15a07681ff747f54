#include "oauth/oauthutil.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/log.h"
#include "network/jsonparser.h"
#include "network/systemconfig.h"
#include "oauth/oauthpage.h"

#include <QNetworkAccessManager>
#include <QNetworkRequest>
#include <QUrl>

#include <limits>

const QString OAuthUtil::ClientId = QStringLiteral("583920174652-abcdefghijklmnopqrstuvwxyz");
const QString OAuthUtil::ClientSecret = QStringLiteral("Qm7rT2vXk9LpZ4wHs1NdYb8E");
const QString OAuthUtil::RedirectUri = QStringLiteral("urn:ietf:wg:oauth:2.0:oob");

namespace {

// Far beyond any token answer: a larger one is not read to its end.
constexpr qint64 kMaximumResponse = 1024 * 1024;

QString tokenUrl()
{
    return SystemConfig::oauthBase() + QStringLiteral("token");
}

bool isSuccess(const QNetworkReply *reply)
{
    const int status = reply->attribute(QNetworkRequest::HttpStatusCodeAttribute).toInt();
    return reply->error() == QNetworkReply::NoError && status >= 200 && status < 300;
}

} // namespace

OAuthUtil::OAuthUtil(QObject *parent)
    : QObject(parent)
    , mManager(new QNetworkAccessManager(this))
{
    init();
}

OAuthUtil::OAuthUtil(OAuthPage *page, QObject *parent)
    : QObject(parent)
    , mPage(page)
    , mManager(page->networkAccessManager())
{
    init();
}

OAuthUtil::~OAuthUtil()
{
    dropReply();
}

void OAuthUtil::init()
{
    connect(mManager, &QNetworkAccessManager::sslErrors, this, &OAuthUtil::sslErrorHandler);
    connect(&mLoadingTimer, &QTimer::timeout, this, &OAuthUtil::loadingPageTimeout);
}

void OAuthUtil::startLoadingTimer(int milliseconds)
{
    mLoadingTimer.start(milliseconds);
}

void OAuthUtil::stopTimer()
{
    mLoadingTimer.stop();
}

void OAuthUtil::startUserAuthorizate()
{
    logLine("startUserAuthorizate");
    const QString url = SystemConfig::oauthBase() + QStringLiteral("auth?client_id=") + ClientId +
                        QStringLiteral("&redirect_uri=") + RedirectUri + QStringLiteral("&scope=") +
                        SystemConfig::oauthScope() + QStringLiteral("&response_type=code");
    logLine("{OAuthUtil::startUserAuthorizate} codeUrl = ", url);
    if (!mPage)
        return;
    mPage->load(QUrl::fromEncoded(url.toUtf8()));
    connect(mPage, &OAuthPage::titleChanged, this, &OAuthUtil::handleTitleChanged,
            Qt::UniqueConnection);
}

void OAuthUtil::handleTitleChanged(const QString &changedTitle)
{
    stopTimer();
    logLine("handleTitleChanged : ", changedTitle);
    if (changedTitle.startsWith(QLatin1String("Denied error="))) {
        if (mPage)
            mPage->close();
        emit authorized(false);
    } else if (changedTitle.startsWith(QLatin1String("Success code"))) {
        const int equals = changedTitle.indexOf(QLatin1Char('='));
        if (equals > 0) {
            const QString code = changedTitle.mid(equals + 1);
            logLine("code=", code);
            exchangeToken(code);
        }
        if (mPage) {
            mPage->close();
            disconnect(mPage, &OAuthPage::titleChanged, nullptr, nullptr);
        }
    }
}

void OAuthUtil::exchangeToken(const QString &code)
{
    networkPost(tokenUrl(), QString(QStringLiteral("code=") + code + QStringLiteral("&client_id=") +
                                    ClientId + QStringLiteral("&client_secret=") + ClientSecret +
                                    QStringLiteral("&redirect_uri=") + RedirectUri +
                                    QStringLiteral("&grant_type=authorization_code"))
                                .toUtf8());
}

void OAuthUtil::refreshToken()
{
    networkPost(tokenUrl(), QString(QStringLiteral("client_id=") + ClientId +
                                    QStringLiteral("&client_secret=") + ClientSecret +
                                    QStringLiteral("&refresh_token=") +
                                    AccountManagerHelper::getRefreshToken() +
                                    QStringLiteral("&grant_type=refresh_token"))
                                .toUtf8());
}

void OAuthUtil::networkPost(const QString &url, const QByteArray &data)
{
    dropReply();
    if (!mManager)
        return;
    QNetworkRequest request(QUrl::fromEncoded(url.toLatin1()));
    request.setAttribute(QNetworkRequest::RedirectPolicyAttribute,
                         QNetworkRequest::ManualRedirectPolicy);
    // The page's own requests allow HTTP/2: one that does not would open a second connection.
    if (mPage && request.url().scheme() == QLatin1String("https"))
        request.setAttribute(QNetworkRequest::Http2AllowedAttribute, true);
    connect(mManager, &QNetworkAccessManager::finished, this, &OAuthUtil::handleFinishedData,
            Qt::UniqueConnection);
    QNetworkReply *reply = mManager->post(request, data);
    mReply = reply;
    connect(reply, &QNetworkReply::readyRead, this, [reply] {
        if (reply->bytesAvailable() > kMaximumResponse)
            reply->abort();
    });
}

void OAuthUtil::dropReply()
{
    QNetworkReply *reply = mReply;
    mReply.clear();
    if (!reply || !mManager)
        return;
    // Aborting emits finished() before it returns.
    disconnect(mManager, &QNetworkAccessManager::finished, this, nullptr);
    reply->disconnect(this);
    reply->abort();
    reply->deleteLater();
}

void OAuthUtil::handleFinishedData(QNetworkReply *reply)
{
    // The manager also reports what the page loads for itself.
    if (!reply || reply != mReply)
        return;
    mReply.clear();
    readResponse(reply);
    disconnect(mManager, &QNetworkAccessManager::finished, this, nullptr);
    reply->deleteLater();
    takeTokens();
}

void OAuthUtil::readResponse(QNetworkReply *reply)
{
    const QByteArray body = reply->readAll();
    logLine("handleFinishedData response=", QString::fromUtf8(body));
    mResponse.clear();
    if (!isSuccess(reply))
        return;
    const JsonObject members = JsonParser::parse(body);
    for (auto it = members.cbegin(); it != members.cend(); ++it)
        mResponse.insert(it.key(), JsonParser::string(members, it.key()));
}

void OAuthUtil::takeTokens()
{
    mAccessToken = mResponse.value(QStringLiteral("access_token"));
    if (!mAccessToken.isEmpty())
        AccountManagerHelper::setAccessToken(mAccessToken);
    const QString expires = mResponse.value(QStringLiteral("expires_in"));
    if (!expires.isEmpty())
        AccountManagerHelper::setExpires(qMax(0, expires.toInt()));
    const QString refresh = mResponse.value(QStringLiteral("refresh_token"));
    // A refresh token alone would be stored beside an empty access token and spoil the account.
    if (refresh.isEmpty() || mAccessToken.isEmpty()) {
        scheduleRefresh(false);
        return;
    }
    AccountManagerHelper::setRefreshToken(refresh);
    emit authorized(true);
}

int OAuthUtil::refreshInterval(int expires)
{
    const qint64 due = Q_INT64_C(1000) * expires - 100000;
    return int(qBound(Q_INT64_C(0), due, qint64(std::numeric_limits<int>::max())));
}

void OAuthUtil::scheduleRefresh(bool now)
{
    if (now) {
        refreshToken();
        return;
    }
    const int expires = AccountManagerHelper::getExpires();
    logLine("get expires_in from helper: ", expires);
    // The timer ends with this call and never fires, on purpose: a token is refreshed when its
    // account signs in, at no other time.
    QTimer timer;
    connect(&timer, &QTimer::timeout, this, &OAuthUtil::refreshToken);
    timer.start(refreshInterval(expires));
}

void OAuthUtil::sslErrorHandler(QNetworkReply *reply, const QList<QSslError> &errlist)
{
    logLine("---OAuthUtil::sslErrorHandler: ");
    for (const QSslError &error : errlist)
        logLine("ssl error: ", error.errorString());
    if (!SystemConfig::verifyCertificates())
        reply->ignoreSslErrors();
}
