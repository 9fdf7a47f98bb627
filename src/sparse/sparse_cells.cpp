// The calls of basalt::SparseCells.
#include <algorithm>
#include <cstdint>
#include <vector>

#include "basalt/sparse_cells.h"
#include "src/sparse/sparse_array_storage.h"

namespace basalt {
namespace {

using vex_util::CELLS_AHEAD;
using vex_util::SparseContents;

// Which of the offsets 0 .. count - 1 from `first` are at least `low` and at most `high`.
std::uint64_t bits_between(std::int64_t first, int low, int high, std::size_t count) {
    const std::int64_t begin = std::max<std::int64_t>(low - first, 0);
    const std::int64_t end = std::min<std::int64_t>(high - first + 1, static_cast<std::int64_t>(count));
    return begin < end ? ~std::uint64_t{0} >> (64 - (end - begin)) << begin : 0;
}

template <class Storage>
bool visit_block(const Storage& storage, std::size_t identifier, const GridWindow& window,
                 bool (*visit)(const SparseCells::Row&, void*), void* context) {
    const SparseContents& contents = storage.contents;
    const SparseContents::ListedBlock listed = contents.Blocks()[identifier];
    const vex_util::BlockGrid grid = contents.Grid();
    const std::uint64_t* const filled = contents.Filled(listed.block);
    const std::uint64_t generation = storage.generation;
    const std::size_t cells = grid.CellsPerBlock();
    const std::size_t width = std::min<std::size_t>(grid.Side(), 64);
    const std::int64_t low = grid.Y(listed.key, 0);
    const auto bottom = static_cast<std::size_t>(std::max<std::int64_t>(window.min_y - low, 0));
    const auto top = std::min(static_cast<std::size_t>(window.max_y - low), grid.Side() - 1);
    for (std::size_t word = bottom * grid.Side() / 64; word <= ((top + 1) * grid.Side() - 1) / 64; ++word) {
        for (std::size_t bit = 0; bit < std::min<std::size_t>(cells, 64) && filled[word] >> bit != 0;
             bit += width) {
            const std::size_t cell = word * 64 + bit;
            const int x = grid.X(listed.key, cell);
            const int y = grid.Y(listed.key, cell);
            const std::uint64_t wanted = bits_between(x, window.min_x, window.max_x, width) << bit;
            if ((filled[word] & wanted) == 0 || y < window.min_y || y > window.max_y) {
                continue;
            }
            for (std::size_t i = cell + CELLS_AHEAD; i < std::min(cells, cell + CELLS_AHEAD + width); ++i) {
                __builtin_prefetch(listed.block.cells[i]);
            }
            // Bit 0 of the word may be a cell of an earlier row.
            const int x0 = static_cast<int>(static_cast<unsigned>(x) - static_cast<unsigned>(bit));
            if (!visit({x0, y, listed.block.cells + word * 64, filled + word, wanted, &storage.generation},
                       context) ||
                storage.generation != generation) {
                return false;
            }
        }
    }
    return true;
}

}  // namespace

// Work on the array's storage, under its lock.
template <class Work>
auto SparseCells::locked(const Array& array, Work work) {
    const vex_util::AutoCriticalSection lock(array.m_storage->lock);
    return work(*array.m_storage);
}

void SparseCells::insert_row(Array& array, int x, int y, const void* elements, std::size_t size,
                             std::size_t count) {
    locked(array, [&](auto& storage) {
        if (storage.contents.InsertRow(x, y, static_cast<const char*>(elements), size, count)) {
            storage.selectionDirty.store(true, std::memory_order_relaxed);
        }
    });
}

std::size_t SparseCells::copy_row(const Array& array, int x, int y, void* elements, std::size_t size,
                                  bool* filled, std::size_t count) {
    return locked(array, [&](auto& storage) {
        return storage.contents.CopyRow(x, y, static_cast<char*>(elements), size, filled, count);
    });
}

std::size_t SparseCells::find_row(Array& array, int x, int y, void** elements, std::size_t count) {
    return locked(array, [&](auto& storage) { return storage.contents.FindRow(x, y, elements, count); });
}

std::size_t SparseCells::remove_row(Array& array, int x, int y, std::size_t count) {
    return locked(array, [&](auto& storage) { return storage.contents.RemoveRow(x, y, count); });
}

std::size_t SparseCells::find(Array& array, const GridCell* cells, void** elements, std::size_t count) {
    return locked(array, [&](auto& storage) { return storage.contents.FindCells(cells, elements, count); });
}

void SparseCells::update(Array& array, int x, int y, const void* (*change)(void* element, void* context),
                         void* context) {
    locked(array, [&](auto& storage) {
        if (const void* const added = change(storage.contents.Find(x, y), context)) {
            array.Insert(x, y, added);
        }
    });
}

void SparseCells::visit(Array& array, const GridWindow* window, bool (*visit)(const Row& row, void* context),
                        void* context) {
    locked(array, [&](auto& storage) {
        if (window == nullptr) {
            constexpr GridWindow PLANE{INT32_MIN, INT32_MIN, INT32_MAX, INT32_MAX};
            for (std::size_t i = 0; i < storage.contents.Blocks().size(); ++i) {
                if (!visit_block(storage, i, PLANE, visit, context)) {
                    return;
                }
            }
            return;
        }
        const int min[2] = {window->min_x, window->min_y};
        const int max[2] = {window->max_x, window->max_y};
        const GridWindow copy = *window;
        std::vector<int> blocks;
        storage.contents.Tree().Search(min, max, blocks);
        for (const int block : blocks) {
            if (!visit_block(storage, static_cast<std::size_t>(block), copy, visit, context)) {
                return;
            }
        }
    });
}

std::size_t SparseCells::size(const Array& array) {
    return locked(array, [](const auto& storage) { return storage.contents.Size(); });
}

}  // namespace basalt
