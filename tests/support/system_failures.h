// Makes system calls fail on purpose (linked with --wrap for mmap, mremap, munmap and madvise).
#ifndef BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H
#define BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H

namespace basalt::test {

// While alive, the n-th call from now on (n = 1, 2, ...) of this thread fails, and those after it too when
// so asked.
class SystemFailure {
public:
    enum class Then { RECOVERS, STAYS };
    explicit SystemFailure(int nth, Then then = Then::RECOVERS);
    ~SystemFailure();
    SystemFailure(const SystemFailure&) = delete;
    SystemFailure& operator=(const SystemFailure&) = delete;
    static bool struck();  // whether a call was made to fail
};

// Bytes mapped minus bytes unmapped by this program through the calls above.
long mapped_balance();

}  // namespace basalt::test

#endif
