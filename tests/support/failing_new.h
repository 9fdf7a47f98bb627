// Allocation failures on demand: the test program's operator new fails at a chosen call.
#ifndef BASALT_TESTS_SUPPORT_FAILING_NEW_H
#define BASALT_TESTS_SUPPORT_FAILING_NEW_H

// While one lives, the nth operator new call of this thread (counted from 1) fails, and with `forever` every
// later one too. Every form counts: plain, array, aligned, nothrow. The guards do not nest. Assertions of the
// test framework allocate, so end the guard before asserting.
struct FailAllocation {
    explicit FailAllocation(long nth, bool forever = false);
    ~FailAllocation();
    FailAllocation(const FailAllocation&) = delete;
    FailAllocation& operator=(const FailAllocation&) = delete;

    // True once an allocation has been made to fail: a loop over n = 1, 2, 3, ... ends when this stays false.
    bool fired() const;
};

namespace basalt::test {
inline constinit thread_local bool failures_are_paused = false;  // no call of any kind fails meanwhile
}

// Blocks from operator new that this thread has taken and not given back (below zero when it gives back the
// blocks of others). Two readings that agree say that nothing leaked in between.
long live_allocations();

#endif
