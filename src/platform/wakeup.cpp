#include "platform/wakeup.h"

#include <sys/eventfd.h>

WakeUp::WakeUp()
    : mEvent(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))
{
}

void WakeUp::wake()
{
    // A counter that is full has woken the sleeper already.
    (void)::eventfd_write(mEvent.get(), 1);
}

void WakeUp::clear()
{
    eventfd_t calls = 0;
    (void)::eventfd_read(mEvent.get(), &calls);
}
