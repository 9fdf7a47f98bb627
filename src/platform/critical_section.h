// Critical sections by their published names: a recursive lock for the threads of one process.
//
// Any thread may enter; the owner may enter again and must leave as often. Entering and leaving cannot
// fail. Initialisation acquires nothing from the system, so deletion gives nothing back; deleting a section
// that somebody holds is the caller's mistake, as on the real platform.
#ifndef BASALT_SRC_PLATFORM_CRITICAL_SECTION_H
#define BASALT_SRC_PLATFORM_CRITICAL_SECTION_H

#include <atomic>
#include <cstdint>

struct CRITICAL_SECTION {
    std::atomic<std::uint32_t> held{0};     // 1 while owned; the word that waiting threads sleep on
    std::atomic<std::uint32_t> waiting{0};  // threads asleep or about to be
    std::atomic<const void*> owner{nullptr};
    std::uint32_t depth = 0;  // entries of the owner; touched by the owner alone
};

namespace basalt::platform {

void wait_for_critical_section(CRITICAL_SECTION& section) noexcept;
void wake_critical_section_waiter(CRITICAL_SECTION& section) noexcept;

}  // namespace basalt::platform

inline void InitializeCriticalSection(CRITICAL_SECTION* section) {
    section->held.store(0, std::memory_order_relaxed);
    section->waiting.store(0, std::memory_order_relaxed);
    section->owner.store(nullptr, std::memory_order_relaxed);
    section->depth = 0;
}

inline void DeleteCriticalSection(CRITICAL_SECTION* section) {
    InitializeCriticalSection(section);
}

inline void EnterCriticalSection(CRITICAL_SECTION* section) {
    // The thread's control block names it; reading its address is one instruction.
    const void* const self = __builtin_thread_pointer();
    // Only this thread ever stores its own identity there, so a match needs no ordering.
    if (section->owner.load(std::memory_order_relaxed) == self) {
        ++section->depth;
        return;
    }
    if (section->held.exchange(1, std::memory_order_acquire) != 0) {
        basalt::platform::wait_for_critical_section(*section);
    }
    section->owner.store(self, std::memory_order_relaxed);
    section->depth = 1;
}

inline void LeaveCriticalSection(CRITICAL_SECTION* section) {
    if (--section->depth != 0) {
        return;
    }
    section->owner.store(nullptr, std::memory_order_relaxed);
    // A plain store and a load instead of a second locked instruction: half the price of a pair. The
    // processor may run the load before the store is seen; a thread about to sleep makes up for it with a
    // barrier on every thread of the process.
    section->held.store(0, std::memory_order_release);
    std::atomic_signal_fence(std::memory_order_seq_cst);
    if (section->waiting.load(std::memory_order_relaxed) != 0) {
        basalt::platform::wake_critical_section_waiter(*section);
    }
}

#endif
