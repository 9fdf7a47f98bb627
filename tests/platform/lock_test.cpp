#include "src/platform/lock.h"

#include <gtest/gtest.h>

#include <mutex>
#include <thread>
#include <vector>

namespace {

using basalt::platform::Lock;

constinit Lock before_any_constructor;

TEST(Lock, LetsOneThreadInAtATimeAndWakesTheSleepers) {
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

}  // namespace
