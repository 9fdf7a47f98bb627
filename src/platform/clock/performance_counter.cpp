#include "src/platform/performance_counter.h"

#include <time.h>

namespace {

constexpr std::int64_t TICKS_PER_SECOND = 1'000'000'000;

}  // namespace

BOOL QueryPerformanceFrequency(LARGE_INTEGER* frequency) {
    frequency->QuadPart = TICKS_PER_SECOND;
    return 1;
}

BOOL QueryPerformanceCounter(LARGE_INTEGER* count) {
    timespec now{};
    clock_gettime(CLOCK_MONOTONIC, &now);
    count->QuadPart = now.tv_sec * TICKS_PER_SECOND + now.tv_nsec;
    return 1;
}
