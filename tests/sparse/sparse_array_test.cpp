// Facts about the sparse array; random calls against its model are fuzz/sparse.
#include <gtest/gtest.h>

#include <climits>
#include <new>
#include <stdexcept>
#include <utility>

#include "tests/sparse/visit_recorder.h"
#include "tests/support/failing_new.h"
#include "tests/support/sparse_inspector.h"

namespace vex_util::testing {
namespace {

TEST(SparseArray, ReachesTheCornersOfThePlane) {
    for (const std::size_t side : {1U, 2U, 16U, 128U}) {
        SCOPED_TRACE(side);
        Sparse2DArray array(8, side, 8);
        for (const int x : {INT_MIN, INT_MAX}) {
            for (const int y : {INT_MIN, INT_MAX}) {
                insert_value(array, x, y, 7);
                EXPECT_TRUE(select(array, x, y, x, y));
                EXPECT_EQ(visits(array, false), (Visits{{x, y, 7}}));
                EXPECT_EQ(std::as_const(array).Find(x, y), array.Find(x, y));
            }
        }
        check_invariants(array);
    }
}

TEST(SparseArray, SizesBeyondTheAddressSpaceAreOutOfMemory) {
    constexpr std::pair<std::size_t, std::size_t> ROWS[] = {
        {8, std::size_t{1} << 31}, {8, std::size_t{1} << 32}, {8, SIZE_MAX}, {SIZE_MAX / 2, 16}};
    for (const auto& [element, side] : ROWS) {
        Sparse2DArray array(element, side, 3);
        EXPECT_THROW(insert_value(array, -1, 1, 1), std::bad_alloc);
        EXPECT_EQ(array.Find(-1, 1), nullptr);
        EXPECT_FALSE(array.IsSelectionDirty() || select(array, INT_MIN, INT_MIN, INT_MAX, INT_MAX));
    }
}

TEST(SparseArray, SelectsASquareOfBlocksInTheOrderOfTheTree) {
    Sparse2DArray array(8, 16, 64);
    for (int i = 0; i < 25; ++i) {
        insert_value(array, 16 * (i % 5), 16 * (i / 5), static_cast<std::uint64_t>(i));
    }
    const auto selected = [&](int min, int max) {
        std::vector<int> values;
        EXPECT_TRUE(select(array, min, min, max, max));
        visit(array, false,
              [&](const Visited& v) { return values.push_back(static_cast<int>(v.value)), true; });
        return values;
    };
    EXPECT_EQ(selected(0, 79), (std::vector<int>{2,  3,  4,  7,  8,  0,  1,  5,  6,  10, 9,  12, 13,
                                                 14, 11, 15, 16, 20, 21, 22, 17, 18, 19, 23, 24}));
    EXPECT_EQ(selected(20, 40), (std::vector<int>{7, 6, 12, 11}));
}

TEST(SparseArray, RemoveAllReleasesAllMemory) {
    Sparse2DArray array(8, 4, 4);
    const long live = live_allocations();
    for (int i = 0; i < 1000; ++i) {
        insert_value(array, i * 37, i, 1);
    }
    EXPECT_GT(live_allocations(), live);
    array.RemoveAll();
    EXPECT_EQ(live_allocations(), live);
}

TEST(SparseArray, AVisitorsExceptionPropagatesAndReleasesTheLock) {
    Sparse2DArray array(8, 4, 4);
    insert_value(array, 0, 0, 1);
    const Visitor fail = [](const Visited&) -> bool { throw std::runtime_error("visitor"); };
    EXPECT_THROW(visit(array, true, fail), std::runtime_error);
    EXPECT_EQ(visits(array, true).size(), 1U);
}

}  // namespace
}  // namespace vex_util::testing
