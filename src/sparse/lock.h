// The recursive lock of a sparse array and its scope.
#ifndef BASALT_SRC_SPARSE_LOCK_H
#define BASALT_SRC_SPARSE_LOCK_H

#include <utility>

#include "src/platform/critical_section.h"

namespace vex_util {

class CriticalSectionWrapper {
public:
    CriticalSectionWrapper() { InitializeCriticalSection(&m_section); }
    virtual ~CriticalSectionWrapper() { DeleteCriticalSection(&m_section); }
    CriticalSectionWrapper(const CriticalSectionWrapper&) = delete;
    CriticalSectionWrapper& operator=(const CriticalSectionWrapper&) = delete;

    void Enter() { EnterCriticalSection(&m_section); }
    bool TryEnter() { return TryEnterCriticalSection(&m_section) != 0; }
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

// Holds two locks from construction to destruction. It never waits for one while it has just entered the
// other: threads that lock the same two in any order do not wait for each other, not even where one of them
// had a lock before, as the visitor of an array has.
class AutoCriticalSectionPair {
public:
    AutoCriticalSectionPair(CriticalSectionWrapper& a, CriticalSectionWrapper& b)
        : m_first(&a), m_second(&b) {
        m_first->Enter();
        while (!m_second->TryEnter()) {
            m_first->Leave();
            std::swap(m_first, m_second);
            m_first->Enter();  // the one that was held
        }
    }
    ~AutoCriticalSectionPair() {
        m_second->Leave();
        m_first->Leave();
    }
    AutoCriticalSectionPair(const AutoCriticalSectionPair&) = delete;
    AutoCriticalSectionPair& operator=(const AutoCriticalSectionPair&) = delete;

private:
    CriticalSectionWrapper* m_first;
    CriticalSectionWrapper* m_second;
};

}  // namespace vex_util

#endif
