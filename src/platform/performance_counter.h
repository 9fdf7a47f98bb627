// The performance counter: a fine monotonic tick count.
#ifndef BASALT_SRC_PLATFORM_PERFORMANCE_COUNTER_H
#define BASALT_SRC_PLATFORM_PERFORMANCE_COUNTER_H

#include <cstdint>

#include "basalt/platform/types.h"

// The published record, of which only the whole is used.
struct LARGE_INTEGER {
    std::int64_t QuadPart;
};

// Ticks a second: 1,000,000,000, constant. Never fails (the answer is not 0).
// Threads: thread-safe.
BOOL QueryPerformanceFrequency(LARGE_INTEGER* frequency);

// Ticks of the machine's monotonic clock, which is set by nobody and stands still while the machine sleeps.
// Never fails (the answer is not 0).
// Threads: thread-safe; what one thread reads is never before what another read earlier.
BOOL QueryPerformanceCounter(LARGE_INTEGER* count);

#endif
