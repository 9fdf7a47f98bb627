// The recursive lock of a sparse array, and scopes that hold it.
#ifndef BASALT_SRC_SPARSE_CRITICAL_SECTION_WRAPPER_H
#define BASALT_SRC_SPARSE_CRITICAL_SECTION_WRAPPER_H

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

// Holds the lock from construction to destruction.
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

// Holds two locks from construction to destruction. It releases the one before it blocks on the other, so
// threads that lock the same two in any order cannot deadlock, even if one of them held a lock before.
class AutoCriticalSectionPair {
public:
    AutoCriticalSectionPair(CriticalSectionWrapper& a, CriticalSectionWrapper& b)
        : m_first(&a), m_second(&b) {
        m_first->Enter();
        while (!m_second->TryEnter()) {
            m_first->Leave();
            std::swap(m_first, m_second);
            m_first->Enter();
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
