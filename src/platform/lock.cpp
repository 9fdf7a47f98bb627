#include "src/platform/lock.h"

#include <linux/futex.h>
#include <linux/membarrier.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>

namespace basalt::platform {
namespace {

// About the time of one sleep and wake-up; holders usually leave well before.
constexpr int SPINS = 100;

// Without the process-wide barrier a wake-up can be missed, so a sleeper then looks again this often.
constexpr timespec RECHECK_PERIOD{0, 1'000'000};

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
    syscall(SYS_futex, &word, operation, value, period, nullptr, 0);
}

bool barrier_on_all_threads() noexcept {
    if (syscall(SYS_membarrier, MEMBARRIER_CMD_PRIVATE_EXPEDITED, 0, 0) == 0) {
        return true;
    }
    // A process has to register once; asking again is harmless.
    return errno == EPERM && syscall(SYS_membarrier, MEMBARRIER_CMD_REGISTER_PRIVATE_EXPEDITED, 0, 0) == 0 &&
           syscall(SYS_membarrier, MEMBARRIER_CMD_PRIVATE_EXPEDITED, 0, 0) == 0;
}

class ErrnoKept {
public:
    ErrnoKept() noexcept : m_before(errno) {}
    ~ErrnoKept() { errno = m_before; }
    ErrnoKept(const ErrnoKept&) = delete;
    ErrnoKept& operator=(const ErrnoKept&) = delete;

private:
    int m_before;
};

}  // namespace

void Lock::lock_contended() noexcept {
    for (int spin = 0; spin < SPINS; ++spin) {
        if (m_held.load(std::memory_order_relaxed) == 0 && try_lock()) {
            return;
        }
        relax();
    }
    const ErrnoKept kept;
    m_waiting.fetch_add(1, std::memory_order_seq_cst);
    // From here on every leaving thread either sees `m_waiting`, or its store to `m_held` is seen here.
    const timespec* const period = barrier_on_all_threads() ? nullptr : &RECHECK_PERIOD;
    while (!try_lock()) {
        futex(m_held, FUTEX_WAIT_PRIVATE, 1, period);
    }
    m_waiting.fetch_sub(1, std::memory_order_relaxed);
}

void Lock::wake_one() noexcept {
    const ErrnoKept kept;
    futex(m_held, FUTEX_WAKE_PRIVATE, 1, nullptr);
}

}  // namespace basalt::platform
