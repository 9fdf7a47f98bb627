// Facts about the R-tree and its memory; random trees against the model are fuzz/rtree.
#include "src/sparse/rtree.h"

#include <gtest/gtest.h>

#include <bit>
#include <climits>
#include <vector>

#include "src/sparse/rtree_volume.h"
#include "src/sparse/slab.h"
#include "tests/sparse/rtree_model.h"
#include "tests/support/failing_new.h"

namespace vex_util {
namespace {

template <class Rects>
void fill(slRTree& tree, int from, int to, Rects rect_of) {
    for (int i = from; i < to; ++i) {
        const auto [x, y] = rect_of(i);
        const int min[2] = {16 * x, 16 * y}, max[2] = {16 * x + 15, 16 * y + 15};
        tree.Insert(min, max, i);
    }
}
constexpr auto SQUARE = [](int i) { return std::pair{i % 5, i / 5}; };
constexpr auto SCATTERED = [](int i) { return std::pair{i * 37 % 61, i * 53 % 67}; };
constexpr auto ROW = [](int i) { return std::pair{i, 0}; };

TEST(RTree, VolumesOfKnownRectangles) {
    const auto volume = [](const rtree::Rect& r) { return rtree::spherical_volume(rtree::all4(r))[0]; };
    EXPECT_NEAR(volume({0, 0, 15, 15}), 353.4292, 5e-5);
    EXPECT_NEAR(volume({0, 0, 31, 15}), 931.4823, 5e-5);
    EXPECT_EQ(volume({7, -9, 7, -9}), 0);
    EXPECT_EQ(std::bit_cast<unsigned>(rtree::UNIT_SPHERE_VOLUME), 0x40490FDCU);
}

TEST(RTree, SquareOfBlocks) {
    slRTree tree;
    fill(tree, 0, 25, SQUARE);
    std::vector<int> found;
    const int min[2] = {INT_MIN, INT_MIN}, max[2] = {INT_MAX, INT_MAX};
    EXPECT_EQ(tree.Search(min, max, found), 25);
    EXPECT_EQ(found, (std::vector<int>{2,  3,  4,  7,  8,  0,  1,  5,  6,  10, 9,  12, 13,
                                       14, 11, 15, 16, 20, 21, 22, 17, 18, 19, 23, 24}));
}

TEST(RTree, ReservedInsertionsAllocateNothing) {
    for (const int batch : {1, 2, 9, 300}) {
        slRTree tree;
        for (int i = 0; i < 5000; i += batch) {
            tree.Reserve(static_cast<std::size_t>(batch));
            const FailAllocation guard(1, true);
            fill(tree, i, i + batch, SCATTERED);
            ASSERT_FALSE(guard.fired()) << batch << ' ' << i;
        }
    }
}

TEST(RTree, RootSplitReservesEnoughNodes) {
    slRTree tree, plain;
    for (int i = 0; i < 60; ++i) {
        RTreeInspector::leave_spare(tree, RTreeInspector::level(tree) + 1);
        fill(tree, i, i + 1, ROW);
    }
    fill(plain, 0, 60, ROW);
    EXPECT_EQ(RTreeInspector::level(tree), 2);
    EXPECT_EQ(RTreeInspector::dump(tree), RTreeInspector::dump(plain));
}

TEST(RTree, ClearingReleasesAllNodesButTheFirst) {
    slRTree tree;
    const long live = live_allocations();
    fill(tree, 0, 4000, SCATTERED);
    EXPECT_GT(live_allocations(), live);
    tree.RemoveAll();
    EXPECT_EQ(live_allocations(), live);
    EXPECT_EQ(RTreeInspector::dump(tree), "L0{}");
}

TEST(Slab, FillsLargePagesIfLittleOfThemIsLost) {
    constexpr std::size_t KIB = 1024;
    constexpr std::size_t TABLE[][3] = {{100, 1, 100},     {512, 2, 2048},    {520, 520, 520},
                                        {1100, 520, 1040}, {2200, 520, 4096}, {2080, 2080, 2080},
                                        {1800, 1800, 2048}};
    for (const auto& [bytes, unit, result] : TABLE) {
        EXPECT_EQ(Slab(bytes * KIB, unit * KIB).Bytes(), result * KIB) << bytes;
    }
    EXPECT_THROW(Slab(SIZE_MAX), std::bad_alloc);
}

}  // namespace
}  // namespace vex_util
