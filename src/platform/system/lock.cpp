#include "src/platform/system/lock.h"

#include <linux/futex.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <ctime>

namespace basalt::platform {
namespace {

// About the time of one sleep and wake-up; most holders leave well before.
constexpr int SPINS = 100;

// The first sleep is short because its wake-up may be missed; a wake-up missed twice is all but impossible.
constexpr long FIRST_SLEEP = 1'000'000;  // nanoseconds
constexpr long LONGEST_SLEEP = 500'000'000;

void relax() noexcept {
#if defined(__x86_64__) || defined(__i386__)
    __builtin_ia32_pause();
#elif defined(__aarch64__)
    asm volatile("yield");
#endif
}

void futex(std::atomic<std::uint32_t>& word, int operation, std::uint32_t value,
           const timespec* period) noexcept {
    static_assert(sizeof(word) == sizeof(std::uint32_t) && std::atomic<std::uint32_t>::is_always_lock_free);
    const int errno_before = errno;
    syscall(SYS_futex, &word, operation, value, period, nullptr, 0);
    errno = errno_before;
}

}  // namespace

void Lock::lock_contended() noexcept {
    if (spin()) {
        return;
    }
    m_sleepers.fetch_add(1, std::memory_order_seq_cst);
    for (timespec period{0, FIRST_SLEEP};; period.tv_nsec = std::min(2 * period.tv_nsec, LONGEST_SLEEP)) {
        m_wanted.store(1, std::memory_order_seq_cst);
        if (try_lock()) {
            break;
        }
        futex(m_wanted, FUTEX_WAIT_PRIVATE, 1, &period);
        if (spin()) {
            break;
        }
    }
    // The waker cleared m_wanted for all sleepers; set it again if any remain.
    if (m_sleepers.fetch_sub(1, std::memory_order_seq_cst) != 1) {
        m_wanted.store(1, std::memory_order_relaxed);
    }
}

bool Lock::spin() noexcept {
    for (int spin = 0; spin < SPINS; ++spin) {
        if (m_held.load(std::memory_order_relaxed) == 0 && try_lock()) {
            return true;
        }
        relax();
    }
    return false;
}

void Lock::wake_one() noexcept {
    // Cleared first: until the woken thread has entered or sleeps again, unlock() makes no further calls.
    if (m_wanted.exchange(0, std::memory_order_seq_cst) != 0) {
        futex(m_wanted, FUTEX_WAKE_PRIVATE, 1, nullptr);
    }
}

}  // namespace basalt::platform
