// Critical sections by their published names: a recursive lock for the threads of one process.
//
// Any thread may enter; the owner may enter again and must leave as often. Entering and leaving cannot
// fail. Initialisation acquires nothing from the system, so deletion gives nothing back; deleting a section
// that somebody holds is the caller's mistake, as on the real platform.
#ifndef BASALT_SRC_PLATFORM_CRITICAL_SECTION_H
#define BASALT_SRC_PLATFORM_CRITICAL_SECTION_H

#include <atomic>
#include <cstdint>
#include <new>

#include "src/platform/system/leaning_lock.h"

struct CRITICAL_SECTION {
    basalt::platform::LeaningLock lock;
    std::atomic<const void*> owner{nullptr};
    std::uint32_t depth = 0;  // entries of the owner; touched by the owner alone
};

inline void InitializeCriticalSection(CRITICAL_SECTION* section) {
    new (section) CRITICAL_SECTION;
}

inline void DeleteCriticalSection(CRITICAL_SECTION* section) {
    section->~CRITICAL_SECTION();
}

inline void EnterCriticalSection(CRITICAL_SECTION* section) {
    // The thread's control block names it; reading its address is one instruction.
    const void* const self = __builtin_thread_pointer();
    // Only this thread ever stores its own identity there, so a match needs no ordering.
    if (section->owner.load(std::memory_order_relaxed) == self) {
        ++section->depth;
        return;
    }
    section->lock.lock();
    section->owner.store(self, std::memory_order_relaxed);
    section->depth = 1;
}

// 1 when the section was entered, 0 where entering would wait.
inline int TryEnterCriticalSection(CRITICAL_SECTION* section) {
    const void* const self = __builtin_thread_pointer();
    if (section->owner.load(std::memory_order_relaxed) == self) {
        ++section->depth;
        return 1;
    }
    if (!section->lock.try_lock()) {
        return 0;
    }
    section->owner.store(self, std::memory_order_relaxed);
    section->depth = 1;
    return 1;
}

inline void LeaveCriticalSection(CRITICAL_SECTION* section) {
    if (--section->depth == 0) {
        section->owner.store(nullptr, std::memory_order_relaxed);
        section->lock.unlock();
    }
}

#endif
