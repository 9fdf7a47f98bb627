#include "src/platform/lock.h"

#include <linux/futex.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace basalt::platform {
namespace {

// About the time of one sleep and wake-up; holders usually leave well before.
constexpr int SPINS = 100;

void relax() noexcept {
#if defined(__x86_64__) || defined(__i386__)
    __builtin_ia32_pause();
#elif defined(__aarch64__)
    asm volatile("yield");
#endif
}

long futex(std::atomic<std::uint32_t>& word, int operation, std::uint32_t value) noexcept {
    static_assert(sizeof(word) == sizeof(std::uint32_t));
    return syscall(SYS_futex, &word, operation, value, nullptr, nullptr, 0);
}

}  // namespace

void Lock::lock_contended() noexcept {
    for (int spin = 0; spin < SPINS; ++spin) {
        if (m_state.load(std::memory_order_relaxed) == FREE && try_lock()) {
            return;
        }
        relax();
    }
    // Whoever has slept takes the lock as awaited, since others may sleep still: at worst one wake-up
    // too many, never one too few.
    while (m_state.exchange(AWAITED, std::memory_order_acquire) != FREE) {
        futex(m_state, FUTEX_WAIT_PRIVATE, AWAITED);
    }
}

void Lock::wake_one() noexcept {
    futex(m_state, FUTEX_WAKE_PRIVATE, 1);
}

}  // namespace basalt::platform
