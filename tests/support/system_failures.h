// Makes system calls fail on purpose (linked with --wrap): mmap, mremap, munmap, madvise, mprotect, open,
// fcntl, fstat, posix_fallocate, statx, opendir, readdir.
#ifndef BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H
#define BASALT_TESTS_SUPPORT_SYSTEM_FAILURES_H

namespace basalt::test {

// While alive, the n-th call from now on (n = 1, 2, ...) of this thread fails, and those after it too when
// so asked: with the errno value given, or one that is usual for the call.
class SystemFailure {
public:
    enum class Then { RECOVERS, STAYS };
    explicit SystemFailure(int nth, Then then = Then::RECOVERS, int number = 0);
    ~SystemFailure();
    SystemFailure(const SystemFailure&) = delete;
    SystemFailure& operator=(const SystemFailure&) = delete;
    static bool struck();  // whether a call was made to fail
};

// For further calls that a program wraps: whether this one has to fail; errno is set then, to the value
// chosen or else to this one.
bool system_call_fails(int number);

// Bytes that were made to stay mapped.
long refused_to_unmap();

// Bytes mapped minus bytes unmapped by this program through the calls above.
long mapped_balance();

}  // namespace basalt::test

#endif
