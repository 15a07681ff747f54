#pragma once

#include <cstdint>
#include <memory>
#include <string>

// One message between the program and the device's menu shell: 68 bytes on the wire, native byte
// order, unused bytes zero.
struct _NETWORK_MSG_T
{
    int32_t type;
    int32_t params[16];
};
static_assert(sizeof(_NETWORK_MSG_T) == 68, "the platform's messages are 68 bytes");

class ShellLink;

namespace netcommon {

enum MessageType : int32_t {
    // shell to program
    MSG_EXIT = 1,      // params: isFromParent, isSystemError
    MSG_TIME_ZONE = 2, // params: offset from UTC in hours
    // program to shell
    MSG_REQUEST_EXIT = 3,  // the exit key: answered with MSG_EXIT; params: isSystemError
    MSG_EXIT_REQUEST = 4,  // the program has gone; the last message of a run
    MSG_RESPONSE = 5,      // answer to MSG_EXIT; params: response code
    MSG_PLAYBACK_INFO = 6, // params: the four values of updatePlaybackinfo
};

// Sends messages to the menu shell. Sending never blocks and never fails loudly: without a shell at
// the other end a message is dropped.
class Ipc
{
public:
    // The one client of the process, made at the first call after a deletion; never null. The
    // caller that ends the program deletes it.
    static Ipc *getInstance();
    ~Ipc();
    Ipc(const Ipc &) = delete;
    Ipc &operator=(const Ipc &) = delete;

    // Sends one message; false when there is no shell to take it.
    bool sendIpcMsg(const _NETWORK_MSG_T &message);

    // Asks the platform to end the program. The answer comes as IpcThread::signalExit: from the
    // shell, or, when no shell answers within a second, from the platform library itself, so that
    // the remote's exit key always works.
    void requestExit(bool isSystemError);

    // Where the shell listens; for tests, before the first message.
    static void setSocketPath(const std::string &path);

private:
    Ipc();

    std::shared_ptr<ShellLink> mLink;
};

} // namespace netcommon
