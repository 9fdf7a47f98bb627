#include <gtest/gtest.h>

#include <chrono>
#include <cstdint>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"
#include "tests/support/threads.h"

namespace {

using std::chrono::sys_days;

constexpr sys_days MJD_0 = std::chrono::year(1858) / std::chrono::November / 17;

struct Day {
    std::uint16_t year = 0, month = 0, day = 0, day_of_week = 0;
    bool operator==(const Day&) const = default;
};

Day date_of(std::uint32_t mjd) {
    Day d;
    _mjd2greg(mjd, d.year, d.month, d.day, d.day_of_week);
    return d;
}

TEST(ModifiedJulianDate, FollowsTheCalendar) {
    for (std::uint32_t mjd = 0; mjd <= 120000; ++mjd) {
        const sys_days day = MJD_0 + std::chrono::days(mjd);
        const std::chrono::year_month_day date = day;
        const Day expected = {static_cast<std::uint16_t>(static_cast<int>(date.year())),
                              static_cast<std::uint16_t>(static_cast<unsigned>(date.month())),
                              static_cast<std::uint16_t>(static_cast<unsigned>(date.day())),
                              static_cast<std::uint16_t>(std::chrono::weekday(day).c_encoding())};
        ASSERT_EQ(date_of(mjd), expected) << mjd;
        ASSERT_EQ(_greg2mjd(expected.year, expected.month, expected.day), mjd);
    }
    EXPECT_EQ(_greg2mjd(1858, 11, 16), 0xFFFFFFFFU);
    EXPECT_EQ(_greg2mjd(2023, 2, 31), _greg2mjd(2023, 3, 3));
    EXPECT_EQ(_greg2mjd(2023, 14, 29), _greg2mjd(2024, 2, 29)) << "months run over into the next year";
}

/// The conversion to a date as it is written in the journal, year cut to 16 bits before the day of the week.
Day plain_date_of(std::uint32_t mjd) {
    std::int32_t l = static_cast<std::int32_t>(mjd) + 2468570;
    const std::int32_t n = 4 * l / 146097;
    l = l - (146097 * n + 3) / 4;
    const std::int32_t i = 4000 * (l + 1) / 1461001;
    l = l - 1461 * i / 4 + 31;
    const std::int32_t j = 80 * l / 2447;
    const std::int32_t k = j / 11;
    Day d;
    d.day = static_cast<std::uint16_t>(l - 2447 * j / 80);
    d.month = static_cast<std::uint16_t>(j + 2 - 12 * k);
    d.year = static_cast<std::uint16_t>(100 * (n - 49) + i + k);
    const int cumulative[] = {0, 31, 59, 90, 120, 151, 181, 212, 243, 273, 304, 334};
    int day_of_year = cumulative[d.month - 1] + d.day;
    if (d.month > 2 && ((d.year % 4 == 0 && d.year % 100 != 0) || d.year % 400 == 0)) {
        ++day_of_year;
    }
    const int h = (d.year - 1) / 100;
    const int y = (d.year - 1) % 100;
    const int w = (5 * (h % 4) + y + y / 4) % 7 + 1;
    d.day_of_week = static_cast<std::uint16_t>((w + day_of_year - 1) % 7);
    return d;
}

TEST(ModifiedJulianDate, KeepsToTheArithmeticForFarYears) {
    plain::Random random(5);
    SCOPED_TRACE("seed 5");
    for (int round = 0; round < 200000; ++round) {
        const auto mjd = static_cast<std::uint32_t>(random.real(0.0, 534402341.0));
        ASSERT_EQ(date_of(mjd), plain_date_of(mjd)) << mjd;
    }
    for (std::uint32_t mjd = 0; mjd <= 23257590; mjd += 97) {
        ASSERT_EQ(date_of(mjd), plain_date_of(mjd)) << mjd;
    }
    for (const std::uint32_t mjd : {23257589U, 23257590U, 23257591U, 23257592U, 534402341U}) {
        EXPECT_EQ(date_of(mjd), plain_date_of(mjd)) << mjd;
    }
    EXPECT_EQ(date_of(23257590).year, 65535);
    EXPECT_EQ(date_of(23257591).year, 0);
    EXPECT_EQ(date_of(534402342), Day());
    EXPECT_EQ(date_of(0xFFFFFFFF), Day());
}

TEST(GpsTime, CountsWeeksFromItsEpoch) {
    std::uint16_t week = 9;
    double seconds = 0.0;
    _mjd2gps(44244, 0.0, week, seconds);
    EXPECT_EQ(week, 0);
    EXPECT_EQ(seconds, 0.0);
    _mjd2gps(51247, 3600.0, week, seconds);
    EXPECT_EQ(week, 1000);
    EXPECT_EQ(seconds, 262800.0);
    EXPECT_EQ(_gps2mjd(1000, 262800.0), 51247.0 + 1.0 / 24.0);
    _mjd2gps(60000, 86399.5, week, seconds);
    EXPECT_NEAR(_gps2mjd(week, seconds), 60000.0 + 86399.5 / 86400.0, 1e-11);
}

TEST(GpsTime, FormsTheWeekFromSixteenBitsOfTheDays) {
    std::uint16_t week = 0;
    double seconds = 0.0;
    _mjd2gps(44244 + 65535, 0.0, week, seconds);
    EXPECT_EQ(week, 9362);
    EXPECT_EQ(date_of(44244 + 65536), (Day{2159, 6, 12, 2}));
    _mjd2gps(44244 + 65536, 0.0, week, seconds);
    EXPECT_EQ(week, 0);
    EXPECT_EQ(seconds, 65536 % 7 * 86400.0);
    _mjd2gps(44243, 1.0, week, seconds);  // 2^32 - 1 days
    EXPECT_EQ(week, 9362);
    EXPECT_EQ(seconds, 4294967295U % 7 * 86400.0 + 1.0);
}

TEST(JavaTime, GoesThroughTheCalendarRecord) {
    SYSTEMTIME time = {1970, 1, 0, 1, 0, 0, 0, 0};
    EXPECT_EQ(_systime2javatime(&time), 0U);
    time = {2000, 1, 0, 1, 0, 0, 0, 0};
    EXPECT_EQ(_systime2javatime(&time), 946684800000U);
    SYSTEMTIME back = {};
    EXPECT_EQ(_javatime2systemtime(951868799987, &back), &back);
    EXPECT_EQ(back.wYear, 2000);
    EXPECT_EQ(back.wMonth, 2);
    EXPECT_EQ(back.wDay, 29);
    EXPECT_EQ(back.wDayOfWeek, 2);
    EXPECT_EQ(back.wHour, 23);
    EXPECT_EQ(back.wMinute, 59);
    EXPECT_EQ(back.wSecond, 59);
    EXPECT_EQ(back.wMilliseconds, 987);
    EXPECT_EQ(_systime2javatime(&back), 951868799987U);
}

TEST(JavaTime, WrapsBefore1970AndComesBackWithinAMillisecond) {
    SYSTEMTIME time = {1969, 12, 0, 31, 23, 59, 59, 999};
    const std::uint64_t count = _systime2javatime(&time);
    EXPECT_EQ(count, (0U - std::uint64_t{10000}) / 10000);
    SYSTEMTIME back = {};
    _javatime2systemtime(count, &back);
    EXPECT_EQ(back.wYear, 1969);
    EXPECT_EQ(back.wMilliseconds, 998);
}

TEST(JavaTime, AnswersWhatIsNoTime) {
    SYSTEMTIME no_day = {2023, 2, 0, 29, 0, 0, 0, 0};
    EXPECT_EQ(_systime2javatime(&no_day), ~std::uint64_t{0});
    SYSTEMTIME out = {1, 2, 3, 4, 5, 6, 7, 8};
    _javatime2systemtime((0x8000000000000000U - 116444736000000000U) / 10000 + 1, &out);
    EXPECT_EQ(out.wYear + out.wMonth + out.wDay + out.wDayOfWeek + out.wHour + out.wMilliseconds, 0);
}

TEST(JavaTime, ReadsTheClockOnAnyThread) {
    using namespace std::chrono;
    const auto now = [] {
        return static_cast<std::uint64_t>(
            duration_cast<milliseconds>(system_clock::now().time_since_epoch()).count());
    };
    basalt::test::run_threads(4, [&](int) {
        const std::uint64_t before = now();
        const std::uint64_t ours = _currentjavatime();
        EXPECT_LE(before, ours);
        EXPECT_LE(ours, now());
    });
}

}  // namespace
