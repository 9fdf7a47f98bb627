/// @file
/// FILETIME, the time stamp of files.
#ifndef BASALT_PLATFORM_FILE_TIME_H
#define BASALT_PLATFORM_FILE_TIME_H

#include "basalt/platform/types.h"

/// A point in time: 100-nanosecond units since 1601-01-01 UTC, in two halves of 32 bits.
struct FILETIME {
    DWORD dwLowDateTime;   ///< the low 32 bits
    DWORD dwHighDateTime;  ///< the high 32 bits
};

static_assert(sizeof(FILETIME) == 8, "a published record");

#endif
