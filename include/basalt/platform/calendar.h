/// @file
/// Calendar time and its tick count.
#ifndef BASALT_PLATFORM_CALENDAR_H
#define BASALT_PLATFORM_CALENDAR_H

#include "basalt/export.h"
#include "basalt/platform/types.h"

/// Calendar time.
struct SYSTEMTIME {
    WORD wYear;          ///< year
    WORD wMonth;         ///< month, 1 to 12
    WORD wDayOfWeek;     ///< day of the week, 0 (Sunday) to 6
    WORD wDay;           ///< day of the month, 1 to 31
    WORD wHour;          ///< hour, 0 to 23
    WORD wMinute;        ///< minute, 0 to 59
    WORD wSecond;        ///< second, 0 to 59
    WORD wMilliseconds;  ///< millisecond, 0 to 999
};

#endif
