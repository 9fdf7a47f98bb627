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

// Read and written by any thread, unordered: two threads that make the first query both store the same value.
template <class T>
class Setting {
public:
    constexpr explicit Setting(T start) : m_value(start) {}
    T load() const { return m_value.load(std::memory_order_relaxed); }
    void store(T value) { m_value.store(value, std::memory_order_relaxed); }

private:
    std::atomic<T> m_value;
};

struct EnvironmentState {
    Setting<basalt_os> os_code{0};               // 0: not determined
    Setting<std::int32_t> os_version_number{0};  // no detection of this library sets it
    Setting<basalt_hh> handheld_code{0};         // 0: not determined
    Setting<bool> new_generation{false};         // no detection of this library sets it
    Setting<bool> rtk_option{false};             // no detection of this library sets it
    Setting<basalt_language> language{DEFAULT_LANGUAGE};
    Setting<double> resolution_factor{RESOLUTION_NOT_DETERMINED};
    Setting<std::uint32_t> last_random_seed{0};  // tick count last given to the random generator
};

// Constant-initialised: nothing to do at load and unload.
extern EnvironmentState environment;

}  // namespace basalt::frame

#endif
