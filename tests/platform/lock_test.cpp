#include "src/platform/system/lock.h"
#include "src/platform/system/leaning_lock.h"

#include <gtest/gtest.h>
#include <linux/membarrier.h>
#include <sys/syscall.h>

#include <atomic>
#include <cerrno>
#include <chrono>
#include <cstdarg>
#include <mutex>
#include <thread>

#include "tests/support/threads.h"

namespace {

using basalt::platform::LeaningLock;
using basalt::platform::Lock;

constinit Lock before_any_constructor;
std::atomic<bool> without_barrier{false};
std::atomic<int> barriers{0};

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
    barriers += number == SYS_membarrier && a[0] == MEMBARRIER_CMD_PRIVATE_EXPEDITED ? 1 : 0;
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
    basalt::test::run_threads(THREADS, [&](int) {
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
    });
    EXPECT_EQ(entered, THREADS * ROUNDS);
    EXPECT_EQ(refused, THREADS * ROUNDS) << "not recursive";
    EXPECT_TRUE(before_any_constructor.try_lock());
    before_any_constructor.unlock();
}

// Entries in a row after which a thread is the favourite for sure, whatever came before.
constexpr int LONG_RUN = 100'000;

void enter_alone(LeaningLock& lock, int times) {
    for (int i = 0; i < times; ++i) {
        const std::lock_guard guard(lock);
    }
}

TEST_P(LockTest, FavouriteAndOthersAreNeverInsideTogether) {
    // Each lock ends its favour once at the start and a few times later; the race is in that moment.
    for (int round = 0; round < 100; ++round) {
        LeaningLock lock;
        std::atomic<bool> others_wait{false};
        std::atomic<int> left{2};
        long counter = 0;
        long entered[2] = {};
        std::thread favourite([&] {
            enter_alone(lock, LONG_RUN / 50);
            others_wait = true;
            while (left != 0) {
                const std::lock_guard guard(lock);
                counter = counter + 1;
                ++entered[0];
            }
        });
        while (!others_wait) {
            std::this_thread::yield();
        }
        for (; left != 0; --left) {
            const std::lock_guard guard(lock);
            counter = counter + 1;
            ++entered[1];
        }
        favourite.join();
        ASSERT_EQ(counter, entered[0] + entered[1]) << "round " << round;
    }
}

TEST_P(LockTest, TryingNeverWaitsAndNeverLetsTwoIn) {
    for (int round = 0; round < 20; ++round) {
        LeaningLock lock;
        std::atomic<bool> is_favourite{false};
        std::atomic<bool> over{false};
        long counter = 0;
        long entered[2] = {};
        std::thread favourite([&] {
            enter_alone(lock, LONG_RUN / 50);
            {
                const std::lock_guard guard(lock);
                is_favourite = true;
                while (!over) {
                    std::this_thread::yield();
                }
                over = false;
            }
            while (!over) {
                if (const std::unique_lock guard(lock, std::try_to_lock); guard) {
                    counter = counter + 1;
                    ++entered[0];
                }
            }
        });
        while (!is_favourite) {
            std::this_thread::yield();
        }
        for (int look = 0; look < 2; ++look) {  // the first one ends no favour
            const std::unique_lock guard(lock, std::try_to_lock);
            EXPECT_FALSE(guard.owns_lock());
        }
        over = true;
        while (entered[1] < 100) {
            if (const std::unique_lock guard(lock, std::try_to_lock); guard) {
                counter = counter + 1;
                ++entered[1];
            }
        }
        over = true;
        favourite.join();
        ASSERT_EQ(counter, entered[0] + entered[1]) << "round " << round;
    }
}

TEST_P(LockTest, EveryThreadCanBecomeTheFavouriteInTurn) {
    LeaningLock lock;
    long counter = 0;
    constexpr int THREADS = 8;  // more than a lock has favourites in its life
    const int barriers_before = barriers;
    for (int i = 0; i < THREADS; ++i) {
        std::thread([&] {
            enter_alone(lock, LONG_RUN);
            const std::lock_guard guard(lock);
            ++counter;
        }).join();
    }
    EXPECT_EQ(counter, THREADS);
    EXPECT_EQ(barriers > barriers_before, !GetParam()) << "no favour without one";
}

// The favourite sleeps inside while another thread comes; before that it calls once_inside.
template <class Call>
void expect_the_other_waits_for_the_favourite(Call once_inside) {
    LeaningLock lock;
    std::atomic<bool> inside{false};
    std::atomic<bool> left{false};
    std::thread favourite([&] {
        enter_alone(lock, LONG_RUN);
        const std::lock_guard guard(lock);
        once_inside();
        inside = true;
        std::this_thread::sleep_for(std::chrono::milliseconds(30));  // the other is long past spinning
        left = true;
    });
    while (!inside) {
        std::this_thread::yield();
    }
    {
        const std::lock_guard guard(lock);
        EXPECT_TRUE(left);
    }
    favourite.join();
}

TEST_P(LockTest, WhoeverWaitsForAFavouriteAsleepInsideIsWoken) {
    expect_the_other_waits_for_the_favourite([] {});
}

// A process may lose the call between the favour and its end, by a filter of system calls.
TEST(LeaningLockTest, FavourEndsAlsoWhereTheBarrierHasGoneMeanwhile) {
    expect_the_other_waits_for_the_favourite([] { without_barrier = true; });
    without_barrier = false;
}

INSTANTIATE_TEST_SUITE_P(WithAndWithoutBarrier, LockTest, testing::Bool());

}  // namespace
