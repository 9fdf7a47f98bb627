#include "src/platform/system/forks.h"

#include <pthread.h>

#include <mutex>

#include "src/platform/system/lock.h"

namespace basalt::platform {
namespace {

constinit Lock s_registering;
constinit std::atomic<bool> s_is_counting = false;
constinit std::atomic<ProcessMark> s_forks = 0;

}  // namespace

bool register_fork_handlers(std::atomic<bool>& are_registered, const ForkHandlers& handlers) noexcept {
    // Checked without the lock first: in a forked child a thread that does not exist may hold it.
    if (!are_registered.load(std::memory_order_acquire)) {
        const std::lock_guard guard(s_registering);
        if (!are_registered.load(std::memory_order_relaxed)) {
            const int error = ::pthread_atfork(handlers.before, handlers.in_parent, handlers.in_child);
            are_registered.store(error == 0, std::memory_order_release);
        }
    }
    return are_registered.load(std::memory_order_relaxed);
}

bool count_forks() noexcept {
    return register_fork_handlers(s_is_counting, {nullptr, nullptr, [] { ++s_forks; }});
}

ProcessMark this_process() noexcept {
    return s_forks.load(std::memory_order_relaxed);
}

}  // namespace basalt::platform
