// Makes system calls fail on purpose (linked with --wrap for each in system_failures.cpp).
#ifndef BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H
#define BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H

#include <atomic>

#include "tests/support/failing_new.h"

namespace basalt::test {

inline constinit thread_local Countdown system_calls;
inline constinit thread_local int system_error = 0;  // the errno value of a failure; 0: usual for the call

// While alive, the n-th call from now on (n = 1, 2, ...) of this thread fails, and with STAYS those after it
// too: with the errno value given, or one that is usual for the call.
class SystemFailure {
public:
    enum class Then { RECOVERS, STAYS };
    explicit SystemFailure(int nth, Then then = Then::RECOVERS, int number = 0) {
        system_calls = {nth, then == Then::STAYS};
        system_error = number;
    }
    ~SystemFailure() { system_calls = {0, false, struck()}; }
    SystemFailure(const SystemFailure&) = delete;
    SystemFailure& operator=(const SystemFailure&) = delete;
    static bool struck() { return system_calls.has_failed; }  // whether a call was made to fail
};

inline std::atomic<long> bytes_mapped{0};  // less those unmapped
inline std::atomic<long> bytes_kept{0};    // made to stay mapped
inline std::atomic<long> files_kept{0};    // made to stay: calls of stat and unlink that failed

}  // namespace basalt::test

#endif
