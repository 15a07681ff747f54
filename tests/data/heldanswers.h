#pragma once

#include "support/misbehavingserver.h"

#include <QPointer>
#include <QTcpSocket>

// Requests that wait at the server until the test answers them.
class HeldAnswers
{
public:
    MisbehavingServer::Behaviour hold()
    {
        return [this](QTcpSocket *socket, const MisbehavingServer::Request &request) {
            mWaiting.append({socket, request});
        };
    }
    int count() const { return mWaiting.size(); }

    void answerFirst(const MisbehavingServer::Behaviour &behaviour)
    {
        const auto waiting = mWaiting.takeFirst();
        if (waiting.first)
            behaviour(waiting.first, waiting.second);
    }

private:
    QList<QPair<QPointer<QTcpSocket>, MisbehavingServer::Request>> mWaiting;
};
