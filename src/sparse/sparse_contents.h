// What a sparse array holds: elements, blocks and their index, without the lock.
#ifndef BASALT_SRC_SPARSE_SPARSE_CONTENTS_H
#define BASALT_SRC_SPARSE_SPARSE_CONTENTS_H

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <vector>

#include "basalt/sparse_cells.h"
#include "src/sparse/block_grid.h"
#include "src/sparse/block_index.h"
#include "src/sparse/block_pool.h"
#include "src/sparse/element_pool.h"
#include "src/sparse/rtree.h"

namespace vex_util {

// How many cells ahead visits prefetch elements: where a row ends, the hardware prefetcher fails.
inline constexpr std::size_t CELLS_AHEAD = 32;

// An insertion that throws std::bad_alloc changes nothing: all memory is reserved before anything is entered.
// After a copy that throws, the object may only be destroyed.
class SparseContents {
public:
    struct ListedBlock {
        BlockKey key;
        CellBlock block;
    };

    SparseContents(std::size_t elementSize, std::size_t blockSide, std::size_t elementsPerChunk)
        : m_grid(blockSide), m_elements(elementSize, elementsPerChunk), m_blocks(m_grid.CellsPerBlock()) {}

    // The same blocks with the same identifiers, empty ones too, and copies of all elements.
    SparseContents(const SparseContents& source);
    SparseContents& operator=(const SparseContents&) = delete;

    // Into an empty object: copies of all elements, and only the blocks that hold one, in the source's order.
    void CopyNonEmptyBlocks(const SparseContents& source);

    // Copies the element into the cell; true if that created a block.
    bool Insert(int x, int y, const void* element) {
        const CellBlock block = FindBlock(m_grid.KeyOf(x, y));
        if (!block) {
            InsertIntoNewBlock(x, y, element);
            return true;
        }
        const std::size_t cell = m_grid.CellOf(x, y);
        if (block.cells[cell] != nullptr) {
            CopyElement(block.cells[cell], element);
        } else {
            Fill(block, cell, m_elements.Take(), element);
        }
        return false;
    }

    void* Find(int x, int y) noexcept {
        const CellBlock block = FindBlock(m_grid.KeyOf(x, y));
        return block ? block.cells[m_grid.CellOf(x, y)] : nullptr;
    }

    bool Remove(int x, int y) noexcept {
        const CellBlock block = FindBlock(m_grid.KeyOf(x, y));
        if (!block) {
            return false;
        }
        const std::size_t cell = m_grid.CellOf(x, y);
        void*& slot = block.cells[cell];
        if (slot == nullptr) {
            return false;
        }
        m_elements.Give(slot);
        slot = nullptr;
        Word(block, cell) &= ~(std::uint64_t{1} << cell % 64);
        return true;
    }

    // As basalt::SparseCells describes them; InsertRow is true if it created a block.
    bool InsertRow(int x, int y, const char* elements, std::size_t size, std::size_t count);
    std::size_t CopyRow(int x, int y, char* elements, std::size_t size, bool* filled, std::size_t count);
    std::size_t FindRow(int x, int y, void** elements, std::size_t count) noexcept;
    std::size_t RemoveRow(int x, int y, std::size_t count) noexcept;

    std::size_t FindCells(const basalt::GridCell* cells, void** elements, std::size_t count) const noexcept;

    void Clear() noexcept;
    void Swap(SparseContents& other) noexcept;

    std::size_t Size() const noexcept { return m_elements.Size(); }
    std::size_t ElementSize() const noexcept { return m_elements.ElementSize(); }
    std::size_t ElementsPerChunk() const noexcept { return m_elements.ElementsPerChunk(); }
    const BlockGrid& Grid() const noexcept { return m_grid; }
    const std::vector<ListedBlock>& Blocks() const noexcept { return m_list; }
    const slRTree& Tree() const noexcept { return m_tree; }
    std::size_t FilledWords() const noexcept { return m_blocks.FilledWords(); }
    const std::uint64_t* Filled(CellBlock block) const noexcept {
        return block.Filled(m_blocks.CellsPerBlock());
    }

private:
    friend struct SparseInspector;

    struct RowPiece;
    template <class Step>
    void EachPiece(int x, int y, std::size_t count, Step step);
    void ReserveRow(int x, int y, std::size_t count);

    CellBlock FindBlock(BlockKey key) noexcept {
        const std::uint64_t wanted = packed(key);
        // Most calls are on neighbouring cells and end here.
        if (m_lastBlock && wanted == m_lastKey) {
            return m_lastBlock;
        }
        const CellBlock found = m_index.Find(key);
        if (found) {
            m_lastKey = wanted;
            m_lastBlock = found;
        }
        return found;
    }

    void InsertIntoNewBlock(int x, int y, const void* element);
    // Reserves memory for blocks everywhere but in the tree; EnterReservedBlock then cannot fail.
    void ReserveBlocks(std::size_t count);
    CellBlock EnterReservedBlock(BlockKey key) noexcept;
    void IndexNewestBlock() noexcept;
    void CopyBlockElements(const SparseContents& source, CellBlock from, CellBlock to);

    std::uint64_t& Word(CellBlock block, std::size_t cell) const noexcept {
        return block.Filled(m_blocks.CellsPerBlock())[cell / 64];
    }

    void Fill(CellBlock block, std::size_t cell, void* slot, const void* element) noexcept {
        CopyElement(slot, element);
        block.cells[cell] = slot;
        Word(block, cell) |= std::uint64_t{1} << cell % 64;
    }

    void CopyElement(void* to, const void* from) const noexcept {
        const std::size_t size = m_elements.ElementSize();
        // A call costs more than copying a small element; sizes start at 8 bytes. The source may be the
        // cell's own element.
        if (size > 64) {
            std::memmove(to, from, size);
            return;
        }
        char* const target = static_cast<char*>(to);
        const char* const source = static_cast<const char*>(from);
        std::uint64_t word = 0;
        for (std::size_t i = 0; i + sizeof word <= size; i += sizeof word) {
            std::memcpy(&word, source + i, sizeof word);
            std::memcpy(target + i, &word, sizeof word);
        }
        std::memcpy(&word, source + size - sizeof word, sizeof word);
        std::memcpy(target + size - sizeof word, &word, sizeof word);
    }

    BlockGrid m_grid;
    ElementPool m_elements;
    BlockPool m_blocks;
    BlockIndex m_index;
    std::vector<ListedBlock> m_list;  // in creation order; the position of a block is its identifier
    slRTree m_tree;
    std::uint64_t m_lastKey = 0;
    CellBlock m_lastBlock;
};

}  // namespace vex_util

#endif
