// Counts of 100-nanosecond ticks since 1601 as one number, and from the system's clock times.
#ifndef BASALT_SRC_PLATFORM_TICKS_H
#define BASALT_SRC_PLATFORM_TICKS_H

#include <time.h>

#include <cstdint>

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

// Seconds may be negative, nanoseconds never; they are cut to ticks. A time 29,000 years from now or farther
// is outside the range.
constexpr std::int64_t ticks_of(std::int64_t seconds_since_1970, std::int64_t nanoseconds) {
    return (seconds_since_1970 + SECONDS_BEFORE_1970) * TICKS_PER_SECOND + nanoseconds / NANOSECONDS_PER_TICK;
}

inline std::int64_t ticks_of(const timespec& time) {
    return ticks_of(time.tv_sec, time.tv_nsec);
}

}  // namespace basalt::platform

#endif
