// Mutex of three words, for locks that are taken millions of times a second and seldom fought over.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_LOCK_H
#define BASALT_SRC_PLATFORM_SYSTEM_LOCK_H

#include <atomic>
#include <cstdint>

namespace basalt::platform {

// Not recursive. Usable before any constructor has run and never needs tearing down, so it may live in
// static storage and in memory that is zero. Used through std::lock_guard and std::unique_lock.
// Leaves errno alone.
class Lock {
public:
    constexpr Lock() noexcept = default;
    Lock(const Lock&) = delete;
    Lock& operator=(const Lock&) = delete;

    void lock() noexcept {
        if (!try_lock()) {
            lock_contended();
        }
    }

    bool try_lock() noexcept { return m_held.exchange(1, std::memory_order_acquire) == 0; }

    void unlock() noexcept {
        // A plain store and a load instead of a second locked instruction: half the price of a pair. The
        // processor may run the load before the store is seen; a thread about to sleep makes up for it with
        // a barrier on every thread of the process.
        m_held.store(0, std::memory_order_release);
        std::atomic_signal_fence(std::memory_order_seq_cst);
        if (m_wanted.load(std::memory_order_relaxed) != 0) {
            wake_one();
        }
    }

private:
    void lock_contended() noexcept;
    bool spin_for_it() noexcept;
    void wake_one() noexcept;

    std::atomic<std::uint32_t> m_held{0};      // 1 while held
    std::atomic<std::uint32_t> m_wanted{0};    // 1 while who leaves has to wake one; the word to sleep on
    std::atomic<std::uint32_t> m_sleepers{0};  // threads asleep, about to be, or woken and not yet inside
};

}  // namespace basalt::platform

#endif
