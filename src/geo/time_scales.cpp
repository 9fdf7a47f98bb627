#include "basalt/geo/time_scales.h"

#include <array>
#include <cstdint>

#include "basalt/platform/calendar.h"
#include "src/platform/ticks.h"

using namespace basalt::platform;

namespace {

constexpr std::uint32_t MJD_OF_GPS_EPOCH = 44244;
constexpr std::uint32_t DAYS_PER_WEEK = 7;
constexpr double SECONDS_PER_DAY = 86400.0;
constexpr double SECONDS_PER_WEEK = 604800.0;
constexpr std::uint32_t DATE_TO_MJD = 2432076;
constexpr std::uint32_t MJD_TO_DATE = 2468570;
/// Most days since -4900-03-01 whose fourfold fits in 31 bits.
constexpr std::uint32_t LAST_COUNTED_DAY = (std::uint32_t{1} << 29) - 1;

constexpr std::uint64_t NO_TIME = ~std::uint64_t{0};
constexpr std::int64_t TICKS_OF_1970 = SECONDS_BEFORE_1970 * TICKS_PER_SECOND;

/// Day of the week, 0 for Sunday, by the year as 16 bits hold it: another year than the day's own before the
/// year 1 and after 65535.
int day_of_week_by_date(int year, int month, int day) {
    constexpr std::array<int, 12> DAYS_BEFORE_MONTH = {0, 31, 59, 90, 120, 151, 181, 212, 243, 273, 304, 334};
    const bool is_leap = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
    const int day_of_year =
        DAYS_BEFORE_MONTH[static_cast<std::size_t>(month - 1)] + day + (is_leap && month > 2 ? 1 : 0);
    const int century = (year - 1) / 100;
    const int y = (year - 1) % 100;
    const int first_of_january = (5 * (century % 4) + y + y / 4) % 7 + 1;
    return (first_of_january + day_of_year - 1) % 7;
}

}  // namespace

std::uint32_t _greg2mjd(std::uint16_t year, std::uint16_t month, std::uint16_t day) {
    const int a = (month - 14) / 12;  // -1 for January and February
    const auto y = static_cast<std::uint32_t>(year + a);
    const auto m = static_cast<std::uint32_t>(month - 2 - 12 * a);  // 1 for March
    return day + 367 * m / 12 - DATE_TO_MJD - 3 * ((y + 4900) / 100) / 4 + 1461 * (y + 4800) / 4;
}

void _mjd2greg(std::uint32_t mjd, std::uint16_t& year, std::uint16_t& month, std::uint16_t& day,
               std::uint16_t& dayOfWeek) {
    const std::uint32_t counted = mjd + MJD_TO_DATE;
    if (counted > LAST_COUNTED_DAY) {
        year = month = day = dayOfWeek = 0;
        return;
    }
    // Years begin in March. A century has 146097 quarters of a day, a year 1461, five months 153 days.
    const std::uint32_t century = 4 * counted / 146097;
    const std::uint32_t quarter = 4 * counted % 146097 | 3;  // the last one of the day
    const std::uint32_t fifth = 5 * (quarter % 1461 / 4) + 2;
    const std::uint32_t m = fifth / 153;  // 0 for March
    const std::uint32_t next = m >= 10;   // January and February
    const int whole_year = static_cast<int>(100 * century + quarter / 1461 + next) - 4900;
    year = static_cast<std::uint16_t>(whole_year);
    month = static_cast<std::uint16_t>(m + 3 - 12 * next);
    day = static_cast<std::uint16_t>(fifth % 153 / 5 + 1);
    constexpr std::uint32_t WEEKDAY_OF_FIRST = 4;  // Thursday, the day that is counted as 0
    dayOfWeek =
        static_cast<std::uint16_t>(whole_year >= 1 && whole_year <= 65535
                                       ? (counted + WEEKDAY_OF_FIRST) % DAYS_PER_WEEK
                                       : static_cast<std::uint32_t>(day_of_week_by_date(year, month, day)));
}

void _mjd2gps(std::uint32_t mjd, double secondsOfDay, std::uint16_t& week, double& secondsOfWeek) {
    const std::uint32_t days = mjd - MJD_OF_GPS_EPOCH;
    week = static_cast<std::uint16_t>(days % 65536 / DAYS_PER_WEEK);
    secondsOfWeek = days % DAYS_PER_WEEK * SECONDS_PER_DAY + secondsOfDay;
}

double _gps2mjd(std::uint16_t week, double secondsOfWeek) {
    return (week * SECONDS_PER_WEEK + secondsOfWeek) / SECONDS_PER_DAY + MJD_OF_GPS_EPOCH;
}

std::uint64_t _systime2javatime(SYSTEMTIME* time) {
    FILETIME ticks = {};
    if (SystemTimeToFileTime(time, &ticks) == 0) {
        return NO_TIME;
    }
    return static_cast<std::uint64_t>(tick_count(ticks) - TICKS_OF_1970) / TICKS_PER_MILLISECOND;
}

SYSTEMTIME* _javatime2systemtime(std::uint64_t milliseconds, SYSTEMTIME* time) {
    const std::uint64_t ticks =
        milliseconds * TICKS_PER_MILLISECOND + static_cast<std::uint64_t>(TICKS_OF_1970);
    const FILETIME since_1601 = file_time(static_cast<std::int64_t>(ticks));
    if (FileTimeToSystemTime(&since_1601, time) == 0) {
        *time = {};
    }
    return time;
}

std::uint64_t _currentjavatime() {
    SYSTEMTIME now = {};
    GetSystemTime(&now);
    return _systime2javatime(&now);
}
