// Facts about the R-tree and its memory; random trees against the model are fuzz/rtree.
#include <gtest/gtest.h>

#include "tests/sparse/rtree_model.h"
#include "tests/support/failing_new.h"

namespace vex_util {
namespace {

void fill(slRTree& tree, int from, int to) {
    for (int i = from; i < to; ++i) {
        const int x = i * 37 % 61 * 16, y = i * 53 % 67 * 16;
        const int min[2] = {x, y}, max[2] = {x + 15, y + 15};
        tree.Insert(min, max, i);
    }
}

TEST(RTree, ReservedInsertionsAllocateNothing) {
    for (const int batch : {1, 2, 9, 300}) {
        slRTree tree;
        for (int i = 0; i < 5000; i += batch) {
            tree.Reserve(static_cast<std::size_t>(batch));
            const FailAllocation guard(1, true);
            fill(tree, i, i + batch);
            ASSERT_FALSE(guard.fired()) << batch << ' ' << i;
        }
    }
}

TEST(RTree, RootSplitReservesEnoughNodes) {
    slRTree tree, plain;
    fill(plain, 0, 300);
    for (int i = 0; i < 300; ++i) {
        RTreeInspector::leave_too_few(tree);
        fill(tree, i, i + 1);
    }
    EXPECT_EQ(RTreeInspector::dump(tree), RTreeInspector::dump(plain));
}

TEST(Slab, FillsLargePagesIfLittleOfThemIsLost) {
    constexpr std::size_t KIB = 1024;
    constexpr std::size_t ROWS[][3] = {{100, 1, 100},     {512, 2, 2048},    {520, 520, 520},
                                       {1100, 520, 1040}, {2200, 520, 4096}, {2080, 2080, 2080},
                                       {1800, 1800, 2048}};
    for (const auto& [bytes, unit, result] : ROWS) {
        EXPECT_EQ(Slab(bytes * KIB, unit * KIB).Bytes(), result * KIB) << bytes;
    }
    EXPECT_THROW(Slab(SIZE_MAX), std::bad_alloc);
}

}  // namespace
}  // namespace vex_util
