#include "app/timerequest.h"

#include "base/log.h"
#include "platform/sntp.h"
#include "platform/systemclock.h"

#include <QDateTime>
#include <QHostInfo>
#include <QNetworkProxy>
#include <QUdpSocket>
#include <QUrl>

namespace {

constexpr int TIME_PORT = 123;

QByteArray lastDatagram(QUdpSocket *socket)
{
    QByteArray datagram;
    while (socket->hasPendingDatagrams()) {
        datagram.resize(int(socket->pendingDatagramSize()));
        const qint64 size = socket->readDatagram(datagram.data(), datagram.size());
        datagram.truncate(int(qMax<qint64>(size, 0)));
    }
    return datagram;
}

void setClock(qint64 seconds)
{
    logLine("Get date time from Network :",
            QDateTime::fromSecsSinceEpoch(seconds).toString(Qt::ISODate));
    const time_t time = seconds;
    logLine("stime r= :", stime(&time));
}

} // namespace

TimeRequest::TimeRequest(QObject *parent)
    : QObject(parent)
{
}

void TimeRequest::start(const QString &server)
{
    const QHostAddress plain(server);
    QUrl url;
    if (plain.isNull())
        url.setAuthority(server);
    const QString host = url.host();
    const QHostAddress numeric = plain.isNull() ? QHostAddress(host) : plain;
    mPort = quint16(url.port(TIME_PORT));
    if (!numeric.isNull())
        connectTo(numeric);
    else if (!host.isEmpty())
        QHostInfo::lookupHost(host, this, [this](const QHostInfo &info) { useLookup(info); });
}

void TimeRequest::useLookup(const QHostInfo &info)
{
    if (!info.addresses().isEmpty())
        connectTo(info.addresses().first());
}

void TimeRequest::connectTo(const QHostAddress &address)
{
    mSocket = new QUdpSocket(this);
    // The application's proxy is for web pages; it cannot carry datagrams.
    mSocket->setProxy(QNetworkProxy::NoProxy);
    connect(mSocket, &QUdpSocket::connected, this, &TimeRequest::connected);
    connect(mSocket, &QUdpSocket::readyRead, this, &TimeRequest::readyRead);
    mSocket->connectToHost(address.toString(), mPort, QIODevice::ReadWrite);
}

void TimeRequest::sendRequest()
{
    if (!mSocket)
        return;
    mSocket->flush();
    mSocket->write(sntpRequest(QDateTime::currentDateTime()));
    mSocket->flush();
}

void TimeRequest::readReply()
{
    if (!mSocket)
        return;
    if (const std::optional<qint64> seconds = sntpSeconds(lastDatagram(mSocket)))
        setClock(*seconds);
    mSocket->disconnectFromHost();
    mSocket->close();
}
