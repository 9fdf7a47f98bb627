#include "src/platform/lock.h"

#include "src/platform/waiting.h"

namespace basalt::platform {

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
    // Without the barrier a wake-up can be missed, so a sleeper then looks again every millisecond.
    const timespec* const period = barrier_on_all_threads() ? nullptr : &ONE_MILLISECOND;
    while (!try_lock()) {
        sleep_on(m_held, 1, period);
    }
    m_waiting.fetch_sub(1, std::memory_order_relaxed);
}

void Lock::wake_one() noexcept {
    const ErrnoKept kept;
    wake_one_on(m_held);
}

}  // namespace basalt::platform
