// Allocation failures on demand: the program's operator new fails at a chosen call.
#ifndef BASALT_TESTS_SUPPORT_FAILING_NEW_H
#define BASALT_TESTS_SUPPORT_FAILING_NEW_H

namespace basalt::test {

inline constinit thread_local bool failures_are_paused = false;  // no call of any kind fails meanwhile

// Which calls of a kind fail, on this thread.
struct Countdown {
    long calls_left = 0;  // until one fails; 0: none will
    bool stays = false;   // every later call fails too
    bool has_failed = false;

    // Whether the present call has to fail.
    bool fails() {
        if (failures_are_paused || !(has_failed ? stays : calls_left > 0 && --calls_left == 0)) {
            return false;
        }
        return has_failed = true;
    }
};
inline constinit thread_local Countdown allocations;
inline constinit thread_local long live_blocks = 0;

}  // namespace basalt::test

// While one lives, the nth operator new call of this thread (counted from 1) fails, and with `forever` every
// later one too. Every form counts: plain, array, aligned, nothrow. The guards do not nest. Assertions of the
// test framework allocate, so end the guard before asserting.
struct FailAllocation {
    explicit FailAllocation(long nth, bool forever = false) { basalt::test::allocations = {nth, forever}; }
    ~FailAllocation() { basalt::test::allocations = {}; }
    FailAllocation(const FailAllocation&) = delete;
    FailAllocation& operator=(const FailAllocation&) = delete;

    // True once an allocation has been made to fail: a loop over n = 1, 2, 3, ... ends when this stays false.
    static bool fired() { return basalt::test::allocations.has_failed; }
};

// Blocks from operator new that this thread has taken and not given back (below zero when it gives back the
// blocks of others). Equal readings: nothing leaked in between.
inline long live_allocations() {
    return basalt::test::live_blocks;
}

#endif
