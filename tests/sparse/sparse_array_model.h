// The sparse array written down plainly: cells in a map, blocks in a list, selection by a plain R-tree.
#ifndef BASALT_TESTS_SPARSE_SPARSE_ARRAY_MODEL_H
#define BASALT_TESTS_SPARSE_SPARSE_ARRAY_MODEL_H

#include <algorithm>
#include <cstdint>
#include <map>
#include <optional>
#include <utility>
#include <vector>

#include "tests/sparse/rtree_model.h"

namespace vex_util::testing {

class SparseArrayModel {
public:
    using Value = std::uint64_t;
    // A visited cell; in a block by rows, which is how its key compares.
    struct Cell {
        int y;
        int x;
        auto operator<=>(const Cell&) const = default;
    };

    explicit SparseArrayModel(std::uint32_t side) {
        while ((std::uint32_t{1} << m_shift) < side) {
            ++m_shift;
        }
    }

    void insert(int x, int y, Value value) {
        const Key key{x >> m_shift, y >> m_shift};
        if (!m_ids.contains(key)) {
            m_ids[key] = static_cast<int>(m_blocks.size());
            m_blocks.push_back({key, {}});
            dirty = true;
        }
        m_blocks[static_cast<std::size_t>(m_ids[key])].cells[{y, x}] = value;
    }

    std::optional<Value> find(int x, int y) const {
        const auto id = m_ids.find({x >> m_shift, y >> m_shift});
        if (id == m_ids.end()) {
            return {};
        }
        const auto& cells = m_blocks[static_cast<std::size_t>(id->second)].cells;
        const auto cell = cells.find({y, x});
        return cell == cells.end() ? std::nullopt : std::optional(cell->second);
    }

    bool remove(int x, int y) {
        const auto id = m_ids.find({x >> m_shift, y >> m_shift});
        return id != m_ids.end() && m_blocks[static_cast<std::size_t>(id->second)].cells.erase({y, x}) == 1;
    }

    void clear() {
        m_ids.clear();
        m_blocks.clear();
        selection.clear();
        dirty = false;
        ++generation;
    }

    void assign(const SparseArrayModel& source) {
        if (&source == this) {
            return;
        }
        clear();
        m_shift = source.m_shift;
        for (const Block& block : source.m_blocks) {
            if (!block.cells.empty()) {
                m_ids[block.key] = static_cast<int>(m_blocks.size());
                m_blocks.push_back(block);
            }
        }
        dirty = !m_blocks.empty();
    }

    bool select(const int min[2], const int max[2]) {
        RTreeModel tree;
        const int last = static_cast<int>((std::uint32_t{1} << m_shift) - 1);
        for (std::size_t i = 0; i < m_blocks.size(); ++i) {
            const int low[2] = {first_cell(m_blocks[i].key.first), first_cell(m_blocks[i].key.second)};
            const int high[2] = {low[0] + last, low[1] + last};
            tree.Insert(low, high, static_cast<int>(i));
        }
        tree.Search(min, max, selection);
        dirty = false;
        return !selection.empty();
    }

    // The first filled cell of a block behind `after`; none where the block has no more.
    std::optional<std::pair<Cell, Value>> next_in_block(std::size_t block, std::optional<Cell> after) const {
        const auto& cells = m_blocks[block].cells;
        const auto next = after ? cells.upper_bound(*after) : cells.begin();
        return next == cells.end() ? std::nullopt : std::optional(std::pair(next->first, next->second));
    }

    std::size_t blocks() const { return m_blocks.size(); }

    std::vector<int> selection;
    bool dirty = false;
    int generation = 0;  // raised by what ends a visit

private:
    using Key = std::pair<int, int>;
    struct Block {
        Key key;
        std::map<Cell, Value> cells;
    };

    int first_cell(int key) const { return static_cast<int>(static_cast<std::uint32_t>(key) << m_shift); }

    unsigned m_shift = 0;
    std::map<Key, int> m_ids;
    std::vector<Block> m_blocks;  // in the order of their creation
};

}  // namespace vex_util::testing

#endif
