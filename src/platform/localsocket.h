#pragma once

#include "platform/filedescriptor.h"
#include "platform/ipc.h"

#include <string>

// The Unix packet sockets between the program and the menu shell. Nothing here blocks, and a path
// may be longer than a socket address has room for.
namespace localsocket {

// A socket connected to whoever listens at the path; not open when nobody does.
FileDescriptor connectTo(const std::string &path);
// A socket that listens at the path, in place of one whose owner has gone; not open, with errno
// set, when that is impossible (EADDRINUSE: somebody listens there).
FileDescriptor listenAt(const std::string &path);

// Sends one message whole; false when the peer cannot take it now or has gone.
bool send(int fd, const _NETWORK_MSG_T &message);

enum class Received { Message, Ignored, Nothing, Closed };
// Takes the next packet from the socket. Only a packet of exactly one message's size is a message;
// every other one is Ignored. Closed: the peer has gone and all that it sent has been read.
Received receive(int fd, _NETWORK_MSG_T *message);

} // namespace localsocket
