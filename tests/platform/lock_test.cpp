#include "src/platform/lock.h"

#include <gtest/gtest.h>
#include <sys/syscall.h>

#include <atomic>
#include <cerrno>
#include <cstdarg>
#include <mutex>
#include <thread>
#include <vector>

namespace {

using basalt::platform::Lock;

constinit Lock before_any_constructor;
std::atomic<bool> without_barrier{false};

}  // namespace

// A system that has no process-wide barrier, on demand (the linker's --wrap).
extern "C" {
long __real_syscall(long number, ...);
long __wrap_syscall(long number, ...) {
    if (number == SYS_membarrier && without_barrier) {
        errno = ENOSYS;
        return -1;
    }
    va_list list;
    va_start(list, number);
    long a[6];
    for (long& argument : a) {
        argument = va_arg(list, long);
    }
    va_end(list);
    return __real_syscall(number, a[0], a[1], a[2], a[3], a[4], a[5]);
}
}

namespace {

class LockTest : public testing::TestWithParam<bool> {
protected:
    void SetUp() override { without_barrier = GetParam(); }
    void TearDown() override { without_barrier = false; }
};

TEST_P(LockTest, LetsOneThreadInAtATimeAndWakesTheSleepers) {
    constexpr int THREADS = 4;
    constexpr int ROUNDS = 20'000;
    int inside = 0;
    int entered = 0;
    int refused = 0;
    const auto work = [&] {
        for (int round = 0; round < ROUNDS; ++round) {
            const std::lock_guard guard(before_any_constructor);
            EXPECT_EQ(++inside, 1);
            refused += before_any_constructor.try_lock() ? 0 : 1;
            if (round % 16 == 0) {
                std::this_thread::yield();  // held for long: the others go to sleep
            }
            --inside;
            ++entered;
        }
    };
    std::vector<std::thread> threads;
    for (int i = 0; i < THREADS; ++i) {
        threads.emplace_back(work);
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(entered, THREADS * ROUNDS);
    EXPECT_EQ(refused, THREADS * ROUNDS) << "not recursive";
    EXPECT_TRUE(before_any_constructor.try_lock());
    before_any_constructor.unlock();
}

INSTANTIATE_TEST_SUITE_P(WithAndWithoutBarrier, LockTest, testing::Bool());

}  // namespace
