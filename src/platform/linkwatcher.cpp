#include "platform/linkwatcher.h"

#include <linux/netlink.h>
#include <linux/rtnetlink.h>
#include <poll.h>
#include <sys/socket.h>

#include <array>
#include <cerrno>
#include <utility>

LinkWatcher::LinkWatcher(Listener listener)
    : mListener(std::move(listener))
{
    if (!mStop.isValid() || !open() || !requestList())
        return;
    // The kernel has the list ready at once, so that every later change is told.
    readNotices();
    mThread = std::thread(&LinkWatcher::run, this);
}

LinkWatcher::~LinkWatcher()
{
    mStop.wake();
    if (mThread.joinable())
        mThread.join();
}

bool LinkWatcher::open()
{
    mSocket.reset(::socket(AF_NETLINK, SOCK_RAW | SOCK_CLOEXEC | SOCK_NONBLOCK, NETLINK_ROUTE));
    const int bufferSize = 512 * 1024;
    ::setsockopt(mSocket.get(), SOL_SOCKET, SO_RCVBUF, &bufferSize, sizeof bufferSize);
    sockaddr_nl address = {};
    address.nl_family = AF_NETLINK;
    address.nl_groups = RTMGRP_LINK;
    return ::bind(mSocket.get(), reinterpret_cast<sockaddr *>(&address), sizeof address) == 0;
}

bool LinkWatcher::requestList()
{
    struct
    {
        nlmsghdr header;
        ifinfomsg info;
    } request = {};
    request.header.nlmsg_len = sizeof request;
    request.header.nlmsg_type = RTM_GETLINK;
    request.header.nlmsg_flags = NLM_F_REQUEST | NLM_F_DUMP;
    request.header.nlmsg_seq = ++mSequence;
    request.info.ifi_family = AF_UNSPEC;
    mTable.beginList(mSequence);
    mStale = ::send(mSocket.get(), &request, sizeof request, 0) != ssize_t(sizeof request);
    return !mStale;
}

void LinkWatcher::run()
{
    pollfd sources[] = {{mStop.fd(), POLLIN, 0}, {mSocket.get(), POLLIN, 0}};
    for (;;) {
        reportChanges();
        const bool retryLater = mStale && !requestList();
        if (::poll(sources, 2, retryLater ? 1000 : -1) < 0 && errno != EINTR)
            return;
        if (sources[0].revents)
            return;
        readNotices();
    }
}

void LinkWatcher::readNotices()
{
    while (!mStale && readNotice()) {
    }
}

bool LinkWatcher::readNotice()
{
    alignas(nlmsghdr) std::array<char, 64 * 1024> buffer;
    sockaddr_nl sender = {};
    socklen_t senderSize = sizeof sender;
    const ssize_t size = ::recvfrom(mSocket.get(), buffer.data(), buffer.size(), MSG_TRUNC,
                                    reinterpret_cast<sockaddr *>(&sender), &senderSize);
    if (size < 0) {
        mStale = errno == ENOBUFS;
        return false;
    }
    const bool fromKernel = senderSize == sizeof sender && sender.nl_pid == 0;
    if (fromKernel)
        mStale =
            size_t(size) > buffer.size() ||
            mTable.read(buffer.data(), size_t(size), &mChanges) == LinkTable::Outcome::ListBroken;
    return true;
}

void LinkWatcher::reportChanges()
{
    for (const LinkChange &change : mChanges)
        mListener(change);
    mChanges.clear();
}
