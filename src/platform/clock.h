// Clocks: the millisecond tick count.
#ifndef BASALT_SRC_PLATFORM_CLOCK_H
#define BASALT_SRC_PLATFORM_CLOCK_H

#include "basalt/platform/types.h"

// Milliseconds of the machine's monotonic clock in their low 32 bits, so the count starts over every 49.7
// days. All processes read the same clock. Never fails.
// Threads: thread-safe.
DWORD GetTickCount();

#endif
