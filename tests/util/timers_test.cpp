#include "basalt/util/timers.h"

#include <gtest/gtest.h>
#include <time.h>

#include <cmath>
#include <initializer_list>
#include <limits>
#include <random>
#include <string>

#include "src/platform/clock.h"
#include "tests/support/threads.h"

namespace {

using namespace vex_util;

constexpr std::int64_t SECOND = 1'000'000'000;  // ticks

struct FakeCounter {
    bool is_set = false;
    std::int64_t ticks = 0;
} counter;
int frequency_queries = 0;

}  // namespace

// The names the linker's --wrap makes of the platform's calls.
extern "C" {
BOOL __real__Z23QueryPerformanceCounterP13LARGE_INTEGER(LARGE_INTEGER* count);
BOOL __wrap__Z23QueryPerformanceCounterP13LARGE_INTEGER(LARGE_INTEGER* count) {
    if (!counter.is_set) {
        return __real__Z23QueryPerformanceCounterP13LARGE_INTEGER(count);
    }
    count->QuadPart = counter.ticks;
    return 1;
}
BOOL __real__Z25QueryPerformanceFrequencyP13LARGE_INTEGER(LARGE_INTEGER* frequency);
BOOL __wrap__Z25QueryPerformanceFrequencyP13LARGE_INTEGER(LARGE_INTEGER* frequency) {
    ++frequency_queries;
    return __real__Z25QueryPerformanceFrequencyP13LARGE_INTEGER(frequency);
}
}

namespace {

class Timers : public testing::Test {
protected:
    void SetUp() override { counter = {.is_set = true, .ticks = 5 * SECOND}; }
    void TearDown() override { counter = {}; }
    static void pass(double seconds) { counter.ticks += std::llround(seconds * 1e9); }
    // Polls as many seconds apart: an x for each that reports a period.
    static std::string polls(PeriodicTimer& timer, bool drop, std::initializer_list<double> gaps) {
        std::string answers;
        for (const double gap : gaps) {
            pass(gap);
            answers += timer.Update(drop) ? 'x' : '-';
        }
        return answers;
    }
};

TEST(PerformanceCounter, counts_the_machines_monotonic_nanoseconds) {
    const auto monotonic = [] {
        timespec now{};
        clock_gettime(CLOCK_MONOTONIC, &now);
        return now.tv_sec * SECOND + now.tv_nsec;
    };
    const std::int64_t before = monotonic();
    LARGE_INTEGER count{};
    EXPECT_NE(QueryPerformanceCounter(&count), 0);
    EXPECT_GE(count.QuadPart, before);
    EXPECT_LE(count.QuadPart, monotonic());
}

// The tick length is a state of the process, so its beginning is seen in a process of its own.
TEST(TimersDeathTest, tick_length_is_determined_once_by_the_first_timers) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    const auto check = [] {
        bool right = HiResTimer::s_llFrequency == 0.0;
        basalt::test::run_threads(4, [&](int) { HiResTimer().GetElapsedS(); });
        right = right && HiResTimer::s_llFrequency == 1e-9 && frequency_queries == 1;
        // A host may take the value back, or put its own in its place.
        HiResTimer::s_llFrequency = 0.0;
        HiResTimer();
        right = right && HiResTimer::s_llFrequency == 1e-9 && frequency_queries == 2;
        HiResTimer::s_llFrequency = 0.5;
        HiResTimer();
        right = right && HiResTimer::s_llFrequency == 0.5 && frequency_queries == 2;
        std::_Exit(right ? 0 : 1);
    };
    EXPECT_EXIT(check(), testing::ExitedWithCode(0), "");
}

TEST_F(Timers, stopwatch_counts_from_its_last_reset) {
    HiResTimer timer(CString(L"lap"), true);
    EXPECT_EQ(timer.GetElapsedS(), 0.0F);
    EXPECT_EQ(timer.GetElapsedMs(), 0UL);
    pass(1.9999999);
    EXPECT_EQ(timer.GetElapsedMs(), 1999UL) << "cut off, not rounded";
    EXPECT_EQ(timer.GetElapsedS(), 1.9999999F);
    HiResTimer copy = timer;
    timer.Reset();
    pass(0.25);
    EXPECT_EQ(timer.GetElapsed(), 0.25F);
    EXPECT_EQ(copy.GetElapsed(), 2.25F) << "a copy runs on from the same start";

    timer.Reset();
    counter.ticks += ((std::int64_t{1} << 32) + 12'345) * 1'000'000 + 999'999;
    EXPECT_EQ(timer.GetElapsedMs(), 12'345UL) << "of 32 bits";
    EXPECT_EQ(timer.GetElapsedS(), 4294979.641999999F);
}

TEST_F(Timers, period_carries_its_overshoot_unless_that_is_dropped) {
    PeriodicTimer timer;
    // After 2.3 s two periods have passed, of which one is reported.
    EXPECT_EQ(polls(timer, false, {0.999, 1.301, 0.0, 0.6999, 0.0002}), "-x--x");
    PeriodicTimer dropping(1.0F, false);
    EXPECT_EQ(polls(dropping, true, {2.3, 0.9999, 0.0002}), "x-x");
}

TEST_F(Timers, start_due_reports_at_once_and_exactly_one_period) {
    PeriodicTimer timer(0.5F, true);
    EXPECT_EQ(polls(timer, false, {0.0, 0.0}), "x-");
    timer.Reset(0.25F, true);
    EXPECT_EQ(polls(timer, false, {0.0, 0.0}), "x-");
}

TEST_F(Timers, resets_keep_the_carry_unless_they_start_due) {
    PeriodicTimer timer(1.0F, false);
    EXPECT_EQ(polls(timer, false, {1.75}), "x");  // carries 0.75
    timer.Reset();
    EXPECT_EQ(polls(timer, false, {0.25, 1.5}), "xx");  // carries 0, then 0.5
    pass(0.375);
    timer.Reset(2.0F, false);
    EXPECT_EQ(polls(timer, false, {1.25, 0.25}), "-x") << "0.5 carried into the new period of 2";
}

TEST_F(Timers, periods_that_are_none) {
    PeriodicTimer never(std::numeric_limits<float>::quiet_NaN(), true);
    EXPECT_EQ(polls(never, false, {1000.0}), "-");

    PeriodicTimer always(0.0F, false);
    EXPECT_EQ(polls(always, true, {0.0, 0.0}), "xx");
    EXPECT_EQ(polls(always, false, {0.0, 0.0}), "x-") << "the remainder of a division by 0 is carried";
    always.Reset(1.0F, true);
    EXPECT_EQ(polls(always, false, {0.0}), "x");
}

// Ten hours of polls at random times: the k-th report comes at the first poll after k periods, within the
// documented shift per period.
TEST_F(Timers, phase_holds_over_hours_of_late_polls) {
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937_64 random(seed);
    constexpr double SHIFT_PER_PERIOD = 1.25e-7;
    constexpr std::int64_t LONGEST_GAP = SECOND / 20;
    const std::int64_t start = counter.ticks;
    PeriodicTimer timer(1.0F, false);
    std::int64_t reports = 0;
    while (counter.ticks - start < 36'000 * SECOND) {
        counter.ticks += static_cast<std::int64_t>(random() % LONGEST_GAP);
        if (timer.Update(false)) {
            ++reports;
            const double lateness = static_cast<double>(counter.ticks - start - reports * SECOND) * 1e-9;
            const double shift = static_cast<double>(reports) * SHIFT_PER_PERIOD;
            ASSERT_GE(lateness, -shift) << reports;
            ASSERT_LE(lateness, static_cast<double>(LONGEST_GAP) * 1e-9 + shift) << reports;
        }
    }
    EXPECT_NEAR(static_cast<double>(reports), 36'000.0, 1.0);
}

}  // namespace
