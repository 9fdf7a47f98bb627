#include "src/platform/clock.h"

#include <time.h>

namespace {

constexpr std::int64_t COUNTER_TICKS_PER_SECOND = 1'000'000'000;
constexpr std::int64_t COUNTER_TICKS_PER_MILLISECOND = 1'000'000;

// Seconds fit for 292 years of running.
std::int64_t counter() {
    timespec now{};
    clock_gettime(CLOCK_MONOTONIC, &now);
    return now.tv_sec * COUNTER_TICKS_PER_SECOND + now.tv_nsec;
}

}  // namespace

DWORD GetTickCount() {
    return static_cast<DWORD>(counter() / COUNTER_TICKS_PER_MILLISECOND);
}

BOOL QueryPerformanceFrequency(LARGE_INTEGER* frequency) {
    frequency->QuadPart = COUNTER_TICKS_PER_SECOND;
    return 1;
}

BOOL QueryPerformanceCounter(LARGE_INTEGER* count) {
    count->QuadPart = counter();
    return 1;
}
