#include "platform/shelllink.h"

#include "paths.h"

#include <algorithm>
#include <cerrno>

using localsocket::Received;

namespace {

constexpr auto RECONNECT_INTERVAL = std::chrono::milliseconds(1000);
constexpr auto EXIT_ANSWER_TIME = std::chrono::milliseconds(1000);

std::string &socketPath()
{
    static std::string path = ORVALA_PLATFORM_SOCKET;
    return path;
}

} // namespace

std::shared_ptr<ShellLink> ShellLink::shared()
{
    static std::weak_ptr<ShellLink> current;
    std::shared_ptr<ShellLink> link = current.lock();
    if (!link) {
        link = std::make_shared<ShellLink>();
        current = link;
    }
    return link;
}

void ShellLink::setSocketPath(const std::string &path)
{
    socketPath() = path;
}

bool ShellLink::send(const _NETWORK_MSG_T &message)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    if (mSocket.isOpen()) {
        if (localsocket::send(mSocket.get(), message))
            return true;
        // A shell that is merely too busy to read loses this message, not its connection.
        if (errno == EAGAIN)
            return false;
    }
    const bool connected = connectLocked();
    mWakeUp.wake(); // the thread may be waiting for the old socket
    return connected && localsocket::send(mSocket.get(), message);
}

void ShellLink::requestExit(bool isSystemError)
{
    _NETWORK_MSG_T message = {};
    message.type = netcommon::MSG_REQUEST_EXIT;
    message.params[0] = isSystemError;
    const bool sent = send(message);
    const std::lock_guard<std::mutex> lock(mMutex);
    const Clock::time_point deadline = Clock::now() + (sent ? EXIT_ANSWER_TIME : Clock::duration());
    mExitDeadline = mExitDeadline ? std::min(*mExitDeadline, deadline) : deadline;
    mWakeUp.wake();
}

bool ShellLink::connect()
{
    const std::lock_guard<std::mutex> lock(mMutex);
    return mSocket.isOpen() || connectLocked();
}

bool ShellLink::connectLocked()
{
    mSocket = localsocket::connectTo(socketPath());
    return mSocket.isOpen();
}

int ShellLink::fd() const
{
    const std::lock_guard<std::mutex> lock(mMutex);
    return mSocket.get();
}

Received ShellLink::receive(_NETWORK_MSG_T *message)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    if (!mSocket.isOpen())
        return Received::Nothing;
    const Received received = localsocket::receive(mSocket.get(), message);
    if (received == Received::Closed)
        mSocket.reset();
    return received;
}

void ShellLink::exitAnswered()
{
    const std::lock_guard<std::mutex> lock(mMutex);
    mExitDeadline.reset();
}

bool ShellLink::takeExitFallback()
{
    const std::lock_guard<std::mutex> lock(mMutex);
    const bool due = mExitDeadline && *mExitDeadline <= Clock::now();
    if (due)
        mExitDeadline.reset();
    return due;
}

int ShellLink::nextTimeout() const
{
    using std::chrono::milliseconds;
    const std::lock_guard<std::mutex> lock(mMutex);
    const int reconnect = mSocket.isOpen() ? -1 : int(RECONNECT_INTERVAL.count());
    if (!mExitDeadline)
        return reconnect;
    const auto left = std::chrono::ceil<milliseconds>(*mExitDeadline - Clock::now()).count();
    const int answer = int(std::max<decltype(left)>(left, 0));
    return reconnect < 0 ? answer : std::min(answer, reconnect);
}
