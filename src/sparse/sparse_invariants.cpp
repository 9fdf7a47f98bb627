// The walker that checks what must always hold between the parts of a sparse array.
#include <stdexcept>
#include <unordered_set>

#include "src/sparse/sparse_contents.h"

namespace vex_util {
namespace {

void require(bool holds, const char* invariant) {
    if (!holds) {
        throw std::logic_error(invariant);
    }
}

}  // namespace

void SparseContents::CheckInvariants() const {
    require(m_index.Count() == m_list.size(), "every listed block is in the index once");
    std::size_t filledCells = 0;
    std::unordered_set<const void*> slots;
    for (std::size_t i = 0; i < m_list.size(); ++i) {
        const auto& [key, block] = m_list[i];
        require(m_index.Find(key).cells == block.cells, "the index finds every listed block");
        for (std::size_t cell = 0; cell < m_grid.CellsPerBlock(); ++cell) {
            const bool filled = (Filled(block)[cell / 64] >> cell % 64 & 1) != 0;
            require(filled == (block.cells[cell] != nullptr),
                    "a cell's bit says whether it holds an element");
            if (filled) {
                ++filledCells;
                require(slots.insert(block.cells[cell]).second, "no slot serves two cells");
            }
        }
        const std::size_t last = m_grid.CellsPerBlock() - 1;
        const int min[2] = {m_grid.X(key, 0), m_grid.Y(key, 0)};
        const int max[2] = {m_grid.X(key, last), m_grid.Y(key, last)};
        std::vector<int> found;
        m_tree.Search(min, max, found);
        require(found == std::vector<int>{static_cast<int>(i)},
                "the tree holds every block once, and no two overlap");
    }
    m_elements.CheckInvariants(filledCells, slots);
}

void ElementPool::CheckInvariants(std::size_t taken,
                                  const std::unordered_set<const void*>& takenSlots) const {
    for (std::size_t i = 0; i < m_freeCount; ++i) {
        require(!takenSlots.contains(m_free[i]), "no slot is both free and in a cell");
    }
    require(m_chunks.size() * m_elementsPerChunk <= FreeRoom(), "there is room to free every slot");
    require(m_freeCount + m_unused + taken == m_chunks.size() * m_elementsPerChunk,
            "every slot is free or in one cell");
}

}  // namespace vex_util
