// Threads on one array, on two, and on the lock itself. Their findings are those of the thread sanitizer as
// well.
#include <gtest/gtest.h>

#include <array>
#include <atomic>
#include <thread>

#include "src/sparse/lock.h"
#include "tests/sparse/array_inspection.h"
#include "tests/sparse/visit_recorder.h"
#include "tests/support/threads.h"

namespace vex_util::testing {
namespace {

using basalt::test::run_threads;

TEST(Lock, AdmitsOneThreadAtATimeAndItsOwnerAgain) {
    CriticalSectionWrapper section;
    long counter = 0;
    run_threads(4, [&](int) {
        for (int i = 0; i < 20000; ++i) {
            const AutoCriticalSection once(section);
            const AutoCriticalSection again(section);
            counter = counter + 1;
        }
    });
    EXPECT_EQ(counter, 80000);
}

TEST(SparseArrayThreads, ShareOneArray) {
    Sparse2DArray array(16, 8, 16);
    constexpr int CELLS = 64;
    run_threads(4, [&](int thread) {
        std::array<std::uint64_t, 2> element = {0, 0};
        for (int round = 0; round < 60; ++round) {
            for (int i = 0; i < CELLS; ++i) {
                element = {static_cast<std::uint64_t>(i), ~static_cast<std::uint64_t>(i)};
                array.Insert(i, thread, element.data());
            }
            select(array, 0, 0, CELLS, 4);
            const Visitor whole = [](const Visited& v) {
                EXPECT_EQ(v.value, static_cast<std::uint64_t>(v.x));
                return true;
            };
            array.IterateSelected(call_visitor, &whole);
            for (int i = 0; i < CELLS; i += 2) {
                EXPECT_TRUE(array.Remove(i, thread));
            }
            array.SetSelectionDirty(array.IsSelectionDirty());
        }
    });
    check_invariants(array);
    EXPECT_EQ(visit_all(array).size(), 4U * CELLS / 2);
}

TEST(SparseArrayThreads, AssignTwoArraysToEachOther) {
    Sparse2DArray a(8, 4, 4);
    Sparse2DArray b(8, 8, 4);
    for (int i = 0; i < 20; ++i) {
        insert_value(a, i, 0, 1);
        insert_value(b, 0, i, 2);
    }
    run_threads(4, [&](int thread) {
        for (int round = 0; round < 300; ++round) {
            if (thread % 2 == 0) {
                a = b;
            } else {
                b = a;
            }
            insert_value(thread % 2 == 0 ? a : b, round % 20, 3, 3);
        }
    });
    check_invariants(a);
    check_invariants(b);
}

// The visitor holds one lock throughout, so the thread that assigns the other way may not hold the other.
TEST(SparseArrayThreads, AssignInAVisitAgainstAnotherThread) {
    Sparse2DArray arrays[2] = {{8, 4, 4}, {8, 4, 4}};
    for (const int visited : {0, 1}) {
        Sparse2DArray& from = arrays[visited];
        Sparse2DArray& to = arrays[1 - visited];
        insert_value(from, 1, 1, 1);
        for (int round = 0; round < 20; ++round) {
            std::thread other;
            const Visitor assign = [&](const Visited&) {
                other = std::thread([&] { from = to; });
                std::this_thread::sleep_for(std::chrono::milliseconds(round < 3 ? 20 : 0));
                to = from;
                return false;
            };
            from.IterateAll(call_visitor, &assign);
            other.join();
            ASSERT_NE(from.Find(1, 1), nullptr);
        }
    }
}

TEST(SparseArrayThreads, AVisitKeepsOthersWaiting) {
    Sparse2DArray array(8, 4, 4);
    insert_value(array, 0, 0, 1);
    insert_value(array, 1, 0, 1);
    std::atomic<bool> inserted{false};
    std::thread other;
    const Visitor slow = [&](const Visited& v) {
        if (v.x == 0) {
            other = std::thread([&] {
                insert_value(array, 2, 0, 1);
                inserted = true;
            });
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
        }
        EXPECT_FALSE(inserted);
        return true;
    };
    array.IterateAll(call_visitor, &slow);
    other.join();
    EXPECT_NE(array.Find(2, 0), nullptr);
}

}  // namespace
}  // namespace vex_util::testing
