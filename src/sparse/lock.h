// The recursive lock of a sparse array and its scope.
#ifndef BASALT_SRC_SPARSE_LOCK_H
#define BASALT_SRC_SPARSE_LOCK_H

#include "src/platform/critical_section.h"

namespace vex_util {

class CriticalSectionWrapper {
public:
    CriticalSectionWrapper() { InitializeCriticalSection(&m_section); }
    virtual ~CriticalSectionWrapper() { DeleteCriticalSection(&m_section); }
    CriticalSectionWrapper(const CriticalSectionWrapper&) = delete;
    CriticalSectionWrapper& operator=(const CriticalSectionWrapper&) = delete;

    void Enter() { EnterCriticalSection(&m_section); }
    void Leave() { LeaveCriticalSection(&m_section); }

private:
    CRITICAL_SECTION m_section;
};

// Holds the lock from construction to destruction, on every way out.
class AutoCriticalSection {
public:
    explicit AutoCriticalSection(CriticalSectionWrapper& section) : m_section(&section) {
        m_section->Enter();
    }
    virtual ~AutoCriticalSection() { m_section->Leave(); }
    AutoCriticalSection(const AutoCriticalSection&) = delete;
    AutoCriticalSection& operator=(const AutoCriticalSection&) = delete;

private:
    CriticalSectionWrapper* m_section;
};

}  // namespace vex_util

#endif
