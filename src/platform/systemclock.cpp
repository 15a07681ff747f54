#include "platform/systemclock.h"

#include <atomic>

namespace {

std::atomic<ClockSetter> clockSetter{nullptr};

} // namespace

int stime(const time_t *seconds)
{
    if (const ClockSetter setter = clockSetter)
        return setter(seconds);
    timespec time = {};
    time.tv_sec = *seconds;
    return ::clock_settime(CLOCK_REALTIME, &time);
}

void setClockSetter(ClockSetter setter)
{
    clockSetter = setter;
}
