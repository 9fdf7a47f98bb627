// The sparse array as maps and lists, with a number for each element slot: the reference for Sparse2DArray.
#ifndef BASALT_TESTS_SPARSE_SPARSE_ARRAY_MODEL_H
#define BASALT_TESTS_SPARSE_SPARSE_ARRAY_MODEL_H

#include <algorithm>
#include <cstdint>
#include <map>
#include <utility>
#include <vector>

#include "tests/sparse/rtree_model.h"

namespace vex_util::testing {

struct SparseArrayModel {
    struct Element {
        std::uint64_t value;
        std::size_t slot;  // counted from the first chunk's slot 0
    };
    // Ordered as cells are visited.
    struct Cell {
        int block, y, x;
        auto operator<=>(const Cell&) const = default;
    };
    using Cells = std::map<Cell, Element>;

    SparseArrayModel(std::uint32_t side, std::size_t per_chunk) : chunk(std::max<std::size_t>(per_chunk, 1)) {
        while ((std::uint32_t{1} << shift) < side) {
            ++shift;
        }
    }
    SparseArrayModel(const SparseArrayModel& source) : SparseArrayModel(1, 1) {
        copy(source, true);
        selection = source.selection;
        dirty = source.dirty;
    }
    SparseArrayModel& operator=(const SparseArrayModel& source) {
        if (&source != this) {
            clear();
            copy(source, false);
        }
        return *this;
    }

    // The cell; its block is created, or -1 if it does not exist.
    Cell cell_at(int x, int y, bool create) {
        const std::pair key(x >> shift, y >> shift);
        if (create && identifiers.try_emplace(key, static_cast<int>(blocks.size())).second) {
            blocks.push_back(key);
            dirty = true;
        }
        const auto found = identifiers.find(key);
        return {found == identifiers.end() ? -1 : found->second, y, x};
    }

    void insert(int x, int y, std::uint64_t value) {
        const Cell cell = cell_at(x, y, true);
        const auto found = cells.find(cell);
        cells[cell] = {value, found == cells.end() ? take() : found->second.slot};
    }

    // Values count up from the given one.
    void insert_row(int x, int y, std::uint64_t value, int count) {
        const int widest = 1 << std::min(shift, 6U);
        for (int begin = 0, end = 0; begin < count; begin = end) {
            end = std::min(count, begin + widest - ((x + begin) & (widest - 1)));
            for (int i = end; i-- > begin;) {
                insert(x + i, y, value + static_cast<std::uint64_t>(i));
            }
        }
    }

    bool remove(int x, int y) {
        const auto found = cells.find(cell_at(x, y, false));
        if (found == cells.end()) {
            return false;
        }
        free.push_back(found->second.slot);
        cells.erase(found);
        return true;
    }

    void clear() {
        identifiers.clear();
        blocks.clear();
        cells.clear();
        free.clear();
        selection.clear();
        taken = 0;
        dirty = false;
        ++generation;
    }

    std::vector<int> blocks_in(const rtree::Rect& window) const {
        RTreeModel tree;
        const int last = static_cast<int>((std::uint32_t{1} << shift) - 1);
        for (const auto& [bx, by] : blocks) {
            const int x = first_cell(bx), y = first_cell(by);
            tree.insert({x, y, x + last, y + last}, identifiers.at({bx, by}));
        }
        return tree.search(window);
    }

    std::vector<std::pair<int, int>> blocks;  // keys in the order of creation
    Cells cells;
    std::vector<int> selection;
    bool dirty = false;
    int generation = 0;  // raised by what ends a visit

private:
    std::size_t take() {
        if (free.empty()) {
            const std::size_t n = taken++;
            return n - n % chunk + (chunk - 1 - n % chunk);
        }
        const std::size_t slot = free.back();
        free.pop_back();
        return slot;
    }

    void copy(const SparseArrayModel& source, bool empty_too) {
        shift = source.shift;
        chunk = source.chunk;
        for (std::size_t i = 0; empty_too && i < source.blocks.size(); ++i) {
            cell_at(first_cell(source.blocks[i].first), first_cell(source.blocks[i].second), true);
        }
        for (const auto& [cell, element] : source.cells) {  // by block
            insert(cell.x, cell.y, element.value);
        }
    }

    int first_cell(int block) const { return static_cast<int>(static_cast<std::uint32_t>(block) << shift); }

    unsigned shift = 0;
    std::size_t chunk;
    std::size_t taken = 0;  // slots of chunks, free ones too
    std::vector<std::size_t> free;
    std::map<std::pair<int, int>, int> identifiers;
};

}  // namespace vex_util::testing

#endif
