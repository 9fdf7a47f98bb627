#include "basalt/platform/calendar.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>

#include "basalt/platform/error.h"

namespace {

std::uint64_t ticks_of(SYSTEMTIME time) {
    FILETIME ticks = {7, 7};
    SetLastError(0);
    if (SystemTimeToFileTime(&time, &ticks) == 0) {
        EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
        EXPECT_EQ(ticks.dwLowDateTime, 7U);
        EXPECT_EQ(ticks.dwHighDateTime, 7U);
        return 0xBAD;
    }
    return std::uint64_t{ticks.dwHighDateTime} << 32 | ticks.dwLowDateTime;
}

bool equal(const SYSTEMTIME& a, const SYSTEMTIME& b) {
    return std::memcmp(&a, &b, sizeof a) == 0;
}

SYSTEMTIME time_of(std::uint64_t count) {
    const FILETIME ticks = {static_cast<DWORD>(count), static_cast<DWORD>(count >> 32)};
    SYSTEMTIME time = {};
    EXPECT_NE(FileTimeToSystemTime(&ticks, &time), 0);
    return time;
}

TEST(Calendar, CountsTicksFrom1601) {
    EXPECT_EQ(ticks_of({1601, 1, 0, 1, 0, 0, 0, 0}), 0U);
    EXPECT_EQ(ticks_of({1601, 1, 9, 1, 0, 0, 0, 1}), 10000U);
    EXPECT_EQ(ticks_of({1970, 1, 0, 1, 0, 0, 0, 0}), 116444736000000000U);
    EXPECT_EQ(ticks_of({2009, 7, 0, 25, 23, 0, 0, 0}), 128930364000000000U);
    EXPECT_EQ(ticks_of({30827, 12, 0, 31, 23, 59, 59, 999}), 9223149887999990000U);
}

TEST(Calendar, ComesBackWithTheDayOfTheWeek) {
    EXPECT_TRUE(equal(time_of(0), {1601, 1, 1, 1, 0, 0, 0, 0}));
    EXPECT_TRUE(equal(time_of(19999), {1601, 1, 1, 1, 0, 0, 0, 1}));
    EXPECT_TRUE(equal(time_of(128930364000000000U), {2009, 7, 6, 25, 23, 0, 0, 0}));
    EXPECT_TRUE(equal(time_of(0x7FFFFFFFFFFFFFFF), {30828, 9, 4, 14, 2, 48, 5, 477}));
    const FILETIME beyond = {0, 0x80000000};
    SYSTEMTIME untouched = {1, 2, 3, 4, 5, 6, 7, 8};
    SetLastError(0);
    EXPECT_EQ(FileTimeToSystemTime(&beyond, &untouched), 0);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    EXPECT_TRUE(equal(untouched, {1, 2, 3, 4, 5, 6, 7, 8}));
}

TEST(Calendar, RefusesWhatIsNoTime) {
    for (const SYSTEMTIME& time : {SYSTEMTIME{1600, 12, 0, 31, 0, 0, 0, 0},
                                   {30828, 1, 0, 1, 0, 0, 0, 0},
                                   {2000, 0, 0, 1, 0, 0, 0, 0},
                                   {2000, 13, 0, 1, 0, 0, 0, 0},
                                   {2000, 257, 0, 1, 0, 0, 0, 0},
                                   {2000, 1, 0, 0, 0, 0, 0, 0},
                                   {2000, 1, 0, 257, 0, 0, 0, 0},
                                   {2000, 4, 0, 31, 0, 0, 0, 0},
                                   {2100, 2, 0, 29, 0, 0, 0, 0},
                                   {2000, 1, 0, 1, 24, 0, 0, 0},
                                   {2000, 1, 0, 1, 0, 60, 0, 0},
                                   {2000, 1, 0, 1, 0, 0, 60, 0},
                                   {2000, 1, 0, 1, 0, 0, 0, 1000}}) {
        EXPECT_EQ(ticks_of(time), 0xBADU) << time.wYear << ' ' << time.wMonth << ' ' << time.wDay;
    }
    EXPECT_NE(ticks_of({2000, 2, 0, 29, 0, 0, 0, 0}), 0xBADU);
}

}  // namespace
