// Makes system calls fail on purpose (linked with --wrap for each in system_failures.cpp).
#ifndef BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H
#define BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H

namespace basalt::test {

// While alive, the n-th call from now on (n = 1, 2, ...) of this thread fails, and with STAYS those after it
// too: with the errno value given, or one that is usual for the call.
class SystemFailure {
public:
    enum class Then { RECOVERS, STAYS };
    explicit SystemFailure(int nth, Then then = Then::RECOVERS, int number = 0);
    ~SystemFailure();
    SystemFailure(const SystemFailure&) = delete;
    SystemFailure& operator=(const SystemFailure&) = delete;
    static bool struck();  // whether a call was made to fail
};

// Bytes that were made to stay mapped.
long refused_to_unmap();

// Bytes mapped minus bytes unmapped by this program through these calls.
long mapped_balance();

// Files that were made to stay: calls of stat and unlink that failed.
long files_made_to_stay();

}  // namespace basalt::test

#endif
