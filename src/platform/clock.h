// Clocks: the millisecond tick count.
#ifndef BASALT_SRC_PLATFORM_CLOCK_H
#define BASALT_SRC_PLATFORM_CLOCK_H

#include "basalt/platform/types.h"

// Milliseconds of the machine's monotonic clock, cut to 32 bits; the same for every process.
DWORD GetTickCount();

#endif
