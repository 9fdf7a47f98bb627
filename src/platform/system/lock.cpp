#include "src/platform/system/lock.h"

#include "src/platform/system/waiting.h"

namespace basalt::platform {

void Lock::lock_contended() noexcept {
    if (spin_for_it()) {
        return;
    }
    const ErrnoSaver kept;
    m_sleepers.fetch_add(1, std::memory_order_seq_cst);
    do {
        m_wanted.store(1, std::memory_order_seq_cst);
        // From here on every leaving thread either sees `m_wanted`, or its store to `m_held` is seen here.
        // Without the barrier a wake-up can be missed, so a sleeper then looks again every millisecond.
        const timespec* const period = barrier_on_all_threads() ? nullptr : &ONE_MILLISECOND;
        if (try_lock()) {
            break;
        }
        sleep_on(m_wanted, 1, period);
    } while (!spin_for_it());
    // Whoever woke this thread took the wish of all sleepers back.
    if (m_sleepers.fetch_sub(1, std::memory_order_seq_cst) != 1) {
        m_wanted.store(1, std::memory_order_relaxed);
    }
}

bool Lock::spin_for_it() noexcept {
    for (int spin = 0; spin < SPINS; ++spin) {
        if (m_held.load(std::memory_order_relaxed) == 0 && try_lock()) {
            return true;
        }
        relax();
    }
    return false;
}

void Lock::wake_one() noexcept {
    // Taken back first: until the one that wakes up has come in or sleeps again, leaving costs no more calls.
    if (m_wanted.exchange(0, std::memory_order_seq_cst) != 0) {
        const ErrnoSaver kept;
        wake_one_on(m_wanted);
    }
}

}  // namespace basalt::platform
