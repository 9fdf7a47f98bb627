// Mutex that costs no locked instruction while one thread is the only one to take it.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_LEANING_LOCK_H
#define BASALT_SRC_PLATFORM_SYSTEM_LEANING_LOCK_H

#include <atomic>
#include <cstdint>

#include "src/platform/system/lock.h"

namespace basalt::platform {

// A thread that has entered often enough in a row becomes the favourite: it announces itself by a plain store
// and looks whether it still is the favourite. Whoever else wants the lock enters by the ordinary one, ends
// the favour, and sees to it by a barrier on every thread of the process that the announcement is seen here
// or the end of the favour there. Not recursive; used as Lock is, with constructor and destructor as free.
class LeaningLock {
public:
    constexpr LeaningLock() noexcept = default;
    LeaningLock(const LeaningLock&) = delete;
    LeaningLock& operator=(const LeaningLock&) = delete;

    void lock() noexcept {
        // A later thread may get the control block of one that has ended, and its favour with it.
        const auto self = reinterpret_cast<std::uintptr_t>(__builtin_thread_pointer());
        const std::uintptr_t favour = m_favour.load(std::memory_order_relaxed);
        if ((favour & ~TURN_BITS) != self || !enter_as_favourite(favour)) {
            enter_as_any(self);
        }
    }

    // Fails where lock() would wait.
    bool try_lock() noexcept {
        const auto self = reinterpret_cast<std::uintptr_t>(__builtin_thread_pointer());
        const std::uintptr_t favour = m_favour.load(std::memory_order_relaxed);
        return ((favour & ~TURN_BITS) == self && enter_as_favourite(favour)) || try_enter_as_any(self);
    }

    void unlock() noexcept {
        Word* const inside = m_inside;
        if (inside == nullptr) {
            m_lock.unlock();
            return;
        }
        inside->store(0, std::memory_order_release);
        std::atomic_signal_fence(std::memory_order_seq_cst);
        if (m_favour.load(std::memory_order_relaxed) == 0) {
            wake(*inside);
        }
    }

private:
    using Word = std::atomic<std::uint32_t>;

    // A favourite that was held up between its look and its store may store at any later time, so that no
    // other may ever use its word: a lock has so many favourites in its life and no more.
    static constexpr std::uint32_t TURNS = 4;
    static constexpr std::uintptr_t TURN_BITS = TURNS - 1;  // control blocks are aligned to more than that

    // Entries in a row that make a favourite. By then it has cost more than the end of its favour will.
    static constexpr std::uint32_t FIRST_RUN = 1024;

    bool enter_as_favourite(std::uintptr_t favour) noexcept {
        Word& inside = m_words[favour & TURN_BITS];
        inside.store(1, std::memory_order_relaxed);
        std::atomic_signal_fence(std::memory_order_seq_cst);
        if (m_favour.load(std::memory_order_relaxed) != favour) {
            inside.store(0, std::memory_order_release);
            wake(inside);
            return false;
        }
        m_inside = &inside;
        return true;
    }

    void enter_as_any(std::uintptr_t self) noexcept;
    bool try_enter_as_any(std::uintptr_t self) noexcept;
    void note_entry(std::uintptr_t self) noexcept;
    void favour(std::uintptr_t self) noexcept;
    void end_favour() noexcept;
    bool try_end_favour() noexcept;
    void wake(Word& inside) noexcept;

    // All but the words are written by who holds the lock alone.
    std::atomic<std::uintptr_t> m_favour{0};  // the favourite's control block and its turn; 0 without one
    Word* m_inside = nullptr;                 // the holder's word; null if it came in by m_lock
    Word m_words[TURNS]{};                    // 1 while the favourite of that turn is inside
    Lock m_lock;
    std::uint32_t m_turn = 0;  // of the next favourite
    std::uint32_t m_run = 0;   // entries in a row by m_last, by m_lock
    std::uint32_t m_wanted = FIRST_RUN;
    std::uintptr_t m_last = 0;
};

}  // namespace basalt::platform

#endif
