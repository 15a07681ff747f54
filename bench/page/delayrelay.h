#pragma once

#include <QSemaphore>
#include <QThread>

#include <chrono>

class QTcpSocket;

// Hands bytes on between its own loopback port and another one, each direction late by the same
// time: a line with a long way. On a thread of its own.
class DelayRelay : public QThread
{
public:
    DelayRelay(quint16 target, std::chrono::milliseconds delay);
    ~DelayRelay() override;

    quint16 port() const { return mPort; }

protected:
    void run() override;

private:
    void join(QTcpSocket *near, QTcpSocket *far) const;
    void forward(QTcpSocket *from, QTcpSocket *to) const;

    const quint16 mTarget;
    const std::chrono::milliseconds mDelay;
    quint16 mPort = 0;
    QSemaphore mReady;
};
