// Mutexes for locks that are taken millions of times a second and seldom contended.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_LOCK_H
#define BASALT_SRC_PLATFORM_SYSTEM_LOCK_H

#include <atomic>
#include <cstdint>

namespace basalt::platform {

// Not recursive. Constant-initialised and trivially destructible, so it may live in static storage and in
// zeroed memory. Used through std::lock_guard and std::unique_lock. Does not change errno.
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
        // processor may run the load before the store is visible and so miss a new waiter; waiters
        // therefore sleep for a limited time only.
        m_held.store(0, std::memory_order_release);
        std::atomic_signal_fence(std::memory_order_seq_cst);
        if (m_wanted.load(std::memory_order_relaxed) != 0) {
            wake_one();
        }
    }

private:
    void lock_contended() noexcept;
    bool spin() noexcept;
    void wake_one() noexcept;

    std::atomic<std::uint32_t> m_held{0};      // 1 while held
    std::atomic<std::uint32_t> m_wanted{0};    // 1 while unlock() has to wake a waiter; waiters sleep on it
    std::atomic<std::uint32_t> m_sleepers{0};  // threads asleep, about to be, or woken and not yet inside
};

// The same for a thread that may enter again; it leaves as often as it entered.
class RecursiveLock {
public:
    void lock() noexcept {
        if (!enter_again()) {
            m_lock.lock();
            own();
        }
    }

    bool try_lock() noexcept {
        if (enter_again()) {
            return true;
        }
        if (!m_lock.try_lock()) {
            return false;
        }
        own();
        return true;
    }

    void unlock() noexcept {
        if (--m_depth == 0) {
            m_owner.store(nullptr, std::memory_order_relaxed);
            m_lock.unlock();
        }
    }

private:
    // The address of the thread's control block identifies it and is read by one instruction.
    static const void* this_thread() noexcept { return __builtin_thread_pointer(); }

    bool enter_again() noexcept {
        // Only this thread ever stores its own identity there, so a match needs no ordering.
        if (m_owner.load(std::memory_order_relaxed) != this_thread()) {
            return false;
        }
        ++m_depth;
        return true;
    }

    void own() noexcept {
        m_owner.store(this_thread(), std::memory_order_relaxed);
        m_depth = 1;
    }

    Lock m_lock;
    std::uint32_t m_depth = 0;  // entries of the owner; accessed by the owner only
    std::atomic<const void*> m_owner{nullptr};
};

}  // namespace basalt::platform

#endif
