// Counts of 100-nanosecond ticks since 1601, from and to FILETIME and the system's times.
#ifndef BASALT_SRC_PLATFORM_TICKS_H
#define BASALT_SRC_PLATFORM_TICKS_H

#include <time.h>

#include <algorithm>
#include <cstdint>
#include <limits>

#include "basalt/platform/calendar.h"

namespace basalt::platform {

inline constexpr std::int64_t TICKS_PER_SECOND = 10'000'000;
inline constexpr std::int64_t TICKS_PER_MILLISECOND = 10'000;
inline constexpr std::int64_t NANOSECONDS_PER_TICK = 100;
// From the beginning of 1601 to that of 1970.
inline constexpr std::int64_t SECONDS_BEFORE_1970 = 11'644'473'600;

constexpr FILETIME file_time(std::int64_t ticks) {
    const auto bits = static_cast<std::uint64_t>(ticks);
    return {static_cast<DWORD>(bits), static_cast<DWORD>(bits >> 32)};
}

constexpr std::int64_t tick_count(const FILETIME& time) {
    return static_cast<std::int64_t>(std::uint64_t{time.dwHighDateTime} << 32 | time.dwLowDateTime);
}

// Nanoseconds are not negative and are truncated to ticks. Times before 1601 and after 30828, which some file
// systems can store, are clamped to the first tick and to the last whole second that a signed count holds.
constexpr std::int64_t ticks_of(std::int64_t seconds_since_1970, std::int64_t nanoseconds) {
    constexpr std::int64_t LAST_SECOND = std::numeric_limits<std::int64_t>::max() / TICKS_PER_SECOND - 1;
    if (seconds_since_1970 < -SECONDS_BEFORE_1970) {
        return 0;
    }
    const std::int64_t seconds = std::min(seconds_since_1970, LAST_SECOND - SECONDS_BEFORE_1970);
    return (seconds + SECONDS_BEFORE_1970) * TICKS_PER_SECOND + nanoseconds / NANOSECONDS_PER_TICK;
}

inline std::int64_t ticks_of(const timespec& time) {
    return ticks_of(time.tv_sec, time.tv_nsec);
}

}  // namespace basalt::platform

#endif
