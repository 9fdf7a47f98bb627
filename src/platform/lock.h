// Mutex of one word, for locks that are taken millions of times a second and seldom fought over.
#ifndef BASALT_SRC_PLATFORM_LOCK_H
#define BASALT_SRC_PLATFORM_LOCK_H

#include <atomic>
#include <cstdint>

namespace basalt::platform {

// Not recursive. Usable before any constructor has run and never needs tearing down, so it may live in
// static storage and in memory that is zero. Used through std::lock_guard and std::unique_lock.
// Uncontended, taking and releasing cost one atomic exchange each and no call.
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

    bool try_lock() noexcept {
        std::uint32_t expected = FREE;
        return m_state.compare_exchange_strong(expected, HELD, std::memory_order_acquire,
                                               std::memory_order_relaxed);
    }

    void unlock() noexcept {
        if (m_state.exchange(FREE, std::memory_order_release) == AWAITED) {
            wake_one();
        }
    }

private:
    static constexpr std::uint32_t FREE = 0;
    static constexpr std::uint32_t HELD = 1;
    static constexpr std::uint32_t AWAITED = 2;  // held, and some thread may sleep on it

    void lock_contended() noexcept;
    void wake_one() noexcept;

    std::atomic<std::uint32_t> m_state{FREE};
};

}  // namespace basalt::platform

#endif
