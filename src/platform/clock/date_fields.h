// The fields of a SYSTEMTIME, for tick counts and automation dates.
#ifndef BASALT_SRC_PLATFORM_CLOCK_DATE_FIELDS_H
#define BASALT_SRC_PLATFORM_CLOCK_DATE_FIELDS_H

#include <chrono>

#include "basalt/platform/calendar.h"

namespace basalt::platform {

inline std::chrono::year_month_day date_of(const SYSTEMTIME& time) {
    return std::chrono::year(time.wYear) / time.wMonth / time.wDay;
}

inline int second_of_day(const SYSTEMTIME& time) {
    return (time.wHour * 60 + time.wMinute) * 60 + time.wSecond;
}

// Whether date and time of day exist; milliseconds are not checked.
inline bool is_valid(const SYSTEMTIME& time, int first_year, int last_year) {
    // std::chrono keeps months and days in a byte, so larger values are rejected first.
    return time.wYear >= first_year && time.wYear <= last_year && time.wMonth <= 12 && time.wDay <= 31 &&
           date_of(time).ok() && time.wHour <= 23 && time.wMinute <= 59 && time.wSecond <= 59;
}

inline SYSTEMTIME system_time(std::chrono::sys_days day, int second, int millisecond) {
    const std::chrono::year_month_day date = day;
    return {.wYear = static_cast<WORD>(static_cast<int>(date.year())),
            .wMonth = static_cast<WORD>(static_cast<unsigned>(date.month())),
            .wDayOfWeek = static_cast<WORD>(std::chrono::weekday(day).c_encoding()),
            .wDay = static_cast<WORD>(static_cast<unsigned>(date.day())),
            .wHour = static_cast<WORD>(second / 3600),
            .wMinute = static_cast<WORD>(second / 60 % 60),
            .wSecond = static_cast<WORD>(second % 60),
            .wMilliseconds = static_cast<WORD>(millisecond)};
}

}  // namespace basalt::platform

#endif
