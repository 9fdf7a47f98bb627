// Dates: automation dates, tick counts and dates in hexadecimal text, by one table of times.
#include "basalt/platform/automation_date.h"

#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <cstring>
#include <random>

#include "basalt/util/hex.h"
#include "tests/platform/error_of.h"

namespace {

using basalt::test::error_of;

constexpr double SECOND = 1.0 / 86'400.0;
constexpr SYSTEMTIME UNCHANGED{1, 2, 3, 4, 5, 6, 7, 8};

constexpr SYSTEMTIME at(WORD year, WORD month, WORD weekday, WORD day, WORD hour = 0, WORD minute = 0,
                        WORD second = 0) {
    return {year, month, weekday, day, hour, minute, second, 0};
}

bool operator==(const SYSTEMTIME& a, const SYSTEMTIME& b) {
    return std::memcmp(&a, &b, sizeof a) == 0;
}

TEST(Dates, have_known_values_days_of_the_week_and_tick_counts) {
    using Row = std::pair<SYSTEMTIME, double>;
    for (const auto& [time, date] :
         {Row(at(1899, 12, 6, 30), 0), Row(at(1899, 12, 5, 29, 6), -1.25), Row(at(100, 1, 5, 1), -657434),
          Row(at(1601, 1, 1, 1), -109205), Row(at(2000, 2, 2, 29, 12), 36585.5),
          Row(at(9999, 12, 5, 31), 2958465)}) {
        SYSTEMTIME copy = time;
        double value = 0.5;
        FILETIME count{};
        EXPECT_TRUE(SystemTimeToVariantTime(&copy, &value) == 1 && value == date) << date;
        EXPECT_TRUE(VariantTimeToSystemTime(date, &copy) == 1 && copy == time) << date;
        const double days = std::trunc(date) + std::abs(date - std::trunc(date)) + 109205.0;
        EXPECT_EQ(SystemTimeToFileTime(&time, &count) != 0, days >= 0) << date;
        EXPECT_EQ(count.dwHighDateTime * 4294967296.0 + count.dwLowDateTime, std::max(days, 0.0) * 864e9);
        EXPECT_TRUE(days < 0 || (FileTimeToSystemTime(&count, &copy) != 0 && copy == time)) << date;
    }
    for (SYSTEMTIME time :
         {at(99, 12, 0, 31), at(2021, 2, 0, 29), at(2021, 0, 0, 1), at(2021, 257, 0, 1), at(2021, 1, 0, 257),
          at(2021, 13, 0, 1), at(2021, 1, 0, 0), at(2021, 1, 0, 1, 24), at(2021, 1, 0, 1, 0, 60),
          at(2021, 1, 0, 1, 0, 0, 60), at(30828, 1, 0, 1), SYSTEMTIME{2000, 1, 6, 1, 0, 0, 0, 1000}}) {
        double date = 0.5;
        FILETIME count{7, 7};
        EXPECT_TRUE(time.wMilliseconds == 1000 || error_of(SystemTimeToVariantTime(&time, &date)) == 87);
        EXPECT_EQ(error_of(SystemTimeToFileTime(&time, &count)), 87U) << testing::PrintToString(time);
        EXPECT_TRUE(date == 0.5 && count.dwLowDateTime == 7 && count.dwHighDateTime == 7);
    }
    SYSTEMTIME time = UNCHANGED;
    FILETIME count{0, 1U << 31};
    EXPECT_TRUE(error_of(FileTimeToSystemTime(&count, &time)) == 87 && time == UNCHANGED);
    count = {0xFFFFFFFF, 0x7FFFFFFF};
    EXPECT_NE(FileTimeToSystemTime(&count, &time), 0);
    EXPECT_TRUE(time == (SYSTEMTIME{30828, 9, 4, 14, 2, 48, 5, 477}));
    EXPECT_EQ(error_of(SystemTimeToVariantTime(&time, nullptr)), 87U) << "beyond 9999";
    GetSystemTime(&time);
    EXPECT_NEAR(COleDateTime(time), 25569.0 + static_cast<double>(std::time(nullptr)) * SECOND, 5 * SECOND);
    EXPECT_NEAR(COleDateTime::GetCurrentTime(), COleDateTime(time), 0.6) << "within half a day's time zone";
}

TEST(Dates, round_to_the_nearest_second_on_both_sides_of_zero) {
    using Row = std::pair<double, const wchar_t*>;
    for (const auto& [date, text] :
         {Row(2 - 0.4 * SECOND, L"1900-01-01 00:00:00"), Row(2 - 0.6 * SECOND, L"1899-12-31 23:59:59"),
          Row(-0.25, L"1899-12-30 06:00:00"), Row(-2 + 0.4 * SECOND, L"1899-12-30 00:00:00"),
          Row(-657434 - 1.4 * SECOND, L"100-01-01 00:00:01")}) {
        EXPECT_EQ(COleDateTime(date).Format(L"%Y-%m-%d %H:%M:%S"), text);
    }
    for (const double date :
         {-657435.0, -657435.99999999, 2958466.0, 2958465.9999999, 1e300, -HUGE_VAL, std::nan("")}) {
        SYSTEMTIME time = UNCHANGED;
        EXPECT_EQ(error_of(VariantTimeToSystemTime(date, &time)), 87U);
        EXPECT_TRUE(time == UNCHANGED && COleDateTime(date).GetStatus() == COleDateTime::invalid);
    }
    std::mt19937 random(std::random_device{}());
    for (int round = 0; round < 20'000; ++round) {
        const double date = std::uniform_int_distribution(-657434, 2958465)(random);
        const int second = std::uniform_int_distribution(0, 86'399)(random);
        SYSTEMTIME time{};
        double back = 0.5;
        ASSERT_EQ(VariantTimeToSystemTime(date + std::copysign(second * SECOND, date), &time), 1);
        ASSERT_EQ((time.wHour * 60 + time.wMinute) * 60 + time.wSecond, second);
        ASSERT_TRUE(SystemTimeToVariantTime(&time, &back) == 1 && std::trunc(back) == date);
    }
}

TEST(Dates, objects_have_a_status_parts_an_order_and_a_text) {
    COleDateTime date(2021, 2, 1, 13, 14, 15);
    EXPECT_EQ(date.Format(L"%d.%m.%Y %H:%M:%S %j %a"), L"01.02.2021 13:14:15 032 Mon");
    EXPECT_EQ((date.Format(CString(L'x', 5000)) + date.Format(nullptr) + date.Format(L"")).GetLength(), 5000);
    CString parts;
    parts.Format(L"%d-%d-%d %d:%d:%d %d", date.GetYear(), date.GetMonth(), date.GetDay(), date.GetHour(),
                 date.GetMinute(), date.GetSecond(), date.GetDayOfWeek());
    EXPECT_EQ(parts, L"2021-2-1 13:14:15 2");
    EXPECT_EQ(date.SetDateTime(2021, 2, 29, 0, 0, 0), COleDateTime::invalid);
    EXPECT_TRUE(date.GetYear() == -1 && date.GetDayOfWeek() == -1 && date.Format(L"%Y").IsEmpty());
    for (const int wrong : {-1, -65535, 65536 + 1, INT_MIN}) {
        EXPECT_EQ(COleDateTime(2021, wrong, 1, 0, 0, 0).GetStatus(), COleDateTime::invalid);
        EXPECT_EQ(COleDateTime(2021, 1, 1, wrong, 0, 0).GetStatus(), COleDateTime::invalid);
    }
    const COleDateTime morning(-1.25);
    const COleDateTime evening(-1.75);  // the same day, though the smaller number
    EXPECT_TRUE(morning < evening && evening > morning && morning <= evening && morning != evening);
    EXPECT_TRUE(!(morning >= evening) && COleDateTime(-0.25) == COleDateTime(0.25));
    date.SetStatus(COleDateTime::null);
    EXPECT_FALSE(date == date || date < morning || date > morning || date <= date);
}

TEST(Dates, are_read_from_hexadecimal_text) {
    constexpr double NONE = -1e9;
    constexpr std::pair<const char*, double> ROWS[] = {
        {"01022021", 44228},   {"29022020", 43890}, {"30121899", 0},        {"01010100", -657434},
        {"31129999", 2958465}, {"1 2 2021", 44228}, {"01022021999", 44228}, {"+1+22021", 44228},
        {"29022021", NONE},    {"00012021", NONE},  {"01132021", NONE},     {"", NONE},
        {"0102", NONE},        {"01010099", NONE},  {"abcdefgh", NONE},     {"-1022021", NONE},
        {"01-12021", NONE},    {"0102-999", NONE}};
    COleDateTime date(5.0);
    EXPECT_THROW(basalt::ParseDateFromHexString("3031003232303231", date), std::runtime_error);
    EXPECT_TRUE(date.m_dt == 5.0 && date.GetStatus() == COleDateTime::valid);
    for (const auto& [text, value] : ROWS) {
        EXPECT_TRUE(basalt::ParseDateFromHexString(basalt::StringToHexString(text), date));
        EXPECT_EQ(date.GetStatus() == COleDateTime::valid ? date.m_dt : NONE, value) << text;
    }
}

}  // namespace
