#include "basalt/sparse.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <climits>
#include <cstring>
#include <map>
#include <new>
#include <random>
#include <utility>
#include <vector>

#include "tests/sparse/array_inspection.h"
#include "tests/sparse/visit_recorder.h"

namespace vex_util::testing {
namespace {

TEST(SparseArray, OverwritesInPlaceAndKeepsTheAddress) {
    Sparse2DArray array(8, 16, 4);
    insert_value(array, 5, -7, 1);
    void* const first = array.Find(5, -7);
    ASSERT_NE(first, nullptr);
    insert_value(array, 5, -7, 2);
    EXPECT_EQ(array.Find(5, -7), first);
    EXPECT_EQ(value_at(first), 2U);
    EXPECT_EQ(visit_all(array), (std::vector<Visited>{{5, -7, 2}}));
}

TEST(SparseArray, WholeThirtyTwoBitPlaneIsAddressable) {
    for (const std::size_t side : {1U, 2U, 16U, 128U}) {
        SCOPED_TRACE(side);
        Sparse2DArray array(8, side, 8);
        const std::array<std::pair<int, int>, 4> corners = {
            {{INT_MIN, INT_MIN}, {INT_MAX, INT_MIN}, {INT_MIN, INT_MAX}, {INT_MAX, INT_MAX}}};
        std::uint64_t value = 0;
        for (const auto& [x, y] : corners) {
            insert_value(array, x, y, ++value);
        }
        value = 0;
        for (const auto& [x, y] : corners) {
            ASSERT_TRUE(select(array, x, y, x, y));
            EXPECT_EQ(visit_selected(array), (std::vector<Visited>{{x, y, ++value}}));
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

TEST(SparseArray, CopiesEveryByteOfElementsOfAnySize) {
    for (std::size_t size = 8; size <= 80; ++size) {
        SCOPED_TRACE(size);
        Sparse2DArray array(size, 4, 3);
        std::vector<std::vector<unsigned char>> elements;
        for (int i = 0; i < 5; ++i) {
            std::vector<unsigned char> element(size);
            for (std::size_t k = 0; k < size; ++k) {
                element[k] = static_cast<unsigned char>(31 * i + 7 * static_cast<int>(k) + 1);
            }
            array.Insert(i, 0, element.data());
            elements.push_back(element);
        }
        for (int i = 0; i < 5; ++i) {
            EXPECT_EQ(std::memcmp(array.Find(i, 0), elements[static_cast<std::size_t>(i)].data(), size), 0);
        }
    }
}

TEST(SparseArray, SlotsComeFromTheChunksTopDownAndLastFreedFirst) {
    constexpr std::size_t SIZE = 24;
    Sparse2DArray array(SIZE, 16, 3);
    const std::array<std::uint64_t, 3> element = {1, 2, 3};
    const auto insert = [&](int x) {
        array.Insert(x, 0, element.data());
        return static_cast<char*>(array.Find(x, 0));
    };
    char* const slot2 = insert(0);
    EXPECT_EQ(insert(1), slot2 - SIZE);
    char* const slot0 = insert(2);
    EXPECT_EQ(slot0, slot2 - 2 * SIZE);

    EXPECT_TRUE(array.Remove(1, 0));
    EXPECT_TRUE(array.Remove(0, 0));
    EXPECT_EQ(insert(10), slot2);
    EXPECT_EQ(insert(11), slot2 - SIZE);

    char* const next2 = insert(3);
    EXPECT_TRUE(next2 < slot0 || next2 > slot2);
    EXPECT_TRUE(array.Remove(2, 0));
    EXPECT_EQ(insert(4), slot0);
    EXPECT_EQ(insert(5), next2 - SIZE);
    check_invariants(array);
}

TEST(SparseArray, OddParametersAreRoundedUp) {
    struct Case {
        std::size_t given;
        std::size_t used;
    };
    for (const auto& [given, used] : std::vector<Case>{{0, 1}, {1, 1}, {3, 4}, {5, 8}, {16, 16}, {17, 32}}) {
        SCOPED_TRACE(given);
        Sparse2DArray array(8, given, 0);
        insert_value(array, 0, 0, 1);
        const int last = static_cast<int>(used) - 1;
        EXPECT_TRUE(select(array, last, last, last, last));
        EXPECT_FALSE(select(array, last + 1, 0, last + 1, 0));
        insert_value(array, last + 1, 0, 2);
        EXPECT_EQ(visit_all(array).size(), 2U);
    }
}

TEST(SparseArray, SizesBeyondTheAddressSpaceFailAsOutOfMemory) {
    const std::uint64_t value = 1;
    for (const std::size_t side : {std::size_t{1} << 31, std::size_t{1} << 32, SIZE_MAX}) {
        Sparse2DArray array(8, side, 1);
        EXPECT_THROW(array.Insert(-1, 1, &value), std::bad_alloc);
        EXPECT_EQ(array.Find(-1, 1), nullptr);
        EXPECT_FALSE(array.IsSelectionDirty());
        EXPECT_FALSE(select(array, INT_MIN, INT_MIN, INT_MAX, INT_MAX));
    }
    Sparse2DArray array(SIZE_MAX / 2, 16, 3);
    EXPECT_THROW(array.Insert(0, 0, &value), std::bad_alloc);
    EXPECT_FALSE(select(array, INT_MIN, INT_MIN, INT_MAX, INT_MAX));
}

TEST(SparseArray, AssignmentTakesParametersAndNonEmptyBlocks) {
    Sparse2DArray source(8, 4, 2);
    for (int i = 0; i < 5; ++i) {
        insert_value(source, 4 * i, 0, static_cast<std::uint64_t>(i));
    }
    source.Remove(4, 0);
    Sparse2DArray target(8, 16, 2);
    insert_value(target, 1000, 1000, 9);
    select(target, 1000, 1000, 1000, 1000);

    EXPECT_EQ(&(target = source), &target);
    EXPECT_EQ(visit_all(target), (std::vector<Visited>{{0, 0, 0}, {8, 0, 2}, {12, 0, 3}, {16, 0, 4}}));
    EXPECT_TRUE(visit_selected(target).empty());
    EXPECT_TRUE(target.IsSelectionDirty());
    EXPECT_FALSE(select(target, 4, 0, 7, 0));
    EXPECT_TRUE(select(target, 11, 3, 11, 3));
    check_invariants(target);

    insert_value(source, 0, 0, 77);
    EXPECT_EQ(value_at(target.Find(0, 0)), 0U);
}

TEST(SparseArray, AssignmentFromAnEmptiedArrayLeavesTheTargetEmpty) {
    Sparse2DArray source(8, 4, 2);
    insert_value(source, 0, 0, 1);
    source.Remove(0, 0);
    Sparse2DArray target(8, 16, 2);
    insert_value(target, 0, 0, 1);
    target = source;
    EXPECT_FALSE(target.IsSelectionDirty());
    EXPECT_FALSE(select(target, INT_MIN, INT_MIN, INT_MAX, INT_MAX));
}

TEST(SparseArray, SelfAssignmentChangesNothing) {
    Sparse2DArray array(8, 4, 2);
    insert_value(array, 3, 3, 5);
    void* const slot = array.Find(3, 3);
    select(array, 0, 0, 0, 0);
    Sparse2DArray& same = array;
    array = same;
    EXPECT_EQ(array.Find(3, 3), slot);
    EXPECT_EQ(visit_selected(array).size(), 1U);
    EXPECT_FALSE(array.IsSelectionDirty());
}

TEST(SparseArray, CopyIsEqualAndIndependent) {
    Sparse2DArray source(8, 4, 3);
    for (int by = 0; by < 5; ++by) {
        for (int bx = 0; bx < 5; ++bx) {
            insert_value(source, 4 * bx + 1, 4 * by + 2, static_cast<std::uint64_t>(5 * by + bx));
        }
    }
    source.Remove(5, 2);
    select(source, 5, 5, 10, 10);
    source.SetSelectionDirty(true);

    Sparse2DArray copy(source);
    EXPECT_EQ(visit_all(copy), visit_all(source));
    EXPECT_EQ(visit_selected(copy), visit_selected(source));
    EXPECT_TRUE(copy.IsSelectionDirty());
    EXPECT_TRUE(select(copy, 4, 0, 4, 0)) << "the emptied block is copied";
    check_invariants(copy);
    for (const auto& window : {std::array{-3, -3, 30, 30}, std::array{2, 2, 9, 17}}) {
        select(source, window[0], window[1], window[2], window[3]);
        select(copy, window[0], window[1], window[2], window[3]);
        EXPECT_EQ(visit_selected(copy), visit_selected(source));
    }

    const std::vector<Visited> before = visit_all(source);
    copy.RemoveAll();
    EXPECT_EQ(visit_all(source), before);
}

TEST(SparseArray, RemoveAllReturnsToTheNewState) {
    Sparse2DArray array(8, 16, 2);
    array.SetSelectionDirty(true);
    array.RemoveAll();
    EXPECT_FALSE(array.IsSelectionDirty());
    for (int round = 0; round < 3; ++round) {
        for (int i = 0; i < 50; ++i) {
            insert_value(array, 16 * i, i, 1);
        }
        select(array, 0, 0, 100, 100);
        insert_value(array, -1, -1, 1);
        array.RemoveAll();
        EXPECT_EQ(array.Find(0, 0), nullptr);
        EXPECT_FALSE(array.IsSelectionDirty());
        EXPECT_TRUE(visit_selected(array).empty());
        EXPECT_TRUE(visit_all(array).empty());
        EXPECT_FALSE(select(array, INT_MIN, INT_MIN, INT_MAX, INT_MAX));
        check_invariants(array);
    }
}

// A map of cells beside the array, through long random sequences.
TEST(SparseArray, BehavesLikeAMapOfCells) {
    for (const unsigned seed : {1U, 2U, 3U, 4U}) {
        SCOPED_TRACE(seed);
        std::mt19937 random(seed);
        const auto draw = [&](int low, int high) {
            return std::uniform_int_distribution<int>(low, high)(random);
        };
        const std::size_t side = std::size_t{1} << seed;
        Sparse2DArray array(8, side, 5);
        std::map<std::pair<int, int>, std::uint64_t> model;
        for (int step = 0; step < 20000; ++step) {
            const int x = draw(-40, 40) + (draw(0, 9) == 0 ? 1000000 : 0);
            const int y = draw(-40, 40);
            switch (draw(0, 9)) {
                case 0:
                case 1:
                case 2:
                    EXPECT_EQ(array.Remove(x, y), model.erase({x, y}) != 0);
                    break;
                case 3:
                    if (draw(0, 2000) == 0) {
                        array.RemoveAll();
                        model.clear();
                    }
                    break;
                default:
                    insert_value(array, x, y, static_cast<std::uint64_t>(step));
                    model[{x, y}] = static_cast<std::uint64_t>(step);
            }
            const auto known = model.find({x, y});
            const void* const found = array.Find(x, y);
            ASSERT_EQ(found != nullptr, known != model.end());
            if (found != nullptr) {
                ASSERT_EQ(value_at(found), known->second);
            }
        }
        check_invariants(array);
        std::vector<Visited> all = visit_all(array);
        ASSERT_EQ(all.size(), model.size());
        for (const Visited& v : all) {
            EXPECT_EQ(model.at({v.x, v.y}), v.value);
        }
        Sparse2DArray copy(array);
        Sparse2DArray assigned(16, 1, 1);
        assigned = array;
        check_invariants(copy);
        check_invariants(assigned);
        EXPECT_EQ(visit_all(copy), all);
        EXPECT_EQ(visit_all(assigned), all);
    }
}

}  // namespace
}  // namespace vex_util::testing
