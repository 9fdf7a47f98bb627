// Facts about the typed grid; rows and calls mixed against the model are fuzz/sparse.
#include "basalt/sparse_grid.h"

#include <gtest/gtest.h>

#include <climits>
#include <map>
#include <numeric>
#include <utility>
#include <vector>

namespace basalt {
namespace {

struct Pass {
    double height = 1.5;
    int count = 0;
};
static_assert(std::is_nothrow_move_constructible_v<SparseGrid<Pass>> &&
              std::is_nothrow_move_assignable_v<SparseGrid<Pass>>);

using Cells = std::map<std::pair<int, int>, int>;  // by y, x

template <class Grid, class... Window>
Cells cells_of(Grid& grid, const Window&... window) {
    Cells cells;
    grid.for_each(window..., [&](int x, int y, const auto& value) {
        cells[{y, x}] += static_cast<int>(value);
    });
    return cells;
}

TEST(SparseGrid, MovesAndAMovedFromGridIsEmpty) {
    SparseGrid<long> a(4, 8);
    a.insert(1, 2, 3);
    const long* const value = a.find(1, 2);
    SparseGrid<long> b(std::move(a));
    EXPECT_EQ(std::as_const(b).find(1, 2), value);
    bool filled = true;
    a.clear();
    EXPECT_TRUE(a.size() == 0 && a.find(1, 2) == nullptr && !a.remove(1, 2) && a.remove_row(1, 2, 3) == 0);
    EXPECT_TRUE(a.copy_row(1, 2, 1, nullptr, &filled) == 0 && !filled && cells_of(a).empty());
    a.insert(5, 5, 5);
    b = std::move(a);
    EXPECT_EQ(cells_of(std::as_const(b)), (Cells{{{5, 5}, 5}}));
}

TEST(SparseGrid, HoldsSmallValues) {
    SparseGrid<char> grid;
    const char row[] = {1, 2, 3};
    grid.insert(-1, 0, 9);
    grid.insert_row(0, 0, row, 3);
    char copies[5] = {};
    EXPECT_EQ(grid.copy_row(-1, 0, 5, copies, nullptr), 4U);
    EXPECT_EQ(std::vector<char>(copies, copies + 5), (std::vector<char>{9, 1, 2, 3, 0}));
}

TEST(SparseGrid, UpdatesInPlaceOrInserts) {
    SparseGrid<Pass> grid;
    const Pass* seen[2];
    for (const Pass*& pass : seen) {
        grid.update(3, 4, [&](Pass& p) { pass = &p, p.count += p.height == 1.5 ? 3 : 0; });
    }
    EXPECT_TRUE(seen[1] == grid.find(3, 4) && seen[0] != seen[1]);
    EXPECT_EQ(seen[1]->count, 6);
    EXPECT_THROW(grid.update(0, 0, [](Pass&) { throw 1; }), int);
    EXPECT_EQ(grid.size(), 1U);
}

TEST(SparseGrid, VisitsTheCellsOfAWindowOnly) {
    for (const std::size_t side : {1, 4, 64, 256}) {
        SCOPED_TRACE(side);
        SparseGrid<long> grid(side);
        Cells inside;
        for (int i = 0; i < 900; ++i) {
            const int x = i % 30 * 9 - 130, y = i / 30 * 9 - 130;
            grid.insert(x, y, i);
            if (x >= -40 && x <= 41 && y >= -22 && y <= 100) {
                inside[{y, x}] = i;
            }
        }
        EXPECT_EQ(cells_of(grid, GridWindow{-40, -22, 41, 100}), inside);
        EXPECT_EQ(cells_of(grid, GridWindow{41, -22, -40, 100}), Cells{});
        EXPECT_EQ(cells_of(grid, GridWindow{INT_MIN, INT_MIN, INT_MAX, INT_MAX}), cells_of(grid));
        EXPECT_EQ(cells_of(grid).size(), 900U);
    }
}

TEST(SparseGrid, RowsAreLongSpansAndEndAtThePlane) {
    SparseGrid<long> grid(16, 4096);
    std::vector<long> row(100);
    std::iota(row.begin(), row.end(), 0L);
    grid.insert_row(INT_MAX - 39, 1, row.data(), 100);
    EXPECT_EQ(grid.size(), 40U);
    EXPECT_EQ(*grid.find(INT_MAX, 1), 39);
    std::vector<std::size_t> spans;
    grid.for_each_span([&](int x, int y, const long* values, std::size_t count) {
        spans.push_back(count);
        EXPECT_TRUE(y == 1 && values[count - 1] == x - (INT_MAX - 39) + static_cast<long>(count) - 1);
    });
    EXPECT_EQ(spans, (std::vector<std::size_t>{8, 16, 16}));
    EXPECT_EQ(grid.remove_row(INT_MAX - 9, 1, SIZE_MAX), 10U);
}

}  // namespace
}  // namespace basalt
