// Each allocation of an act made to fail in turn.
#ifndef BASALT_TESTS_SUPPORT_WITH_FAILING_ALLOCATIONS_H
#define BASALT_TESTS_SUPPORT_WITH_FAILING_ALLOCATIONS_H

#include <gtest/gtest.h>

#include <new>

#include "tests/support/failing_new.h"

// Calls act() with its nth allocation failing, for n = 1, 2, 3, ... until none fails, and check(fired) after
// each; answers how many failed. std::bad_alloc ends an act(). What it takes has to be back after the check.
template <class Act, class Check>
long with_failing_allocations(Act act, Check check) {
    for (long nth = 1;; ++nth) {
        SCOPED_TRACE(testing::Message() << "allocation " << nth);
        const long live = live_allocations();
        bool fired = false;
        {
            const FailAllocation failure(nth);
            try {
                act();
            } catch (const std::bad_alloc&) {
            }
            fired = failure.fired();
        }
        check(fired);
        EXPECT_EQ(live_allocations(), live);
        if (!fired) {
            return nth - 1;
        }
    }
}

#endif
