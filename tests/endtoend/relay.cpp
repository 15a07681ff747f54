#include "endtoend/relay.h"

#include <QSslSocket>

MisbehavingServer::Behaviour forwardTo(quint16 port)
{
    return [port](QTcpSocket *client, const MisbehavingServer::Request &request) {
        auto *service = new QSslSocket(client);
        service->setPeerVerifyMode(QSslSocket::VerifyNone);
        QObject::connect(service, &QSslSocket::readyRead, client,
                         [=] { client->write(service->readAll()); });
        QObject::connect(service, &QSslSocket::disconnected, client,
                         [=] { client->disconnectFromHost(); });
        service->connectToHostEncrypted("127.0.0.1", port);
        QByteArray head = request.method + ' ' + request.path + " HTTP/1.1\r\n";
        for (auto it = request.headers.cbegin(); it != request.headers.cend(); ++it) {
            if (it.key() != "connection")
                head += it.key() + ": " + it.value() + "\r\n";
        }
        service->write(head + "connection: close\r\n\r\n" + request.body);
    };
}
