#include "basalt/util/timers.h"

#include <gtest/gtest.h>

#include <cmath>
#include <random>

#include "src/platform/clock.h"
#include "tests/support/threads.h"

static std::int64_t ticks = 0;
static int queries = 0;

// The linker's --wrap puts these in place of the platform's calls.
extern "C" BOOL __wrap__Z23QueryPerformanceCounterP13LARGE_INTEGER(LARGE_INTEGER* count) {
    return count->QuadPart = ticks, 1;
}
extern "C" BOOL __wrap__Z25QueryPerformanceFrequencyP13LARGE_INTEGER(LARGE_INTEGER* frequency) {
    return frequency->QuadPart = 1'000'000'000, ++queries;
}

namespace {

using namespace vex_util;

TEST(Timers, tick_length_is_determined_once_by_the_first_timers) {
    queries = 0;
    for (const double hosts : {0.0, 0.5}) {  // what a host left there
        HiResTimer::s_llFrequency = hosts;
        basalt::test::run_threads(4, [&](int) { HiResTimer().GetElapsedS(); });
        EXPECT_EQ(HiResTimer::s_llFrequency, hosts == 0.0 ? 1e-9 : hosts);
        EXPECT_EQ(queries, 1);
    }
    HiResTimer::s_llFrequency = 1e-9;
}

TEST(Timers, stopwatch_counts_from_its_last_reset) {
    HiResTimer timer(CString(L"lap"), true);
    EXPECT_TRUE(timer.GetElapsedS() == 0.0F && timer.GetElapsedMs() == 0);
    ticks += 1'999'999'900;
    EXPECT_TRUE(timer.GetElapsedMs() == 1999 && timer.GetElapsedS() == 1.9999999F) << "truncated";
    HiResTimer copy = timer;
    timer.Reset();
    ticks += 250'000'000;
    EXPECT_TRUE(timer.GetElapsed() == 0.25F && copy.GetElapsed() == 2.25F) << "a copy keeps the start";
    timer.Reset();
    ticks += ((std::int64_t{1} << 32) + 12'345) * 1'000'000 + 999'999;
    EXPECT_TRUE(timer.GetElapsedMs() == 12'345 && timer.GetElapsedS() == 4294979.641999999F) << "of 32 bits";
}

TEST(Timers, periods_carry_their_overshoot_unless_it_is_dropped) {
    PeriodicTimer timer;
    // Polls as many seconds apart: an x for each that reports a period.
    const auto polls = [&](bool drop, std::initializer_list<double> gaps) {
        std::string reports;
        for (const double gap : gaps) {
            ticks += std::llround(gap * 1e9);
            reports += timer.Update(drop) ? 'x' : '-';
        }
        return reports;
    };
    EXPECT_EQ(polls(false, {0.999, 1.301, 0.0, 0.6999, 0.0002}), "-x--x");  // after 2.3 s one is reported
    timer = PeriodicTimer(0.5F, true);
    EXPECT_EQ(polls(false, {0.0, 0.0}), "x-");
    timer.Reset(0.25F, true);
    EXPECT_EQ(polls(false, {0.0, 0.0}), "x-");
    timer = PeriodicTimer(1.0F, false);
    EXPECT_EQ(polls(true, {2.3, 0.9999, 0.0002}), "x-x");
    EXPECT_EQ(polls(false, {1.75}), "x");  // carries 0.75
    timer.Reset();
    EXPECT_EQ(polls(false, {0.25, 1.5, 0.375}), "xx-");  // carries 0, then 0.5
    timer.Reset(2.0F, false);
    EXPECT_EQ(polls(false, {1.25, 0.25}), "-x") << "0.5 carried into the new period";
    timer = PeriodicTimer(0.0F, false);
    EXPECT_EQ(polls(true, {0.0, 0.0}), "xx");
    EXPECT_EQ(polls(false, {0.0, 0.0}), "x-") << "the remainder of a division by 0";
    timer.Reset(1.0F, true);
    EXPECT_EQ(polls(false, {0.0}), "x");
    timer.Reset(std::nanf(""), true);
    EXPECT_EQ(polls(false, {1000.0}), "-");
}

// Polls at random times: the k-th report is at the first poll after k periods, within the documented shift.
TEST(Timers, phase_holds_over_hours_of_late_polls) {
    std::mt19937_64 random(std::random_device{}());
    const std::int64_t start = ticks;
    PeriodicTimer timer(1.0F, false);
    for (double reports = 0; reports < 36'000;) {
        ticks += static_cast<std::int64_t>(random() % 50'000'000);
        if (timer.Update(false)) {
            const double lateness = static_cast<double>(ticks - start) * 1e-9 - ++reports;
            ASSERT_GE(lateness, -1.25e-7 * reports);
            ASSERT_LE(lateness, 0.05 + 1.25e-7 * reports);
        }
    }
}

}  // namespace
