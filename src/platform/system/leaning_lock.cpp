#include "src/platform/system/leaning_lock.h"

#include "src/platform/system/waiting.h"

namespace basalt::platform {

void LeaningLock::enter_as_any(std::uintptr_t self) noexcept {
    m_lock.lock();
    if (m_favour.load(std::memory_order_relaxed) != 0) {
        end_favour();
    }
    note_entry(self);
}

bool LeaningLock::try_enter_as_any(std::uintptr_t self) noexcept {
    if (!m_lock.try_lock()) {
        return false;
    }
    if (m_favour.load(std::memory_order_relaxed) != 0 && !try_end_favour()) {
        m_lock.unlock();
        return false;
    }
    note_entry(self);
    return true;
}

void LeaningLock::note_entry(std::uintptr_t self) noexcept {
    m_inside = nullptr;
    if (self != m_last) {
        m_last = self;
        m_run = 0;
    } else if (++m_run == m_wanted) {
        favour(self);
    }
}

void LeaningLock::favour(std::uintptr_t self) noexcept {
    const ErrnoSaver kept;
    m_run = 0;
    // Also a trial of the barrier: without one there can be no favourite.
    if (m_turn == TURNS || !barrier_on_all_threads()) {
        return;
    }
    m_favour.store(self | m_turn, std::memory_order_relaxed);
    ++m_turn;
    m_wanted *= 4;  // threads that take turns end favours less and less often
}

void LeaningLock::end_favour() noexcept {
    const ErrnoSaver kept;
    Word& inside = m_words[m_favour.load(std::memory_order_relaxed) & TURN_BITS];
    m_favour.store(0, std::memory_order_relaxed);
    const timespec* period = nullptr;
    if (!barrier_on_all_threads()) {
        // It was there when the favour was given. No processor holds a store back for as long as this.
        nanosleep(&ONE_MILLISECOND, nullptr);
        period = &ONE_MILLISECOND;
    }
    for (int spin = 0; spin < SPINS && inside.load(std::memory_order_acquire) != 0; ++spin) {
        relax();
    }
    while (inside.load(std::memory_order_acquire) != 0) {
        sleep_on(inside, 1, period);
    }
}

// The favour stays with a favourite that is inside: nobody enters by the ordinary lock before it has been
// ended.
bool LeaningLock::try_end_favour() noexcept {
    const ErrnoSaver kept;
    const std::uintptr_t favour = m_favour.load(std::memory_order_relaxed);
    m_favour.store(0, std::memory_order_relaxed);
    if (barrier_on_all_threads() && m_words[favour & TURN_BITS].load(std::memory_order_acquire) == 0) {
        return true;
    }
    m_favour.store(favour, std::memory_order_relaxed);
    return false;
}

void LeaningLock::wake(Word& inside) noexcept {
    const ErrnoSaver kept;
    wake_one_on(inside);
}

}  // namespace basalt::platform
