#include <gtest/gtest.h>

#include <array>
#include <chrono>
#include <cstdint>
#include <cstring>
#include <utility>

#include "basalt/geo.h"
#include "tests/geo/calls.h"

namespace {

using geo_calls::results;
using std::chrono::sys_days;

constexpr sys_days MJD_0 = std::chrono::year(1858) / std::chrono::November / 17;
constexpr std::uint32_t DAYS_OF_400_YEARS = 146097;

using Day = std::array<int, 4>;  // year, month, day, day of the week

Day date_of(std::uint32_t mjd) {
    std::uint16_t year = 0, month = 0, day = 0, day_of_week = 0;
    _mjd2greg(mjd, year, month, day, day_of_week);
    return {year, month, day, day_of_week};
}

/// By the calendar, which repeats after 400 years. The day of the week is that of the truncated year, and its
/// rule takes the year 0 to begin a day late.
Day expected_date(std::int64_t mjd) {
    const auto cycles = static_cast<int>((mjd + 20LL * DAYS_OF_400_YEARS) / DAYS_OF_400_YEARS - 20);
    const std::int64_t days = mjd - std::int64_t{cycles} * DAYS_OF_400_YEARS;
    const std::chrono::year_month_day date = MJD_0 + std::chrono::days(days);
    const int year = (static_cast<int>(date.year()) + cycles * 400) & 0xFFFF;
    const auto month = static_cast<int>(static_cast<unsigned>(date.month()));
    const auto day = static_cast<int>(static_cast<unsigned>(date.day()));
    const sys_days first = std::chrono::year(2000 + year % 400) / date.month() / 1;
    const std::chrono::weekday weekday = first + std::chrono::days(day - (year == 0 ? 0 : 1));
    return {year, month, day, static_cast<int>(weekday.c_encoding())};
}

TEST(ModifiedJulianDate, FollowsTheCalendarAndTruncatesFarYears) {
    for (std::int64_t mjd = -678575; mjd < DAYS_OF_400_YEARS; ++mjd) {  // from the year 1
        const Day expected = expected_date(mjd);
        const auto count = static_cast<std::uint32_t>(mjd);
        ASSERT_EQ(date_of(count), expected) << mjd;
        const auto [year, month, day, day_of_week] = expected;
        ASSERT_EQ(results<_greg2mjd>({1.0 * year, 1.0 * month, 1.0 * day})[0], count);
    }
    for (std::int64_t mjd = -2468570; mjd <= 534402341; mjd += 2609) {
        ASSERT_EQ(date_of(static_cast<std::uint32_t>(mjd)), expected_date(mjd)) << mjd;
    }
}

TEST(JavaTime, GoesThroughTheCalendarRecord) {
    constexpr std::uint64_t BEFORE_1970 = (0U - std::uint64_t{10000}) / 10000;  // the count wraps
    constexpr std::uint64_t BEYOND = (0x8000000000000000U - 116444736000000000U) / 10000 + 1;
    constexpr SYSTEMTIME LEAP_DAY = {2000, 2, 2, 29, 23, 59, 59, 987};
    const std::pair<SYSTEMTIME, std::uint64_t> counts[] = {{{2000, 1, 0, 1, 0, 0, 0, 0}, 946684800000U},
                                                           {LEAP_DAY, 951868799987U},
                                                           {{1969, 12, 0, 31, 23, 59, 59, 999}, BEFORE_1970},
                                                           {{2023, 2, 0, 29, 0, 0, 0, 0}, ~std::uint64_t{0}}};
    for (auto [time, count] : counts) {
        EXPECT_EQ(_systime2javatime(&time), count) << time.wYear;
    }
    const std::pair<std::uint64_t, SYSTEMTIME> times[] = {
        {951868799987, LEAP_DAY}, {BEFORE_1970, {1969, 12, 3, 31, 23, 59, 59, 998}}, {BEYOND, {}}};
    for (const auto& [count, time] : times) {
        SYSTEMTIME back;
        EXPECT_EQ(_javatime2systemtime(count, &back), &back);
        EXPECT_EQ(std::memcmp(&back, &time, sizeof back), 0) << count;
    }
    const auto now = [] {
        const auto since_1970 = std::chrono::system_clock::now().time_since_epoch();
        return static_cast<std::uint64_t>(since_1970 / std::chrono::milliseconds(1));
    };
    const std::uint64_t before = now(), ours = _currentjavatime();
    EXPECT_TRUE(before <= ours && ours <= now());
}

}  // namespace
