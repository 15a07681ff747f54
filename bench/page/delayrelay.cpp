#include "page/delayrelay.h"

#include <QPointer>
#include <QTcpServer>
#include <QTcpSocket>
#include <QTimer>

DelayRelay::DelayRelay(quint16 target, std::chrono::milliseconds delay)
    : mTarget(target)
    , mDelay(delay)
{
    start();
    mReady.acquire();
}

DelayRelay::~DelayRelay()
{
    quit();
    wait();
}

void DelayRelay::run()
{
    QTcpServer server;
    server.listen(QHostAddress::LocalHost);
    connect(&server, &QTcpServer::newConnection, &server, [this, &server] {
        while (QTcpSocket *near = server.nextPendingConnection()) {
            auto *far = new QTcpSocket(near);
            far->connectToHost(QHostAddress::LocalHost, mTarget);
            join(near, far);
        }
    });
    mPort = server.serverPort();
    mReady.release();
    exec();
}

void DelayRelay::join(QTcpSocket *near, QTcpSocket *far) const
{
    for (QTcpSocket *socket : {near, far})
        socket->setSocketOption(QAbstractSocket::LowDelayOption, 1);
    forward(near, far);
    forward(far, near);
    connect(near, &QTcpSocket::disconnected, near, &QObject::deleteLater);
    connect(far, &QTcpSocket::disconnected, near,
            [this, near] { QTimer::singleShot(mDelay, near, [near] { near->close(); }); });
}

void DelayRelay::forward(QTcpSocket *from, QTcpSocket *to) const
{
    connect(from, &QTcpSocket::readyRead, to, [this, from, to] {
        QTimer::singleShot(mDelay, Qt::PreciseTimer, to,
                           [to, bytes = from->readAll()] { to->write(bytes); });
    });
}
