#include "fuzz.h"
#include "platform/localsocket.h"
#include "platform/sntp.h"

#include <sys/socket.h>

// A datagram of a time server, and a packet of whoever sits at the other end of the shell's socket.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    const QByteArray bytes(reinterpret_cast<const char *>(data), int(size));
    if (sntpSeconds(bytes).has_value() != (size >= 8))
        broken();

    int ends[2];
    if (::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_NONBLOCK, 0, ends) != 0)
        return 0;
    const FileDescriptor here(ends[0]), there(ends[1]);
    if (::send(there.get(), data, size, MSG_NOSIGNAL) != ssize_t(size) || size == 0)
        return 0;
    _NETWORK_MSG_T message;
    const bool isMessage =
        localsocket::receive(here.get(), &message) == localsocket::Received::Message;
    if (isMessage != (size == sizeof message))
        broken();
    return 0;
}
