// Forked children: which process this is, and fork handlers.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_FORKS_H
#define BASALT_SRC_PLATFORM_SYSTEM_FORKS_H

#include <atomic>
#include <cstdint>

namespace basalt::platform {

// Distinguishes a forked child from its parent: the number of forks since counting began. A process id would
// not do: a child in a namespace of its own may have its parent's.
using ProcessMark = std::uint32_t;

// Starts counting; called before the first mark is taken. False when out of memory.
bool count_forks() noexcept;

ProcessMark this_process() noexcept;

struct ForkHandlers {
    void (*before)();
    void (*in_parent)();
    void (*in_child)();
};

// Registers handlers once, recorded in are_registered; the C library drops them when the library is
// unloaded. False when out of memory. Not to be called with a lock held that the handlers take.
bool register_fork_handlers(std::atomic<bool>& are_registered, const ForkHandlers& handlers) noexcept;

}  // namespace basalt::platform

#endif
