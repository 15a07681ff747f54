#include "http/clientstream.h"

#include <arpa/inet.h>
#include <netinet/tcp.h>
#include <openssl/err.h>
#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

namespace {

constexpr std::size_t inputBytes = 16 * 1024;
constexpr std::size_t outputBytes = 64 * 1024;
constexpr std::chrono::seconds drainTime{5};
constexpr int drainSilence = 500; // milliseconds

void addressOf(const sockaddr_storage &address, std::string &ip, int &port)
{
    char text[INET6_ADDRSTRLEN] = "";
    if (address.ss_family == AF_INET) {
        const auto &v4 = reinterpret_cast<const sockaddr_in &>(address);
        inet_ntop(AF_INET, &v4.sin_addr, text, sizeof text);
        port = ntohs(v4.sin_port);
    } else if (address.ss_family == AF_INET6) {
        const auto &v6 = reinterpret_cast<const sockaddr_in6 &>(address);
        inet_ntop(AF_INET6, &v6.sin6_addr, text, sizeof text);
        port = ntohs(v6.sin6_port);
    }
    ip = text;
}

void findPeer(int socket, std::string &ip, int &port)
{
    sockaddr_storage address{};
    socklen_t length = sizeof address;
    if (getpeername(socket, reinterpret_cast<sockaddr *>(&address), &length) == 0)
        addressOf(address, ip, port);
}

} // namespace

ClientStream::ClientStream(int socket, SSL_CTX *context, int stopEvent, const Limits &limits)
    : mSocket(socket)
    , mStopEvent(stopEvent)
    , mLimits(limits)
    , mHandshakeDone(context == nullptr)
    , mInput(inputBytes, '\0')
{
    mInput.clear();
    const int on = 1;
    setsockopt(mSocket, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
    if (context) {
        mSsl = SSL_new(context);
        SSL_set_fd(mSsl, mSocket);
        SSL_set_accept_state(mSsl);
    }
    int port = 0;
    findPeer(mSocket, mAddress, port);
    beginRequest();
}

ClientStream::~ClientStream()
{
    if (mSsl && mHandshakeDone)
        SSL_shutdown(mSsl); // says goodbye and does not wait for the answer
    SSL_free(mSsl);
    ::shutdown(mSocket, SHUT_WR);
    if (mHasUnread)
        drain();
    ::close(mSocket);
}

bool ClientStream::handshake()
{
    while (!mHandshakeDone) {
        ERR_clear_error();
        const int result = SSL_accept(mSsl);
        if (result == 1)
            mHandshakeDone = true;
        else if (!waitForTls(result))
            return fail();
    }
    return true;
}

void ClientStream::beginRequest()
{
    mDeadline = Clock::now() + mLimits.head;
    mBytesLeft = mLimits.headBytes;
    mIsPaced = false;
    mIsAnswering = false;
}

void ClientStream::headArrived(std::size_t bodyBytes)
{
    mBytesLeft = bodyBytes;
    mDeadline = Clock::now() + mLimits.body;
    mIsPaced = true;
}

void ClientStream::closeAfterAnswer()
{
    mBytesLeft = 0;
    mBroken = true;
    mHasUnread = true;
}

bool ClientStream::hasInput() const
{
    return mInputStart < mInput.size() || (mSsl && SSL_has_pending(mSsl));
}

bool ClientStream::awaitsInput(std::chrono::milliseconds moment)
{
    if (hasInput())
        return true;
    pollfd descriptors[2] = {{mSocket, POLLIN, 0}, {mStopEvent, POLLIN, 0}};
    return ::poll(descriptors, 2, static_cast<int>(moment.count())) > 0 &&
           descriptors[1].revents == 0;
}

bool ClientStream::flush()
{
    if (!mIsAnswering) { // making the answer is not the client's time
        mDeadline = std::max(mDeadline, Clock::now() + mLimits.body);
        mIsAnswering = true;
    }
    return sendAll();
}

bool ClientStream::sendAll()
{
    std::size_t sent = 0;
    while (sent < mOutput.size()) {
        const ssize_t part = send(mOutput.data() + sent, mOutput.size() - sent);
        if (part <= 0)
            return fail();
        notePace(part);
        sent += part;
    }
    mOutput.clear();
    return true;
}

bool ClientStream::is_readable() const
{
    return !mBroken;
}

bool ClientStream::is_writable() const
{
    return !mBroken;
}

ssize_t ClientStream::read(char *bytes, size_t size)
{
    if (mBytesLeft == 0 || (mInputStart >= mInput.size() && (!sendAll() || !fill())))
        return -1;
    const std::size_t part = std::min(size, mInput.size() - mInputStart);
    if (part > mBytesLeft) {
        fail();
        return -1;
    }
    std::memcpy(bytes, mInput.data() + mInputStart, part);
    mInputStart += part;
    mBytesLeft -= part;
    return static_cast<ssize_t>(part);
}

ssize_t ClientStream::write(const char *bytes, size_t size)
{
    mOutput.append(bytes, size);
    if (mOutput.size() >= outputBytes && !flush())
        return -1;
    return static_cast<ssize_t>(size);
}

void ClientStream::get_remote_ip_and_port(std::string &ip, int &port) const
{
    findPeer(mSocket, ip, port);
}

void ClientStream::get_local_ip_and_port(std::string &ip, int &port) const
{
    sockaddr_storage address{};
    socklen_t length = sizeof address;
    if (getsockname(mSocket, reinterpret_cast<sockaddr *>(&address), &length) == 0)
        addressOf(address, ip, port);
}

// True when the socket is ready; false at the deadline, after a silence or when all has to stop.
bool ClientStream::wait(short events)
{
    using std::chrono::milliseconds;
    const auto left = std::chrono::duration_cast<milliseconds>(mDeadline - Clock::now());
    const milliseconds patience = std::min<milliseconds>(left, mLimits.silence);
    if (patience.count() <= 0)
        return false;
    pollfd descriptors[2] = {{mSocket, events, 0}, {mStopEvent, POLLIN, 0}};
    const int ready = ::poll(descriptors, 2, static_cast<int>(patience.count()));
    if (ready < 0)
        return errno == EINTR;
    return ready > 0 && descriptors[0].revents != 0;
}

// The reason is told right only when no error of another connection is left on this thread: each
// step clears them away before it begins.
bool ClientStream::waitForTls(int result)
{
    switch (SSL_get_error(mSsl, result)) {
    case SSL_ERROR_WANT_READ:
        return wait(POLLIN);
    case SSL_ERROR_WANT_WRITE:
        return wait(POLLOUT);
    default:
        return false;
    }
}

ssize_t ClientStream::receive(char *bytes, std::size_t size)
{
    for (;;) {
        if (mSsl) {
            ERR_clear_error();
            const int result = SSL_read(mSsl, bytes, static_cast<int>(size));
            if (result > 0 || !waitForTls(result))
                return result;
            continue;
        }
        const ssize_t result = ::recv(mSocket, bytes, size, MSG_DONTWAIT);
        if (result >= 0)
            return result;
        if (errno != EINTR && (errno != EAGAIN || !wait(POLLIN)))
            return -1;
    }
}

ssize_t ClientStream::send(const char *bytes, std::size_t size)
{
    for (;;) {
        if (mSsl) {
            ERR_clear_error();
            const int result = SSL_write(mSsl, bytes, static_cast<int>(size));
            if (result > 0 || !waitForTls(result))
                return result;
            continue;
        }
        const ssize_t result = ::send(mSocket, bytes, size, MSG_DONTWAIT | MSG_NOSIGNAL);
        if (result >= 0)
            return result;
        if (errno != EINTR && (errno != EAGAIN || !wait(POLLOUT)))
            return -1;
    }
}

bool ClientStream::fill()
{
    mInput.resize(inputBytes);
    mInputStart = 0;
    const ssize_t received = receive(mInput.data(), mInput.size());
    mInput.resize(received > 0 ? received : 0);
    notePace(received);
    return received > 0 || fail();
}

// A client may take its time as long as it keeps up some pace.
void ClientStream::notePace(ssize_t bytes)
{
    if (mIsPaced && bytes > 0)
        mDeadline += std::chrono::microseconds(bytes * 1'000'000 /
                                               static_cast<ssize_t>(mLimits.bytesPerSecond));
}

bool ClientStream::fail()
{
    mBroken = true;
    return false;
}

// Closing with bytes unread would reset the connection and take the answer with it, so what a
// client is still sending is read and dropped, for a while.
void ClientStream::drain()
{
    const Clock::time_point end = Clock::now() + drainTime;
    std::string bytes(outputBytes, '\0');
    pollfd descriptors[2] = {{mSocket, POLLIN, 0}, {mStopEvent, POLLIN, 0}};
    while (Clock::now() < end && ::poll(descriptors, 2, drainSilence) > 0 &&
           descriptors[1].revents == 0 &&
           ::recv(mSocket, bytes.data(), bytes.size(), MSG_DONTWAIT) > 0) {
    }
}
