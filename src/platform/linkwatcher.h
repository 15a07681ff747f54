#pragma once

#include "platform/filedescriptor.h"
#include "platform/linktable.h"
#include "platform/wakeup.h"

#include <functional>
#include <thread>

// Listens to the kernel's link notices on a thread of its own, from construction to destruction.
class LinkWatcher
{
public:
    using Listener = std::function<void(const LinkChange &)>; // called on that thread

    explicit LinkWatcher(Listener listener);
    ~LinkWatcher(); // waits for a call of the listener to return
    LinkWatcher(const LinkWatcher &) = delete;
    LinkWatcher &operator=(const LinkWatcher &) = delete;

    // False when the kernel's notices cannot be had.
    bool isRunning() const { return mThread.joinable(); }

private:
    bool open();
    bool requestList();
    void run();
    void readNotices();
    bool readNotice();
    void reportChanges();

    Listener mListener;
    WakeUp mStop;
    FileDescriptor mSocket;
    LinkTable mTable;
    std::vector<LinkChange> mChanges; // read, but not reported yet
    uint32_t mSequence = 0;
    bool mStale = false; // notices were lost: the list must be read anew
    std::thread mThread;
};
