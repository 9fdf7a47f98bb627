/// @file
/// Time scales: calendar dates, Modified Julian Date (MJD), GPS time, milliseconds since 1970.
///
/// MJD counts whole days from 1858-11-17. GPS time counts weeks from 1980-01-06, MJD 44244, without rollover,
/// and seconds within them; leap seconds are ignored. Dates are proleptic Gregorian.
///
/// Threads: every function is thread-safe. None throws or allocates.
#ifndef BASALT_GEO_TIME_SCALES_H
#define BASALT_GEO_TIME_SCALES_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/system_time.h"

/// MJD of a date.
/// @param year days before 1858-11-17 count backwards from 2^32
/// @param month 1 to 12
/// @param day 1 to 31
/// @return whole days since 1858-11-17
///
/// Bad input: a day past the month's end runs on into the next month; months outside 1 to 12 give a
/// meaningless number.
///
/// Source: H. Fliegel, T. Van Flandern, Communications of the ACM 11 (10), 1968.
BASALT_API std::uint32_t _greg2mjd(std::uint16_t year, std::uint16_t month, std::uint16_t day);

/// Date and day of the week of an MJD.
/// @param mjd whole days since 1858-11-17; 2^32 - n for n days before it, as _greg2mjd() gives them
/// @param[out] year the year
/// @param[out] month 1 to 12
/// @param[out] day 1 to 31
/// @param[out] dayOfWeek 0 (Sunday) to 6
///
/// Bad input: before the year 1 and from the year 65536 (MJD 23257591) on, the year is truncated to 16 bits
/// and the day of the week is that of the truncated year. All four are 0 from 534402342 up to 2^32 -
/// 2468571, the day before -4900-03-01.
///
/// Source: as _greg2mjd().
BASALT_API void _mjd2greg(std::uint32_t mjd, std::uint16_t& year, std::uint16_t& month, std::uint16_t& day,
                          std::uint16_t& dayOfWeek);

/// GPS time of an MJD and a time of day.
/// @param mjd whole days, 44244 or more
/// @param secondsOfDay added as it is: any number
/// @param[out] week GPS week, formed from the low 16 bits of the days since 1980-01-06: restarts at 0 on
/// 2159-06-12, after week 9362
/// @param[out] secondsOfWeek seconds since the week's beginning
///
/// Bad input: days before 1980-01-06 count backwards from 2^32.
BASALT_API void _mjd2gps(std::uint32_t mjd, double secondsOfDay, std::uint16_t& week, double& secondsOfWeek);

/// MJD with a day fraction of a GPS time.
/// @param week GPS week
/// @param secondsOfWeek any number of seconds since its beginning
///
/// Accuracy: 1.1 microseconds up to week 4000, 7 at the last week.
BASALT_API double _gps2mjd(std::uint16_t week, double secondsOfWeek);

/// Milliseconds since 1970-01-01 00:00 of a calendar time.
/// @param time UTC, not null; its day of the week is not read
/// @return milliseconds. Times before 1970 wrap: 2^64 ticks less their distance, in milliseconds (about
/// 1.8e15).
///
/// Bad input: 2^64 - 1 for a record that is not a valid time from 1601 to 30827.
BASALT_API std::uint64_t _systime2javatime(SYSTEMTIME* time);

/// Calendar time of milliseconds since 1970-01-01 00:00.
/// @param milliseconds the count, converted to ticks modulo 2^64: a wrapped count of _systime2javatime()
/// returns the time before 1970, up to a millisecond early; 2^64 - 1 returns the last millisecond of 1969
/// @param[out] time UTC with its day of the week, not null
/// @return time
///
/// Bad input: a record of zeros for a count after the platform's last time (30828-09-14).
BASALT_API SYSTEMTIME* _javatime2systemtime(std::uint64_t milliseconds, SYSTEMTIME* time);

/// Milliseconds since 1970-01-01 00:00 UTC, now, by the system clock.
BASALT_API std::uint64_t _currentjavatime();

#endif
