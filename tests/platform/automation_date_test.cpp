#include "basalt/platform/automation_date.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <random>

#include "basalt/platform/error.h"

namespace {

SYSTEMTIME at(int year, int month, int day, int hour = 0, int minute = 0, int second = 0) {
    const auto word = [](int number) { return static_cast<WORD>(number); };
    return {word(year), word(month), 0, word(day), word(hour), word(minute), word(second), 0};
}

// But for the day of the week, which what is expected does not know.
void expect_same(SYSTEMTIME time, const SYSTEMTIME& expected) {
    time.wDayOfWeek = expected.wDayOfWeek;
    EXPECT_EQ(std::memcmp(&time, &expected, sizeof time), 0)
        << testing::PrintToString(time) << ' ' << testing::PrintToString(expected);
}

TEST(AutomationDate, published_values) {
    struct Row {
        SYSTEMTIME time;
        double date;
        int weekday;
    };
    for (const Row& row : {
             Row{at(1899, 12, 30), 0.0, 6},
             Row{at(1899, 12, 29, 6), -1.25, 5},
             Row{at(1899, 12, 31, 18), 1.75, 0},
             Row{at(1970, 1, 1), 25569.0, 4},
             Row{at(2000, 2, 29, 12), 36585.5, 2},
             Row{at(100, 1, 1), -657434.0, 5},
             Row{at(9999, 12, 31), 2958465.0, 5},
         }) {
        SCOPED_TRACE(row.date);
        SYSTEMTIME time = row.time;
        double date = 0.5;
        EXPECT_EQ(SystemTimeToVariantTime(&time, &date), 1);
        EXPECT_EQ(date, row.date);
        EXPECT_EQ(VariantTimeToSystemTime(row.date, &time), 1);
        expect_same(time, row.time);
        EXPECT_EQ(time.wDayOfWeek, row.weekday);
    }
    SYSTEMTIME time{};
    EXPECT_EQ(VariantTimeToSystemTime(-0.25, &time), 1);
    expect_same(time, at(1899, 12, 30, 6));
}

TEST(AutomationDate, what_is_no_date_is_refused) {
    for (SYSTEMTIME time : {at(2021, 2, 29), at(2021, 4, 31), at(2021, 0, 1), at(2021, 13, 1), at(2021, 1, 0),
                            at(1900, 2, 29), at(0, 1, 1), at(99, 12, 31), at(10000, 1, 1), at(65535, 1, 1),
                            at(2021, 65535, 1), at(2021, 1, 65535), at(2021, 257, 1), at(2021, 1, 257),
                            at(2021, 1, 1, 24), at(2021, 1, 1, 0, 60), at(2021, 1, 1, 0, 0, 60)}) {
        double date = 0.5;
        SetLastError(0);
        EXPECT_EQ(SystemTimeToVariantTime(&time, &date), 0)
            << time.wYear << ' ' << time.wMonth << ' ' << time.wDay;
        EXPECT_EQ(GetLastError(), 87U);
        EXPECT_EQ(date, 0.5);
    }
    const double nan = std::numeric_limits<double>::quiet_NaN();
    const double infinity = std::numeric_limits<double>::infinity();
    for (const double date :
         {-657435.0, -657435.99999999, 2958466.0, 2958465.9999999, 1e300, -1e300, nan, infinity, -infinity}) {
        SYSTEMTIME time = at(1, 2, 3);
        EXPECT_EQ(VariantTimeToSystemTime(date, &time), 0) << date;
        expect_same(time, at(1, 2, 3));
    }
}

TEST(AutomationDate, rounds_to_the_nearest_second_on_both_sides_of_zero) {
    constexpr double SECOND = 1.0 / 86'400.0;
    SYSTEMTIME time{};
    for (const auto& [date, expected] : {std::pair(2.0 - 0.4 * SECOND, at(1900, 1, 1)),
                                         std::pair(2.0 - 0.6 * SECOND, at(1899, 12, 31, 23, 59, 59)),
                                         std::pair(-2.0 + 0.4 * SECOND, at(1899, 12, 30)),
                                         std::pair(-657434.0 - 1.4 * SECOND, at(100, 1, 1, 0, 0, 1))}) {
        EXPECT_EQ(VariantTimeToSystemTime(date, &time), 1);
        expect_same(time, expected);
    }
}

TEST(AutomationDate, every_second_survives_the_way_there_and_back) {
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    const auto draw = [&](int from, int to) { return std::uniform_int_distribution(from, to)(random); };
    for (int round = 0; round < 20'000; ++round) {
        const SYSTEMTIME time =
            at(draw(100, 9999), draw(1, 12), draw(1, 28), draw(0, 23), draw(0, 59), draw(0, 59));
        SYSTEMTIME copy = time;
        double date = 0.0;
        ASSERT_EQ(SystemTimeToVariantTime(&copy, &date), 1);
        SYSTEMTIME back{};
        ASSERT_EQ(VariantTimeToSystemTime(date, &back), 1);
        expect_same(back, time);
    }
}

TEST(AutomationDate, object_knows_whether_it_is_a_date) {
    EXPECT_EQ(COleDateTime().GetStatus(), COleDateTime::valid);
    COleDateTime date(2021, 2, 1, 13, 14, 15);
    EXPECT_EQ(date.GetYear(), 2021);
    EXPECT_EQ(date.GetMonth(), 2);
    EXPECT_EQ(date.GetDay(), 1);
    EXPECT_EQ(date.GetHour(), 13);
    EXPECT_EQ(date.GetMinute(), 14);
    EXPECT_EQ(date.GetSecond(), 15);
    EXPECT_EQ(date.GetDayOfWeek(), 2) << "a Monday";
    EXPECT_EQ(COleDateTime(at(2021, 2, 1, 13, 14, 15)), date);
    EXPECT_EQ(date.SetDateTime(2021, 2, 29, 0, 0, 0), COleDateTime::invalid);
    EXPECT_EQ(date.GetYear(), -1);
    EXPECT_EQ(date.GetDayOfWeek(), -1);
    for (const int wrong : {-1, -65535, 65536 + 1, std::numeric_limits<int>::min()}) {
        EXPECT_EQ(COleDateTime(2021, wrong, 1, 0, 0, 0).GetStatus(), COleDateTime::invalid);
        EXPECT_EQ(COleDateTime(2021, 1, 1, wrong, 0, 0).GetStatus(), COleDateTime::invalid);
    }
    EXPECT_EQ(COleDateTime(std::nan("")).GetStatus(), COleDateTime::invalid);
    EXPECT_EQ(static_cast<DATE>(COleDateTime(-1.25)), -1.25);
}

TEST(AutomationDate, order_is_that_of_time) {
    const COleDateTime morning(-1.25);
    const COleDateTime evening(-1.75);  // the same day, though the smaller number
    EXPECT_TRUE(morning < evening && evening > morning && morning <= evening && !(morning >= evening));
    EXPECT_EQ(COleDateTime(-0.25), COleDateTime(0.25));
    EXPECT_TRUE(COleDateTime(5.0) != COleDateTime(6.0));
    COleDateTime none(5.0);
    none.SetStatus(COleDateTime::null);
    EXPECT_FALSE(none == none || none < COleDateTime(6.0) || none > COleDateTime(4.0) || none <= none);
}

}  // namespace
