// What locks wait with: the system's sleep on a word, and its barrier on the threads of the process.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_WAITING_H
#define BASALT_SRC_PLATFORM_SYSTEM_WAITING_H

#include <atomic>
#include <cerrno>
#include <cstdint>
#include <ctime>

namespace basalt::platform {

// About the time of one sleep and wake-up; holders usually leave well before.
inline constexpr int SPINS = 100;

inline constexpr timespec ONE_MILLISECOND{0, 1'000'000};

// Tells the processor that this thread only waits.
inline void relax() noexcept {
#if defined(__x86_64__) || defined(__i386__)
    __builtin_ia32_pause();
#elif defined(__aarch64__)
    asm volatile("yield");
#endif
}

// Sleeps while the word has this value: until a wake-up, until the period is over (null: for good), or for no
// reason.
void sleep_on(std::atomic<std::uint32_t>& word, std::uint32_t value, const timespec* period) noexcept;
void wake_one_on(std::atomic<std::uint32_t>& word) noexcept;

// Whatever each running thread of the process wrote before is seen, and what it reads after is fresh. False
// where the system has no such barrier.
bool barrier_on_all_threads() noexcept;

// The calls above change errno; a lock must not.
class ErrnoSaver {
public:
    ErrnoSaver() noexcept : m_before(errno) {}
    ~ErrnoSaver() { errno = m_before; }
    ErrnoSaver(const ErrnoSaver&) = delete;
    ErrnoSaver& operator=(const ErrnoSaver&) = delete;

private:
    int m_before;
};

}  // namespace basalt::platform

#endif
