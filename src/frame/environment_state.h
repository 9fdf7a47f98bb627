// The frame's process-wide settings as stored.
#ifndef BASALT_SRC_FRAME_ENVIRONMENT_STATE_H
#define BASALT_SRC_FRAME_ENVIRONMENT_STATE_H

#include <atomic>
#include <cstdint>

#include "basalt/frame.h"

namespace basalt::frame {

inline constexpr basalt_language DEFAULT_LANGUAGE = 15;

// Marks the resolution factor as not determined, by exact comparison.
inline constexpr double RESOLUTION_NOT_DETERMINED = 2e-308;

// Read and written by any thread: two threads that make the first query both store the same value.
struct EnvironmentState {
    std::atomic<basalt_os> os_code{0};               // 0: not determined
    std::atomic<std::int32_t> os_version_number{0};  // no detection of this library sets it
    std::atomic<basalt_hh> handheld_code{0};         // 0: not determined
    std::atomic<bool> new_generation{false};         // no detection of this library sets it
    std::atomic<bool> rtk_option{false};             // no detection of this library sets it
    std::atomic<basalt_language> language{DEFAULT_LANGUAGE};
    std::atomic<double> resolution_factor{RESOLUTION_NOT_DETERMINED};
    std::atomic<std::uint32_t> last_random_seed{0};  // tick count last given to the random generator
};

// Constant-initialised: nothing to do at load and unload.
extern EnvironmentState environment;

}  // namespace basalt::frame

#endif
