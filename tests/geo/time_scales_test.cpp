#include <gtest/gtest.h>

#include <chrono>
#include <cstdint>
#include <cstring>
#include <utility>

#include "basalt/geo.h"

namespace {

using std::chrono::sys_days;

constexpr sys_days MJD_0 = std::chrono::year(1858) / std::chrono::November / 17;
constexpr std::uint32_t DAYS_OF_400_YEARS = 146097;

struct Day {
    std::uint16_t year = 0, month = 0, day = 0, day_of_week = 0;
    bool operator==(const Day&) const = default;
};

Day date_of(std::uint32_t mjd) {
    Day d;
    _mjd2greg(mjd, d.year, d.month, d.day, d.day_of_week);
    return d;
}

/// By the calendar, which repeats after 400 years. The day of the week is that of the truncated year, and its
/// rule takes the year 0 to begin a day late.
Day expected_date(std::int64_t mjd) {
    const std::int64_t cycles = (mjd + 20LL * DAYS_OF_400_YEARS) / DAYS_OF_400_YEARS - 20;
    const std::chrono::year_month_day date = MJD_0 + std::chrono::days(mjd - cycles * DAYS_OF_400_YEARS);
    Day d;
    d.year = static_cast<std::uint16_t>(static_cast<int>(date.year()) + cycles * 400);
    d.month = static_cast<std::uint16_t>(static_cast<unsigned>(date.month()));
    d.day = static_cast<std::uint16_t>(static_cast<unsigned>(date.day()));
    const sys_days first = std::chrono::year(2000 + d.year % 400) / date.month() / 1;
    const std::chrono::weekday weekday = first + std::chrono::days(d.day - (d.year == 0 ? 0 : 1));
    d.day_of_week = static_cast<std::uint16_t>(weekday.c_encoding());
    return d;
}

TEST(ModifiedJulianDate, FollowsTheCalendarAndTruncatesFarYears) {
    for (std::int64_t mjd = -678575; mjd < DAYS_OF_400_YEARS; ++mjd) {  // from the year 1
        const Day expected = expected_date(mjd);
        const auto count = static_cast<std::uint32_t>(mjd);
        ASSERT_EQ(date_of(count), expected) << mjd;
        ASSERT_EQ(_greg2mjd(expected.year, expected.month, expected.day), count);
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
