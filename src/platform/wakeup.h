#pragma once

#include "platform/filedescriptor.h"

// Wakes a thread that sits in poll(): the sleeper polls fd() for POLLIN, anybody else calls wake().
class WakeUp
{
public:
    WakeUp();

    bool isValid() const { return mEvent.isOpen(); }
    int fd() const { return mEvent.get(); }
    void wake();  // from any thread
    void clear(); // by the sleeper: forgets all calls of wake() so far

private:
    FileDescriptor mEvent;
};
