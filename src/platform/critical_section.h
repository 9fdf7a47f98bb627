// Critical sections by their Win32 names: a recursive lock for the threads of one process.
//
// Any thread may enter; the owner may enter again and must leave as often. Entering and leaving cannot fail.
// Initialisation acquires nothing from the system. Deleting a section that a thread holds is undefined, as
// in Win32.
#ifndef BASALT_SRC_PLATFORM_CRITICAL_SECTION_H
#define BASALT_SRC_PLATFORM_CRITICAL_SECTION_H

#include <new>

#include "src/platform/system/lock.h"

struct CRITICAL_SECTION {
    basalt::platform::RecursiveLock lock;
};

inline void InitializeCriticalSection(CRITICAL_SECTION* section) {
    new (section) CRITICAL_SECTION;
}

inline void DeleteCriticalSection(CRITICAL_SECTION* section) {
    section->~CRITICAL_SECTION();
}

inline void EnterCriticalSection(CRITICAL_SECTION* section) {
    section->lock.lock();
}

// 1 when the section was entered, 0 where entering would wait.
inline int TryEnterCriticalSection(CRITICAL_SECTION* section) {
    return section->lock.try_lock() ? 1 : 0;
}

inline void LeaveCriticalSection(CRITICAL_SECTION* section) {
    section->lock.unlock();
}

#endif
