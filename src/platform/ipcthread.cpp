#include "platform/ipcthread.h"

#include "platform/ipc.h"
#include "platform/shelllink.h"

#include <poll.h>

using localsocket::Received;

namespace netcommon {

namespace {

constexpr int RESPONSE_LEAVING = 2;

IpcThread *instance = nullptr;

} // namespace

IpcThread *IpcThread::getInstance()
{
    if (!instance && ShellLink::shared()->wakeUp().isValid())
        instance = new IpcThread;
    return instance;
}

IpcThread::IpcThread()
    : mLink(ShellLink::shared())
{
}

IpcThread::~IpcThread()
{
    stop();
    wait();
    instance = nullptr;
}

bool IpcThread::isReady() const
{
    return mLink->wakeUp().isValid();
}

void IpcThread::stop()
{
    mStopped = true;
    mLink->wakeUp().wake();
}

void IpcThread::responseParent(int code)
{
    _NETWORK_MSG_T message = {};
    message.type = MSG_RESPONSE;
    message.params[0] = code;
    mLink->send(message);
    if (code == RESPONSE_LEAVING)
        stop();
}

void IpcThread::updatePlaybackinfo(int statusupdate, int status, int param3, int param4)
{
    mLink->send({MSG_PLAYBACK_INFO, {statusupdate, status, param3, param4}});
}

void IpcThread::run()
{
    while (!mStopped) {
        mLink->connect();
        waitForEvent();
        handlePackets();
        if (mLink->takeExitFallback())
            emit signalExit(true, false);
    }
}

void IpcThread::waitForEvent()
{
    // Without a connection the descriptor is -1, which poll() passes over.
    pollfd sources[] = {{mLink->wakeUp().fd(), POLLIN, 0}, {mLink->fd(), POLLIN, 0}};
    if (::poll(sources, 2, mLink->nextTimeout()) > 0 && sources[0].revents)
        mLink->wakeUp().clear();
}

void IpcThread::handlePackets()
{
    _NETWORK_MSG_T message = {};
    while (!mStopped) {
        switch (mLink->receive(&message)) {
        case Received::Message:
            handleMessage(message);
            break;
        case Received::Ignored:
            break;
        case Received::Nothing:
        case Received::Closed:
            return;
        }
    }
}

void IpcThread::handleMessage(const _NETWORK_MSG_T &message)
{
    if (message.type == MSG_EXIT) {
        mLink->exitAnswered();
        emit signalExit(message.params[0] != 0, message.params[1] != 0);
    } else if (message.type == MSG_TIME_ZONE) {
        emit signalSetTimezone(message.params[0]);
    }
}

} // namespace netcommon
