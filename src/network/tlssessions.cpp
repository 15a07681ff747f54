#include "network/tlssessions.h"

#include <QCache>
#include <QNetworkReply>
#include <QNetworkRequest>
#include <QSslConfiguration>

namespace {

constexpr int mostHosts = 16;

QCache<QString, QByteArray> &tickets()
{
    static QCache<QString, QByteArray> byHost(mostHosts);
    return byHost;
}

QString keyOf(const QUrl &url)
{
    return url.host() + QLatin1Char(':') + QString::number(url.port(443));
}

bool isSecure(const QUrl &url)
{
    return url.scheme() == QLatin1String("https");
}

} // namespace

namespace TlsSessions {

void offer(QNetworkRequest &request)
{
    if (!isSecure(request.url()))
        return;
    QSslConfiguration configuration = QSslConfiguration::defaultConfiguration();
    configuration.setSslOption(QSsl::SslOptionDisableSessionPersistence, false);
    if (const QByteArray *ticket = tickets().object(keyOf(request.url())))
        configuration.setSessionTicket(*ticket);
    request.setSslConfiguration(configuration);
}

void remember(const QNetworkReply &reply)
{
    if (!isSecure(reply.url()))
        return;
    const QSslConfiguration configuration = reply.sslConfiguration();
    const QByteArray ticket = configuration.sessionTicket();
    if (configuration.sessionProtocol() == QSsl::TlsV1_3 && !ticket.isEmpty())
        tickets().insert(keyOf(reply.url()), new QByteArray(ticket));
}

} // namespace TlsSessions
