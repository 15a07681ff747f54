#pragma once

#include <ctime>

// Sets the system clock to whole seconds since 1970-01-01 UTC; 0, or -1 with errno set (usually no
// privilege). stime() itself is gone from today's C library.
int stime(const time_t *seconds);

// Replaces what stime() does, so that no test ever sets a machine's clock; null restores it.
using ClockSetter = int (*)(const time_t *seconds);
void setClockSetter(ClockSetter setter);
