#include "platform/localsocket.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/un.h>

#include <cerrno>
#include <cstring>

namespace localsocket {

namespace {

// The address of a path. A path that does not fit is reached through its folder's descriptor,
// which stays open as long as the address is in use.
struct Address
{
    explicit Address(const std::string &path)
    {
        name.sun_family = AF_UNIX;
        valid = set(path) || setThroughFolder(path);
    }

    bool set(const std::string &path)
    {
        if (path.empty() || path.size() >= sizeof name.sun_path)
            return false;
        std::memcpy(name.sun_path, path.c_str(), path.size() + 1);
        return true;
    }

    bool setThroughFolder(const std::string &path)
    {
        const size_t slash = path.rfind('/');
        if (slash == std::string::npos)
            return false;
        folder.reset(::open(path.substr(0, slash).c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC));
        return folder.isOpen() &&
               set("/proc/self/fd/" + std::to_string(folder.get()) + path.substr(slash));
    }

    const sockaddr *get() const { return reinterpret_cast<const sockaddr *>(&name); }

    sockaddr_un name = {};
    FileDescriptor folder;
    bool valid = false;
};

FileDescriptor createSocket()
{
    return FileDescriptor(::socket(AF_UNIX, SOCK_SEQPACKET | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
}

// An empty packet and the end of the connection read alike; only at the end has the peer hung up
// with nothing left to read.
bool hasEnded(int fd)
{
    pollfd state = {fd, POLLIN | POLLRDHUP, 0};
    int unread = 0;
    return ::poll(&state, 1, 0) > 0 && (state.revents & (POLLRDHUP | POLLHUP | POLLERR)) &&
           (::ioctl(fd, FIONREAD, &unread) < 0 || unread == 0);
}

} // namespace

FileDescriptor connectTo(const std::string &path)
{
    errno = 0;
    const Address address(path);
    FileDescriptor fd = createSocket();
    if (!address.valid || !fd.isOpen() ||
        ::connect(fd.get(), address.get(), sizeof address.name) < 0)
        return FileDescriptor();
    return fd;
}

FileDescriptor listenAt(const std::string &path)
{
    if (connectTo(path).isOpen()) {
        errno = EADDRINUSE;
        return FileDescriptor();
    }
    if (errno == ECONNREFUSED)
        ::unlink(path.c_str());
    const Address address(path);
    FileDescriptor fd = createSocket();
    if (!address.valid)
        errno = ENOENT;
    if (!address.valid || !fd.isOpen() ||
        ::bind(fd.get(), address.get(), sizeof address.name) < 0 || ::listen(fd.get(), 8) < 0)
        return FileDescriptor();
    return fd;
}

bool send(int fd, const _NETWORK_MSG_T &message)
{
    return ::send(fd, &message, sizeof message, MSG_DONTWAIT | MSG_NOSIGNAL) ==
           ssize_t(sizeof message);
}

Received receive(int fd, _NETWORK_MSG_T *message)
{
    // MSG_TRUNC: the answer is the packet's own size, however much of it fits.
    const ssize_t size = ::recv(fd, message, sizeof *message, MSG_DONTWAIT | MSG_TRUNC);
    if (size == ssize_t(sizeof *message))
        return Received::Message;
    if (size > 0)
        return Received::Ignored;
    if (size == 0)
        return hasEnded(fd) ? Received::Closed : Received::Ignored;
    // A peer that ended without reading everything resets the connection; what it sent before is
    // still there to be read.
    if (errno == ECONNRESET)
        return Received::Ignored;
    return errno == EAGAIN || errno == EINTR ? Received::Nothing : Received::Closed;
}

} // namespace localsocket
