// Threads on several sparse arrays: all operations, visits that change the array, arrays assigned to each
// other, by one of the threads also from a visit. One thread checks the invariants.
#include <cstdint>
#include <memory>
#include <vector>

#include "basalt/sparse_cells.h"
#include "tests/stress/stress.h"
#include "tests/support/sparse_inspector.h"

namespace basalt::stress {

namespace {

using vex_util::Sparse2DArray;

constexpr int THREADS = 7, SIDE = 80, ROW = 20;

// Follows from the cell, so that a mixture of two elements is detected.
struct Element {
    std::int64_t x = 0, y = 0, sum = 0;

    bool is_at(int cell_x, int cell_y) const { return x == cell_x && y == cell_y && sum == 31 * x + y; }
};

struct Context {
    int thread;
    Random& random;
    Sparse2DArray &array, &other;
};

bool visit(int x, int y, const void* element, const void* context) {
    const auto& [thread, random, array, other] = *static_cast<const Context*>(context);
    require(static_cast<const Element*>(element)->is_at(x, y));
    const int choice = draw(random, 400);
    if (choice < SIDE) {
        const Element added{choice, y, 31 * choice + y};
        array.Insert(choice, y, &added);
        array.Remove(draw(random, SIDE), y);
    } else if (choice == SIDE && thread == 0) {
        draw(random, 2) == 0 ? other = array : array = other;
    }
    return choice != 399;
}

// The lock is held during a visit.
bool check_array(int, int, const void*, const void* array) {
    vex_util::testing::check_invariants(*static_cast<const Sparse2DArray*>(array));
    return false;
}

void change(const Context& context) {
    const auto& [thread, random, array, other] = context;
    const int x = draw(random, SIDE), y = draw(random, SIDE), choice = draw(random, 200);
    const int min[2] = {x - 8, y - 8}, max[2] = {x + 8, y + 8};
    Element row[ROW];
    bool filled[ROW];
    for (int i = 0; i < ROW; ++i) {
        row[i] = {x + i, y, 31 * (x + i) + y};
    }
    if (choice < 90) {
        array.Insert(x, y, row);
    } else if (choice < 110) {
        SparseCells::insert_row(array, x, y, row, sizeof(Element), ROW);
    } else if (choice < 150) {
        SparseCells::remove_row(array, x, y, ROW / 2);
    } else if (choice < 170) {
        SparseCells::copy_row(array, x, y, row, sizeof(Element), filled, ROW);
        for (int i = 0; i < ROW; ++i) {
            require(!filled[i] || row[i].is_at(x + i, y));
        }
    } else if (choice < 180) {
        array.Select(min, max);
        array.SetSelectionDirty(!array.IsSelectionDirty());
    } else if (choice < 196) {
        choice < 190 ? array.IterateSelected(visit, &context) : array.IterateAll(visit, &context);
    } else if (choice < 199) {
        array = other;
    } else if (x < 10) {
        array.RemoveAll();
    }
}

}  // namespace

long stress_sparse(double seconds) {
    std::vector<std::unique_ptr<Sparse2DArray>> arrays;
    for (const std::size_t side : {1U, 4U, 16U}) {
        arrays.push_back(std::make_unique<Sparse2DArray>(sizeof(Element), side, 7));
    }
    return run_threads(THREADS, seconds, [&](int thread, Random& random) {
        const auto any = [&]() -> Sparse2DArray& {
            return *arrays[static_cast<std::size_t>(draw(random, 3))];
        };
        Sparse2DArray& array = any();
        for (int i = 0; i < 50 && thread < THREADS - 1; ++i) {
            change({thread, random, array, any()});
        }
        if (thread == THREADS - 1) {
            array.IterateAll(check_array, &array);
        }
    });
}

}  // namespace basalt::stress
