// What this layer has to know of forks: which process this is, and handlers.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_FORKS_H
#define BASALT_SRC_PLATFORM_SYSTEM_FORKS_H

#include <atomic>
#include <cstdint>

namespace basalt::platform {

// Of two processes of which one descends from the other. A number of the system's alone would not do: a child
// may have its parent's, in a namespace of its own or once the parent is gone.
struct alignas(8) ProcessMark {  // as one word, for atomics without a lock
    std::int32_t id = 0;
    std::uint32_t forks = 0;
    bool operator==(const ProcessMark&) const = default;
};

// Counts forks from the first call on: to be called before what carries a mark is made. False without memory.
bool count_forks() noexcept;

ProcessMark this_process() noexcept;

struct ForkHandlers {
    void (*before)();
    void (*in_parent)();
    void (*in_child)();
};

// Registers handlers with the C library, which forgets them when the library is unloaded; once, as
// `are_registered` tells. False without memory. Not to be called with a lock that the handlers take.
bool register_fork_handlers(std::atomic<bool>& are_registered, const ForkHandlers& handlers) noexcept;

}  // namespace basalt::platform

#endif
