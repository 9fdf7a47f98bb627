#include "src/platform/system/lock.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <mutex>
#include <thread>

#include "tests/support/threads.h"

namespace {

using basalt::platform::Lock;
using basalt::platform::RecursiveLock;

constinit Lock before_any_constructor;

template <class AnyLock>
void expect_one_thread_inside(AnyLock& lock) {
    constexpr int THREADS = 4, ROUNDS = 20'000;
    int inside = 0, entered = 0;
    basalt::test::run_threads(THREADS, [&](int thread) {
        for (int round = 0; round < ROUNDS; ++round) {
            std::unique_lock guard(lock, std::defer_lock);
            errno = 17;
            thread % 2 == 0 || round % 4 == 0 ? guard.lock() : void();
            while (!guard.owns_lock() && !guard.try_lock()) {
                std::this_thread::yield();
            }
            ASSERT_EQ(errno, 17);
            ASSERT_EQ(++inside, 1);
            round % 16 == 0 ? std::this_thread::yield() : void();  // held for long: the others go to sleep
            --inside, ++entered;
        }
    });
    EXPECT_EQ(entered, THREADS * ROUNDS);
}

TEST(Lock, admits_one_thread_at_a_time_and_keeps_errno) {
    expect_one_thread_inside(before_any_constructor);
    RecursiveLock recursive;
    expect_one_thread_inside(recursive);
}

TEST(Lock, only_the_recursive_one_admits_its_owner_again) {
    RecursiveLock recursive;
    recursive.lock(), recursive.lock();
    EXPECT_TRUE(recursive.try_lock());
    const std::lock_guard guard(before_any_constructor);
    EXPECT_FALSE(before_any_constructor.try_lock());
    for (int left = 3; left >= 0; --left) {
        bool other_entered = false;
        std::thread([&] { other_entered = recursive.try_lock() && (recursive.unlock(), true); }).join();
        EXPECT_EQ(other_entered, left == 0) << left;
        left > 0 ? recursive.unlock() : void();
    }
}

}  // namespace
