// Facts about the sparse array; random calls against its model are fuzz/sparse.
#include <gtest/gtest.h>

#include <climits>
#include <new>
#include <stdexcept>

#include "tests/sparse/visit_recorder.h"
#include "tests/support/sparse_inspector.h"

namespace vex_util::testing {
namespace {

TEST(SparseArray, ReachesTheCornersOfThePlane) {
    for (const std::size_t side : {1U, 2U, 16U, 128U}) {
        SCOPED_TRACE(side);
        Sparse2DArray array(8, side, 8);
        for (const auto& [x, y] :
             {std::pair{INT_MIN, INT_MIN}, {INT_MAX, INT_MIN}, {INT_MIN, INT_MAX}, {INT_MAX, INT_MAX}}) {
            insert_value(array, x, y, 7);
            EXPECT_TRUE(select(array, x, y, x, y));
            EXPECT_EQ(visits(array, false), (Visits{{x, y, 7}}));
        }
        check_invariants(array);
    }
}

TEST(SparseArray, SmallElementsCountAsEightBytes) {
    for (std::size_t requested = 0; requested < 8; ++requested) {
        Sparse2DArray array(requested, 4, 2);
        insert_value(array, 0, 0, 0x1122334455667788U);
        insert_value(array, 1, 0, 0x99AABBCCDDEEFF00U);
        EXPECT_EQ(value_at(array.Find(0, 0)), 0x1122334455667788U);
        EXPECT_EQ(static_cast<char*>(array.Find(0, 0)) - static_cast<char*>(array.Find(1, 0)), 8);
    }
}

TEST(SparseArray, SizesBeyondTheAddressSpaceAreOutOfMemory) {
    constexpr std::size_t TABLE[][2] = {
        {8, std::size_t{1} << 31}, {8, std::size_t{1} << 32}, {8, SIZE_MAX}, {SIZE_MAX / 2, 16}};
    for (const auto& [element, side] : TABLE) {
        Sparse2DArray array(element, side, 3);
        EXPECT_THROW(insert_value(array, -1, 1, 1), std::bad_alloc);
        EXPECT_EQ(array.Find(-1, 1), nullptr);
        EXPECT_FALSE(array.IsSelectionDirty() || select(array, INT_MIN, INT_MIN, INT_MAX, INT_MAX));
    }
}

TEST(SparseArray, FindsInAConstantArrayAndKeepsAddresses) {
    Sparse2DArray array(8, 4, 4);
    insert_value(array, 2, 3, 1);
    const Sparse2DArray& constant = array;
    const void* const element = constant.Find(2, 3);
    insert_value(array, 2, 3, 2);
    EXPECT_EQ(element, array.Find(2, 3));
    EXPECT_EQ(value_at(element), 2U);
    EXPECT_EQ(constant.Find(3, 2), nullptr);
}

TEST(SparseArray, SelectsBlocksInTheOrderOfTheTree) {
    Sparse2DArray array(8, 16, 64);
    for (int i = 0; i < 25; ++i) {
        insert_value(array, 16 * (i % 5), 16 * (i / 5), static_cast<std::uint64_t>(i));
    }
    EXPECT_TRUE(select(array, 20, 20, 40, 40));
    EXPECT_EQ(visits(array, false), (Visits{{32, 16, 7}, {16, 16, 6}, {32, 32, 12}, {16, 32, 11}}));
    EXPECT_FALSE(select(array, 80, 0, 90, 10));
    EXPECT_EQ(visits(array, false), Visits{});
}

TEST(Visit, EndsAtFalseAndPropagatesExceptions) {
    Sparse2DArray array(8, 4, 64);
    for (int i = 0; i < 40; ++i) {
        insert_value(array, i, 0, 1);
    }
    select(array, 0, 0, 40, 0);
    for (const bool all : {true, false}) {
        for (const int last : {1, 3, 4, 5, 40}) {
            int calls = 0;
            visit(array, all, [&](const Visited&) { return ++calls < last; });
            EXPECT_EQ(calls, last);
        }
        EXPECT_THROW(visit(array, all, [](const Visited&) -> bool { throw std::runtime_error("visitor"); }),
                     std::runtime_error);
    }
    EXPECT_EQ(visits(array, true).size(), 40U);
}

TEST(Visit, PassesTheElementInPlaceAndTheContext) {
    Sparse2DArray array(8, 4, 4);
    insert_value(array, 2, 3, 1);
    static const void* seen[2];
    array.IterateAll(
        [](int, int, const void* element, const void* context) {
            seen[0] = element, seen[1] = context;
            return true;
        },
        &array);
    EXPECT_EQ(seen[0], array.Find(2, 3));
    EXPECT_EQ(seen[1], &array);
}

}  // namespace
}  // namespace vex_util::testing
