#pragma once

#include "platform/localsocket.h"
#include "platform/wakeup.h"

#include <atomic>
#include <chrono>
#include <memory>
#include <mutex>
#include <optional>
#include <string>

// The process's one connection to the menu shell. Ipc and IpcThread share it, so that messages
// leave in the order in which they were sent, and so that the last one can be sent when the thread
// has gone. May be used from any thread; nothing blocks.
//
//   GUI thread                     ShellLink                IpcThread
//   Ipc::sendIpcMsg() -----------> send() -> socket
//   Ipc::requestExit() ----------> requestExit() --wake-->  nextTimeout(), takeExitFallback()
//                                  socket -> receive() <--- poll(fd(), wakeUp().fd())
class ShellLink
{
public:
    using Clock = std::chrono::steady_clock;

    // Made at the first call, gone with its last user.
    static std::shared_ptr<ShellLink> shared();
    // Where the shell listens; for tests, before the first use.
    static void setSocketPath(const std::string &path);

    // Sends one message, connecting first when there is no connection; false when no shell takes
    // it: then it is lost.
    bool send(const _NETWORK_MSG_T &message);
    // Asks the shell for the program's end and notes until when it may answer.
    void requestExit(bool isSystemError);

    // The rest serves the thread that waits.
    bool connect(); // true when there is a connection now
    int fd() const; // -1 without a connection
    // The next packet; Closed also drops the connection.
    localsocket::Received receive(_NETWORK_MSG_T *message);
    // The shell has answered, or the request has run out: true once for each request that the
    // library must answer itself.
    void exitAnswered();
    bool takeExitFallback();
    // Milliseconds until there is something to do without a wake-up; -1: never.
    int nextTimeout() const;
    WakeUp &wakeUp() { return mWakeUp; }

private:
    bool connectLocked();

    mutable std::mutex mMutex;
    FileDescriptor mSocket;
    std::optional<Clock::time_point> mExitDeadline;
    WakeUp mWakeUp;
};
