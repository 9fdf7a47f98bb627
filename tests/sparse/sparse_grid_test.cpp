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

using Cells = std::map<std::pair<int, int>, long>;

template <class Grid, class... Window>
Cells cells_of(Grid& grid, const Window&... window) {
    Cells cells;
    grid.for_each(window..., [&](int x, int y, const long& value) { cells[{x, y}] += value; });
    return cells;
}

TEST(SparseGrid, MovesAndAMovedFromGridIsEmpty) {
    static_assert(std::is_nothrow_move_constructible_v<SparseGrid<long>>);
    SparseGrid<long> a;
    a.insert(1, 2, 3);
    SparseGrid<long> b(std::move(a));
    bool filled = true;
    a.clear();
    EXPECT_TRUE(a.size() == 0 && a.find(1, 2) == nullptr && !a.remove(1, 2) && a.remove_row(1, 2, 3) == 0);
    EXPECT_TRUE(a.copy_row(1, 2, 1, nullptr, &filled) == 0 && !filled && cells_of(a).empty());
    a.insert(5, 5, 5);
    EXPECT_EQ(cells_of(a), (Cells{{{5, 5}, 5}}));
    EXPECT_EQ(cells_of(std::as_const(b)), (Cells{{{1, 2}, 3}}));
}

TEST(SparseGrid, UpdatesInPlaceOrInsertsAlsoSmallValues) {
    SparseGrid<char> grid;
    const char row[] = {1, 2, 3};
    grid.insert_row(0, 0, row, 3);
    grid.update(1, 0, [&](char& value) { value = &value == grid.find(1, 0) ? 7 : 0; });
    grid.update(-1, 0, [](char& value) { value = value == 0 ? 9 : 0; });
    EXPECT_THROW(grid.update(3, 0, [](char&) { throw 1; }), int);
    char copies[5] = {};
    EXPECT_EQ(grid.copy_row(-1, 0, 5, copies, nullptr), 4U);
    EXPECT_EQ(std::vector<char>(copies, copies + 5), (std::vector<char>{9, 1, 7, 3, 0}));
}

TEST(SparseGrid, VisitsTheCellsOfAWindowOnly) {
    SparseGrid<long> grid(64);
    for (int i = 0; i < 900; ++i) {
        grid.insert(i % 30 * 9 - 130, i / 30 * 9 - 130, i);
    }
    Cells inside = cells_of(grid);
    std::erase_if(inside, [](const auto& cell) {
        const auto [x, y] = cell.first;
        return x < -40 || x > 41 || y < -22 || y > 100;
    });
    EXPECT_EQ(cells_of(grid, GridWindow{-40, -22, 41, 100}), inside);
    EXPECT_EQ(cells_of(grid, GridWindow{41, -22, -40, 100}), Cells{});
}

TEST(SparseGrid, RowsAreLongSpansAndEndWithThePlane) {
    SparseGrid<long> grid(16, 4096);
    std::vector<long> row(100), seen;
    std::iota(row.begin(), row.end(), 0L);
    grid.insert_row(INT_MAX - 39, 1, row.data(), 100);
    std::vector<std::size_t> spans;
    grid.for_each_span([&](int, int, const long* values, std::size_t count) {
        spans.push_back(count);
        seen.insert(seen.end(), values, values + count);
    });
    EXPECT_EQ(spans, (std::vector<std::size_t>{8, 16, 16}));
    EXPECT_EQ(seen, std::vector<long>(row.begin(), row.begin() + 40));
    EXPECT_EQ(grid.remove_row(INT_MAX - 9, 1, SIZE_MAX), 10U);
}

}  // namespace
}  // namespace basalt
