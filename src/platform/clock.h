// The machine's monotonic clock: the millisecond tick count and the performance counter.
#ifndef BASALT_SRC_PLATFORM_CLOCK_H
#define BASALT_SRC_PLATFORM_CLOCK_H

#include <cstdint>

#include "basalt/platform/types.h"

// Every call is thread-safe and never fails. All processes read the same clock.

// Milliseconds, in their low 32 bits: wraps around every 49.7 days.
DWORD GetTickCount();

struct LARGE_INTEGER {
    std::int64_t QuadPart;
};

// The counter's ticks per second: 1,000,000,000. Result: nonzero.
BOOL QueryPerformanceFrequency(LARGE_INTEGER* frequency);

// Ticks of a clock that is never set and stops while the machine sleeps; no thread reads an earlier value
// than another thread read before. Result: nonzero.
BOOL QueryPerformanceCounter(LARGE_INTEGER* count);

#endif
