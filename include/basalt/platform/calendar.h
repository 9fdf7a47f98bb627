/// @file
/// Calendar time, its count of ticks, and the clock. All times are UTC in the proleptic Gregorian calendar;
/// there are no leap seconds.
#ifndef BASALT_PLATFORM_CALENDAR_H
#define BASALT_PLATFORM_CALENDAR_H

#include "basalt/export.h"
#include "basalt/platform/types.h"
#include "basalt/system_time.h"

/// Ticks of 100 nanoseconds since the beginning of 1601, a 64-bit count in two halves.
struct FILETIME {
    DWORD dwLowDateTime;   ///< low 32 bits
    DWORD dwHighDateTime;  ///< high 32 bits
};

static_assert(sizeof(FILETIME) == 8, "platform records keep their sizes");

/// Ticks of a date and time of day.
/// @param time the time, not null; its day of the week is not read
/// @param[out] ticks the count, not null
/// @return nonzero; 0, with ticks unchanged and last error 87, for a year outside 1601 to 30827, a day that
/// does not exist or a time of day out of range
/// Threads: reentrant.
BASALT_API BOOL SystemTimeToFileTime(const SYSTEMTIME* time, FILETIME* ticks);

/// Date and time of day of a count of ticks; truncated to milliseconds.
/// @param ticks the count, not null
/// @param[out] time the time with its day of the week, not null
/// @return nonzero; 0, with time unchanged and last error 87, for a count of 2^63 or more
/// Threads: reentrant.
BASALT_API BOOL FileTimeToSystemTime(const FILETIME* ticks, SYSTEMTIME* time);

/// The time now, in UTC, by the machine's clock.
/// @param[out] time the time with its day of the week, not null
/// Never fails: a clock set before 1601 reads as the beginning of that year.
/// Threads: thread-safe.
BASALT_API void GetSystemTime(SYSTEMTIME* time);

#endif
