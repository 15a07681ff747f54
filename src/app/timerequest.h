#pragma once

#include <QHostAddress>
#include <QObject>
#include <QPointer>
#include <QString>

class QHostInfo;
class QUdpSocket;

// Sets the system clock once from a network time server.
//
//   start(server) -> [look-up] -> connected() -> sendRequest() -> readyRead() -> readReply()
//
// The owner calls the next step on each signal. A server that cannot be found or does not answer
// leaves the clock as it is; nothing is retried and nothing waits.
class TimeRequest : public QObject
{
    Q_OBJECT

public:
    explicit TimeRequest(QObject *parent = nullptr);

    // "host", "host:port" or a numeric address; nothing happens for an empty text.
    void start(const QString &server);
    void sendRequest();
    // Takes the last datagram that has come, sets the clock by it and ends the exchange.
    void readReply();

signals:
    void connected();
    void readyRead();

private:
    void useLookup(const QHostInfo &info);
    void connectTo(const QHostAddress &address);

    quint16 mPort = 0;
    QPointer<QUdpSocket> mSocket;
};
