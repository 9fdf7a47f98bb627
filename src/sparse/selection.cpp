// Selection by rectangle and the visits.
#include <algorithm>

#include "src/sparse/sparse_array_storage.h"

namespace vex_util {
namespace {

// The callback may fill or empty later cells, so the bits are read again after each call. If it cleared or
// assigned the array, which changes the generation, the block no longer exists.
template <class Storage>
bool visit_block(const Storage& storage, std::size_t identifier,
                 bool (*visit)(int, int, const void*, const void*), const void* context) {
    const SparseContents& contents = storage.contents;
    const std::uint64_t generation = storage.generation;
    const SparseContents::ListedBlock listed = contents.Blocks()[identifier];
    const std::uint64_t* const filled = contents.Filled(listed.block);
    const std::size_t words = contents.FilledWords();
    const BlockGrid grid = contents.Grid();
    const std::size_t cells = grid.CellsPerBlock();
    for (std::size_t cell = 0; cell < std::min(cells, CELLS_AHEAD); ++cell) {
        __builtin_prefetch(listed.block.cells[cell]);
    }
    for (std::size_t word = 0; word < words; ++word) {
        std::uint64_t bits = filled[word];
        while (bits != 0) {
            const int bit = __builtin_ctzll(bits);
            const std::size_t cell = word * 64 + static_cast<std::size_t>(bit);
            const void* const element = listed.block.cells[cell];
            if (cell + CELLS_AHEAD < cells) {
                __builtin_prefetch(listed.block.cells[cell + CELLS_AHEAD]);
            }
            if (!visit(grid.X(listed.key, cell), grid.Y(listed.key, cell), element, context) ||
                storage.generation != generation) {
                return false;
            }
            bits = filled[word] & (~std::uint64_t{1} << bit);
        }
    }
    return true;
}

}  // namespace

bool Sparse2DArray::Select(const int* const min, const int* const max) {
    const AutoCriticalSection locked(m_storage->lock);
    // If the search runs out of memory, the old selection stays.
    m_storage->contents.Tree().Search(min, max, m_storage->found);
    m_storage->selection.swap(m_storage->found);
    m_storage->selectionDirty.store(false, std::memory_order_relaxed);
    return !m_storage->selection.empty();
}

void Sparse2DArray::IterateSelected(bool (*visit)(int, int, const void*, const void*), const void* context) {
    const AutoCriticalSection locked(m_storage->lock);
    const std::vector<int>& selection = m_storage->selection;
    // By index: the callback may change the list.
    for (std::size_t i = 0; i < selection.size(); ++i) {  // NOLINT(modernize-loop-convert)
        if (!visit_block(*m_storage, static_cast<std::size_t>(selection[i]), visit, context)) {
            return;
        }
    }
}

void Sparse2DArray::IterateAll(bool (*visit)(int, int, const void*, const void*), const void* context) {
    const AutoCriticalSection locked(m_storage->lock);
    for (std::size_t i = 0; i < m_storage->contents.Blocks().size(); ++i) {
        if (!visit_block(*m_storage, i, visit, context)) {
            return;
        }
    }
}

bool Sparse2DArray::IsSelectionDirty() const {
    return m_storage->selectionDirty.load(std::memory_order_relaxed);
}

void Sparse2DArray::SetSelectionDirty(bool dirty) {
    m_storage->selectionDirty.store(dirty, std::memory_order_relaxed);
}

}  // namespace vex_util
