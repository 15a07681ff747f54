#pragma once

#include "platform/localsocket.h"

#include <QByteArray>
#include <QString>

#include <optional>

#include <poll.h>
#include <sys/socket.h>

// A menu shell that does only what the test tells it to. Waits are bounded and end early.
class FakeShell
{
public:
    explicit FakeShell(const QString &path)
        : mListener(localsocket::listenAt(path.toStdString()))
    {
    }

    // True when a program has connected.
    bool accept()
    {
        if (!becomesReadable(mListener.get()))
            return false;
        mProgram.reset(::accept4(mListener.get(), nullptr, nullptr, SOCK_CLOEXEC));
        return mProgram.isOpen();
    }

    bool send(int32_t type, int32_t first = 0, int32_t second = 0)
    {
        const _NETWORK_MSG_T message = {type, {first, second}};
        return sendBytes(QByteArray(reinterpret_cast<const char *>(&message), sizeof message));
    }

    // Waits until the program has room for one more packet.
    bool sendBytes(const QByteArray &bytes)
    {
        return ::send(mProgram.get(), bytes.constData(), size_t(bytes.size()), MSG_NOSIGNAL) ==
               bytes.size();
    }

    // The next message, or nothing at the end of the connection or of the patience.
    std::optional<_NETWORK_MSG_T> next()
    {
        _NETWORK_MSG_T message = {};
        if (!becomesReadable(mProgram.get()) ||
            localsocket::receive(mProgram.get(), &message) != localsocket::Received::Message)
            return std::nullopt;
        return message;
    }

    bool programHasGone()
    {
        _NETWORK_MSG_T message = {};
        return becomesReadable(mProgram.get()) &&
               localsocket::receive(mProgram.get(), &message) == localsocket::Received::Closed;
    }

    void hangUp() { mProgram.reset(); }

private:
    static bool becomesReadable(int fd)
    {
        pollfd source = {fd, POLLIN, 0};
        return ::poll(&source, 1, 5000) > 0;
    }

    FileDescriptor mListener;
    FileDescriptor mProgram;
};
