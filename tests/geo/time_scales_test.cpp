#include <gtest/gtest.h>

#include <chrono>
#include <cstdint>
#include <cstring>
#include <utility>

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

constexpr std::uint32_t DAYS_OF_400_YEARS = 146097;

/// By the calendar, which comes again after 400 years. The day of the week goes by the year as 16 bits hold
/// it, and its rule takes the year 0 to begin a day late.
Day expected_date(std::uint32_t mjd) {
    const std::chrono::year_month_day date = MJD_0 + std::chrono::days(mjd % DAYS_OF_400_YEARS);
    const std::uint32_t year =
        static_cast<std::uint32_t>(static_cast<int>(date.year())) + mjd / DAYS_OF_400_YEARS * 400;
    Day d;
    d.year = static_cast<std::uint16_t>(year);
    d.month = static_cast<std::uint16_t>(static_cast<unsigned>(date.month()));
    d.day = static_cast<std::uint16_t>(static_cast<unsigned>(date.day()));
    const sys_days first = std::chrono::year(2000 + d.year % 400) / date.month() / 1;
    const std::chrono::weekday weekday = first + std::chrono::days(d.day - (d.year == 0 ? 0 : 1));
    d.day_of_week = static_cast<std::uint16_t>(weekday.c_encoding());
    return d;
}

TEST(ModifiedJulianDate, FollowsTheCalendar) {
    for (std::uint32_t mjd = 0; mjd < DAYS_OF_400_YEARS; ++mjd) {
        const Day expected = expected_date(mjd);
        ASSERT_EQ(date_of(mjd), expected) << mjd;
        ASSERT_EQ(_greg2mjd(expected.year, expected.month, expected.day), mjd);
        const std::uint32_t farther = mjd * 158;
        ASSERT_EQ(date_of(farther), expected_date(farther)) << farther;
    }
    EXPECT_EQ(_greg2mjd(2023, 2, 31), _greg2mjd(2023, 3, 3));
    EXPECT_EQ(_greg2mjd(2023, 14, 29), _greg2mjd(2024, 2, 29)) << "months run over into the next year";
}

TEST(ModifiedJulianDate, CountsDaysBefore1858BackwardsFrom0) {
    const sys_days first = std::chrono::year(1) / std::chrono::January / 1;
    for (sys_days day = first; day < MJD_0; day += std::chrono::days(1)) {
        const std::chrono::year_month_day date = day;
        Day expected;
        expected.year = static_cast<std::uint16_t>(static_cast<int>(date.year()));
        expected.month = static_cast<std::uint16_t>(static_cast<unsigned>(date.month()));
        expected.day = static_cast<std::uint16_t>(static_cast<unsigned>(date.day()));
        expected.day_of_week = static_cast<std::uint16_t>(std::chrono::weekday(day).c_encoding());
        const auto mjd = static_cast<std::uint32_t>((day - MJD_0).count());
        ASSERT_EQ(_greg2mjd(expected.year, expected.month, expected.day), mjd);
        ASSERT_EQ(date_of(mjd), expected) << (day - MJD_0).count();
    }
    EXPECT_EQ(date_of(0U - 678941), (Day{0, 1, 1, 0})) << "a day late, as in the year 65536";
    EXPECT_EQ(date_of(0U - 2468570), (Day{65536 - 4900, 3, 1, 2}));
    EXPECT_EQ(date_of(0U - 2468571), Day());
}

TEST(ModifiedJulianDate, CutsFarYearsTo16BitsAndAnswersNothingBeyondTheLastDay) {
    plain::Random random(5);
    SCOPED_TRACE("seed 5");
    for (int round = 0; round < 200000; ++round) {
        const auto mjd = static_cast<std::uint32_t>(random.real(0.0, 534402341.0));
        ASSERT_EQ(date_of(mjd), expected_date(mjd)) << mjd;
    }
    for (const std::uint32_t mjd : {23257589U, 23257590U, 23257591U, 23257592U, 534402341U}) {
        EXPECT_EQ(date_of(mjd), expected_date(mjd)) << mjd;
    }
    EXPECT_EQ(date_of(23257591).year, 0);
    EXPECT_EQ(date_of(534402342), Day());
    EXPECT_EQ(date_of(0x80000000), Day());
}

using Week = std::pair<std::uint16_t, double>;

Week week_of(std::uint32_t mjd, double seconds_of_day) {
    Week week = {9, 0.0};
    _mjd2gps(mjd, seconds_of_day, week.first, week.second);
    return week;
}

TEST(GpsTime, CountsWeeksFromItsEpoch) {
    EXPECT_EQ(week_of(44244, 0.0), (Week{0, 0.0}));
    EXPECT_EQ(week_of(51247, 3600.0), (Week{1000, 262800.0}));
    EXPECT_EQ(_gps2mjd(1000, 262800.0), 51247.0 + 1.0 / 24.0);
}

TEST(GpsTime, FormsTheWeekFromSixteenBitsOfTheDays) {
    EXPECT_EQ(week_of(44244 + 65535, 0.0).first, 9362);
    EXPECT_EQ(date_of(44244 + 65536), (Day{2159, 6, 12, 2}));
    EXPECT_EQ(week_of(44244 + 65536, 0.0), (Week{0, 65536 % 7 * 86400.0}));
    EXPECT_EQ(week_of(44243, 1.0), (Week{9362, 4294967295U % 7 * 86400.0 + 1.0}));  // 2^32 - 1 days
}

TEST(JavaTime, GoesThroughTheCalendarRecord) {
    SYSTEMTIME time = {2000, 1, 0, 1, 0, 0, 0, 0};
    EXPECT_EQ(_systime2javatime(&time), 946684800000U);
    const SYSTEMTIME leap_day = {2000, 2, 2, 29, 23, 59, 59, 987};
    SYSTEMTIME back = {};
    EXPECT_EQ(_javatime2systemtime(951868799987, &back), &back);
    EXPECT_EQ(std::memcmp(&back, &leap_day, sizeof back), 0);
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
