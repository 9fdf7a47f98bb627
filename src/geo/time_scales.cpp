#include "basalt/geo/time_scales.h"

#include <array>
#include <atomic>
#include <cstdint>

#include "src/platform/ticks.h"

using namespace basalt::platform;

namespace {

constexpr std::uint32_t MJD_OF_GPS_EPOCH = 44244;
constexpr std::uint32_t DAYS_PER_WEEK = 7;
constexpr double SECONDS_PER_DAY = 86400.0;
constexpr double SECONDS_PER_WEEK = 604800.0;
constexpr std::uint32_t DATE_TO_MJD = 2432076;

/// Answer for a calendar record that is no time.
constexpr std::uint64_t NO_TIME = ~std::uint64_t{0};

/// Ticks of 1970-01-01 00:00; 0 until first asked for. Threads that fill it at once store the same number.
std::atomic<std::int64_t> epoch_cache = 0;

std::int64_t ticks_of_1970() {
    std::int64_t ticks = epoch_cache.load(std::memory_order_relaxed);
    if (ticks == 0) {
        const SYSTEMTIME epoch = {1970, 1, 0, 1, 0, 0, 0, 0};
        FILETIME time = {};
        SystemTimeToFileTime(&epoch, &time);
        ticks = tick_count(time);
        epoch_cache.store(ticks, std::memory_order_relaxed);
    }
    return ticks;
}

/// Days from March to the beginning of a month, with the offset of the count. `before` is how many years
/// before the given one the month's year began in March.
struct MonthStart {
    std::uint32_t days;
    std::int32_t before;
};

constexpr MonthStart month_start(int month) {
    const std::int32_t a = (month - 14) / 12;  // -1 for January and February
    return {static_cast<std::uint32_t>(367 * (month - 2 - 12 * a) / 12) - DATE_TO_MJD, -a};
}

/// Two divisions less for the months there are; at this level, since g++ builds a local table anew each call.
constexpr std::array<MonthStart, 13> MONTH_STARTS = [] {
    std::array<MonthStart, 13> starts = {};
    for (int m = 0; m <= 12; ++m) {
        starts[static_cast<std::size_t>(m)] = month_start(m);
    }
    return starts;
}();

constexpr std::uint32_t days_since_1858(std::uint16_t year, std::uint16_t month, std::uint16_t day) {
    const MonthStart start = month <= 12 ? MONTH_STARTS[month] : month_start(month);
    const auto y = static_cast<std::uint32_t>(year - start.before);
    return day + start.days - 3 * ((y + 4900) / 100) / 4 + 1461 * (y + 4800) / 4;
}

/// The last day whose year 16 bits hold.
constexpr std::uint32_t LAST_WHOLE_YEAR_DAY = days_since_1858(65535, 12, 31);
/// Days before MJD 0 from which Fliegel and Van Flandern count.
constexpr std::uint32_t FLIEGEL_OFFSET = 2468570;
/// The last day four times which, so counted, 31 bits hold.
constexpr std::uint32_t LAST_DAY = (std::uint32_t{1} << 29) - 1 - FLIEGEL_OFFSET;
/// The first day of that count, -4900-03-01; it and the days up to 1858 are numbers below 2^32.
constexpr std::uint32_t FIRST_COUNTED_DAY = 0U - FLIEGEL_OFFSET;

struct Date {
    std::uint16_t year, month, day;
};

/// Date of a day up to LAST_DAY, the year cut to 16 bits: quotients and remainders as the two halves of one
/// product, a fifth faster than by divisions. Years begin in March, so that the leap day is a year's last.
/// Source: C. Neri, L. Schneider, Software: Practice and Experience 53 (4), 2023.
Date date_of(std::uint32_t mjd) {
    constexpr std::uint32_t DAYS_FROM_MARCH_OF_YEAR_0 = 678881;
    constexpr std::uint32_t YEAR = 2939745;  // 2^32 / 1461, rounded up
    constexpr std::uint32_t MONTH = 2141;    // 2^16 / 30.6
    constexpr std::uint32_t MONTHS = 12U << 16;
    constexpr std::uint32_t DAYS_FROM_MARCH_TO_JANUARY = 306;
    const std::uint32_t quarters = 4 * (mjd + DAYS_FROM_MARCH_OF_YEAR_0) + 3;
    const std::uint32_t century = quarters / 146097;
    const std::uint64_t in_century = std::uint64_t{YEAR} * (quarters % 146097 | 3);
    const std::uint32_t day_of_year = static_cast<std::uint32_t>(in_century) / YEAR / 4;
    // All bits before the turn of the year, so that what differs there takes no branch.
    const std::uint32_t before_turn = day_of_year < DAYS_FROM_MARCH_TO_JANUARY ? ~std::uint32_t{0} : 0;
    const std::uint32_t of_months = MONTH * day_of_year + 197913 - MONTHS + (before_turn & MONTHS);
    return {static_cast<std::uint16_t>(100 * century + static_cast<std::uint32_t>(in_century >> 32) + 1 +
                                       before_turn),
            static_cast<std::uint16_t>(of_months >> 16),
            static_cast<std::uint16_t>((of_months & 0xFFFF) / MONTH + 1)};
}

/// Of a day up to 2^30: the remainder as the upper half of the quotient's fraction times seven.
std::uint16_t day_of_week(std::uint32_t mjd) {
    constexpr std::uint32_t WEDNESDAY = 3;     // MJD 0
    constexpr std::uint32_t WEEK = 613566757;  // 2^32 / 7, rounded up
    const std::uint32_t fraction = WEEK * (mjd + WEDNESDAY);
    return static_cast<std::uint16_t>(std::uint64_t{fraction} * DAYS_PER_WEEK >> 32);
}

/// By the year as 16 bits hold it, which may not be the day's own.
std::uint16_t day_of_week(const Date& date) {
    constexpr std::array<int, 12> DAYS_BEFORE_MONTH = {0, 31, 59, 90, 120, 151, 181, 212, 243, 273, 304, 334};
    const int year = date.year;
    const bool leap = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
    const int day_of_year = DAYS_BEFORE_MONTH[date.month - 1U] + date.day + (leap && date.month > 2 ? 1 : 0);
    const int century = (year - 1) / 100;
    const int y = (year - 1) % 100;
    const int first_of_january = (5 * (century % 4) + y + y / 4) % 7 + 1;
    return static_cast<std::uint16_t>((first_of_january + day_of_year - 1) % 7);
}

/// _mjd2greg() of other days than 0 to LAST_WHOLE_YEAR_DAY; apart, since saving registers for it cost days
/// within a third.
[[gnu::noinline]] void far_date(std::uint32_t mjd, std::uint16_t& year, std::uint16_t& month,
                                std::uint16_t& day, std::uint16_t& weekday) {
    constexpr std::uint32_t CYCLES = 13;  // of 400 years: past the year 0 from FIRST_COUNTED_DAY on
    constexpr std::uint32_t DAYS_PER_CYCLE = 146097;
    Date date = {0, 0, 0};
    if (mjd <= LAST_DAY) {
        date = date_of(mjd);
    } else if (mjd >= FIRST_COUNTED_DAY) {
        date = date_of(mjd + CYCLES * DAYS_PER_CYCLE);
        date.year = static_cast<std::uint16_t>(date.year - CYCLES * 400);
    }
    year = date.year;
    month = date.month;
    day = date.day;
    weekday = month != 0 ? day_of_week(date) : std::uint16_t{0};
}

}  // namespace

std::uint32_t _greg2mjd(std::uint16_t year, std::uint16_t month, std::uint16_t day) {
    return days_since_1858(year, month, day);
}

void _mjd2greg(std::uint32_t mjd, std::uint16_t& year, std::uint16_t& month, std::uint16_t& day,
               std::uint16_t& dayOfWeek) {
    if (mjd > LAST_WHOLE_YEAR_DAY) {
        far_date(mjd, year, month, day, dayOfWeek);
        return;
    }
    const Date date = date_of(mjd);
    year = date.year;
    month = date.month;
    day = date.day;
    dayOfWeek = day_of_week(mjd);
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
    const std::int64_t epoch = ticks_of_1970();
    FILETIME ticks = {};
    if (SystemTimeToFileTime(time, &ticks) == 0) {
        return NO_TIME;
    }
    return static_cast<std::uint64_t>(tick_count(ticks) - epoch) / TICKS_PER_MILLISECOND;
}

SYSTEMTIME* _javatime2systemtime(std::uint64_t milliseconds, SYSTEMTIME* time) {
    const std::uint64_t since_1601 =
        milliseconds * TICKS_PER_MILLISECOND + static_cast<std::uint64_t>(ticks_of_1970());
    const FILETIME ticks = file_time(static_cast<std::int64_t>(since_1601));
    if (FileTimeToSystemTime(&ticks, time) == 0) {
        *time = {};
    }
    return time;
}

std::uint64_t _currentjavatime() {
    SYSTEMTIME now = {};
    GetSystemTime(&now);
    return _systime2javatime(&now);
}
