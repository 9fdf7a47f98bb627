/// @file
/// The record of a calendar time, on its own so that geo.h brings in no other types of the platform.
#ifndef BASALT_SYSTEM_TIME_H
#define BASALT_SYSTEM_TIME_H

#include <cstdint>

/// A date and a time of day, UTC.
struct SYSTEMTIME {
    std::uint16_t wYear;  ///< 1601 to 30827, as an automation date 100 to 9999; 30828 may come out of a count
    std::uint16_t wMonth;         ///< 1 to 12
    std::uint16_t wDayOfWeek;     ///< 0 (Sunday) to 6; never read
    std::uint16_t wDay;           ///< 1 to 31
    std::uint16_t wHour;          ///< 0 to 23
    std::uint16_t wMinute;        ///< 0 to 59
    std::uint16_t wSecond;        ///< 0 to 59
    std::uint16_t wMilliseconds;  ///< 0 to 999
};

static_assert(sizeof(SYSTEMTIME) == 16, "platform records keep their sizes");

#endif
