#include "basalt/sparse.h"

#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstring>
#include <new>
#include <numeric>
#include <optional>
#include <random>
#include <utility>
#include <vector>

#include "tests/sparse/array_inspection.h"
#include "tests/sparse/sparse_array_model.h"
#include "tests/sparse/visit_recorder.h"

namespace vex_util::testing {
namespace {

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
        std::vector<std::vector<unsigned char>> elements(5, std::vector<unsigned char>(size));
        for (int i = 0; i < 5; ++i) {
            std::iota(elements[static_cast<std::size_t>(i)].begin(),
                      elements[static_cast<std::size_t>(i)].end(), static_cast<unsigned char>(31 * i + 1));
            array.Insert(i, 0, elements[static_cast<std::size_t>(i)].data());
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

// An array and its model, driven alike.
struct Modelled {
    Sparse2DArray array;
    SparseArrayModel model;

    Modelled(std::size_t size, std::uint32_t side, std::size_t chunk)
        : array(size, side, chunk), model(side) {}

    void insert(int x, int y, std::uint64_t value) {
        const void* const place = array.Find(x, y);
        insert_value(array, x, y, value);
        model.insert(x, y, value);
        EXPECT_TRUE(place == nullptr || array.Find(x, y) == place) << "it is overwritten in place";
    }

    void remove(int x, int y) { EXPECT_EQ(array.Remove(x, y), model.remove(x, y)); }

    void clear() {
        array.RemoveAll();
        model.clear();
    }

    void mark_dirty() {
        array.SetSelectionDirty(true);
        model.dirty = true;
    }

    void assign(Modelled& source) {
        EXPECT_EQ(&(array = source.array), &array);
        model.assign(source.model);
    }

    void select_and_check(const std::array<int, 2>& min, const std::array<int, 2>& max) {
        EXPECT_EQ(array.Select(min.data(), max.data()), model.select(min.data(), max.data()));
        check();
    }

    void check() {
        check_invariants(array);
        std::vector<int> blocks(model.blocks());
        std::iota(blocks.begin(), blocks.end(), 0);
        ASSERT_EQ(visit_all(array), expected_visit(blocks));
        ASSERT_EQ(visit_selected(array), expected_visit(model.selection));
        ASSERT_EQ(array.IsSelectionDirty(), model.dirty);
    }

private:
    std::vector<Visited> expected_visit(const std::vector<int>& blocks) const {
        std::vector<Visited> all;
        for (const int block : blocks) {
            std::optional<SparseArrayModel::Cell> cell;
            while (const auto next = model.next_in_block(static_cast<std::size_t>(block), cell)) {
                cell = next->first;
                all.push_back({cell->x, cell->y, next->second});
            }
        }
        return all;
    }
};

// Two arrays through long random sequences of all that may be done to them.
TEST(SparseArray, BehavesLikeItsModel) {
    const std::uint32_t sides[] = {0, 2, 3, 4, 5, 8, 16, 17};  // those between two powers are rounded up
    for (unsigned seed = 0; seed < std::size(sides); ++seed) {
        SCOPED_TRACE(::testing::Message() << "side " << sides[seed]);
        std::mt19937 random(seed);
        const auto draw = [&](int low, int high) {
            return std::uniform_int_distribution<int>(low, high)(random);
        };
        Modelled pairs[] = {{8, sides[seed], seed % 6}, {8, sides[7 - seed], 3}};
        for (int step = 0; step < 6000; ++step) {
            Modelled& pair = pairs[draw(0, 1)];
            const int x = draw(-30, 30) + (draw(0, 9) == 0 ? 1000000 : 0);
            const int y = draw(-30, 30);
            switch (draw(0, 1500)) {
                case 0:
                    pair.clear();
                    break;
                case 1:
                    pair.assign(pairs[draw(0, 1)]);
                    break;
                case 2: {
                    Modelled copy(pair);
                    Modelled assigned(16, 1, 1);
                    assigned.assign(pair);
                    assigned.check();
                    copy.check();
                    copy.insert(x, y + 50, 1);
                    copy.select_and_check({-30, -30}, {x, y + 50});
                    pair.check();
                    break;
                }
                case 3:
                    for (const Visited& v : visit_all(pair.array)) {
                        pair.remove(v.x, v.y);
                    }
                    break;
                case 4:
                    pair.mark_dirty();
                    break;
                default:
                    draw(0, 2) == 0 ? pair.remove(x, y) : pair.insert(x, y, static_cast<std::uint64_t>(step));
            }
            const void* const found = pair.array.Find(x, y);
            ASSERT_EQ(found == nullptr ? std::nullopt : std::optional(value_at(found)),
                      pair.model.find(x, y));
            ASSERT_EQ(pair.array.IsSelectionDirty(), pair.model.dirty);
            if (draw(0, 299) == 0) {
                pair.select_and_check({x, y}, {x + draw(-1, 30), y + draw(-1, 30)});
            }
        }
        pairs[0].check();
        pairs[1].select_and_check({INT_MIN, INT_MIN}, {INT_MAX, INT_MAX});
    }
}

}  // namespace
}  // namespace vex_util::testing
