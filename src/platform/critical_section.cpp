#include "src/platform/critical_section.h"

#include <linux/futex.h>
#include <linux/membarrier.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>

namespace basalt::platform {
namespace {

constexpr int SPINS = 64;

// Without the process-wide barrier a wake-up can be missed, so a sleeper then looks again this often.
constexpr timespec RECHECK_PERIOD{0, 1'000'000};

void pause_briefly() noexcept {
#if defined(__x86_64__)
    __builtin_ia32_pause();
#endif
}

bool barrier_on_all_threads() noexcept {
    if (syscall(SYS_membarrier, MEMBARRIER_CMD_PRIVATE_EXPEDITED, 0, 0) == 0) {
        return true;
    }
    // A process has to register once; asking again is harmless.
    return errno == EPERM && syscall(SYS_membarrier, MEMBARRIER_CMD_REGISTER_PRIVATE_EXPEDITED, 0, 0) == 0 &&
           syscall(SYS_membarrier, MEMBARRIER_CMD_PRIVATE_EXPEDITED, 0, 0) == 0;
}

std::uint32_t* futex_word(std::atomic<std::uint32_t>& word) noexcept {
    static_assert(sizeof(word) == sizeof(std::uint32_t) && std::atomic<std::uint32_t>::is_always_lock_free);
    return reinterpret_cast<std::uint32_t*>(&word);
}

bool try_take(CRITICAL_SECTION& section) noexcept {
    return section.held.load(std::memory_order_relaxed) == 0 &&
           section.held.exchange(1, std::memory_order_acquire) == 0;
}

}  // namespace

void wait_for_critical_section(CRITICAL_SECTION& section) noexcept {
    for (int i = 0; i < SPINS; ++i) {
        if (try_take(section)) {
            return;
        }
        pause_briefly();
    }
    const int error_before = errno;
    section.waiting.fetch_add(1, std::memory_order_seq_cst);
    // From here on every leaving thread either sees `waiting`, or its store to `held` is seen here.
    const timespec* const period = barrier_on_all_threads() ? nullptr : &RECHECK_PERIOD;
    while (section.held.exchange(1, std::memory_order_acquire) != 0) {
        syscall(SYS_futex, futex_word(section.held), FUTEX_WAIT_PRIVATE, 1, period, nullptr, 0);
    }
    section.waiting.fetch_sub(1, std::memory_order_relaxed);
    errno = error_before;
}

void wake_critical_section_waiter(CRITICAL_SECTION& section) noexcept {
    const int error_before = errno;
    syscall(SYS_futex, futex_word(section.held), FUTEX_WAKE_PRIVATE, 1, nullptr, nullptr, 0);
    errno = error_before;
}

}  // namespace basalt::platform
