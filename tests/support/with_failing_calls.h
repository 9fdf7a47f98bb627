// Makes each call of the system that a test makes fail in turn.
#ifndef BASALT_TESTS_SUPPORT_WITH_FAILING_CALLS_H
#define BASALT_TESTS_SUPPORT_WITH_FAILING_CALLS_H

#include <gtest/gtest.h>

#include "tests/support/system_failures.h"

namespace basalt::test {

// Calls act() with its nth call failing, for n = 1, 2, 3, ... until none fails, and check(struck) after each:
// first with one failure, then with all from the nth on.
template <class Act, class Check>
void with_failing_calls(Act act, Check check) {
    for (const auto then : {SystemFailure::Then::RECOVERS, SystemFailure::Then::STAYS}) {
        bool struck = true;
        for (int nth = 1; struck; ++nth) {
            SCOPED_TRACE(testing::Message() << "call " << nth);
            {
                const SystemFailure failure(nth, then);
                act();
                struck = SystemFailure::struck();
            }
            check(struck);
        }
    }
}

}  // namespace basalt::test

#endif
