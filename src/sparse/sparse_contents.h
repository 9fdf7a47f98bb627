// What a sparse array keeps: elements, blocks and their index.
#ifndef BASALT_SRC_SPARSE_SPARSE_CONTENTS_H
#define BASALT_SRC_SPARSE_SPARSE_CONTENTS_H

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <vector>

#include "src/sparse/block_grid.h"
#include "src/sparse/block_index.h"
#include "src/sparse/block_pool.h"
#include "src/sparse/element_pool.h"
#include "src/sparse/rtree.h"

namespace vex_util {

// A value without a lock that is built aside and swapped in whole. An insertion that fails throws
// std::bad_alloc and leaves everything as it was: room is made everywhere first, then all is entered. A
// copy that fails leaves an object that is good for destruction alone.
class SparseContents {
public:
    struct ListedBlock {
        BlockKey key;
        Block block;
    };

    SparseContents(std::size_t elementSize, std::size_t blockSide, std::size_t elementsPerChunk)
        : m_grid(blockSide), m_elements(elementSize, elementsPerChunk), m_blocks(m_grid.CellsPerBlock()) {}

    // The same blocks under the same identifiers, empty ones among them, with copies of all elements.
    SparseContents(const SparseContents& source);
    SparseContents& operator=(const SparseContents&) = delete;

    // Into an empty object: copies of all elements, with only the blocks that hold one, in the source's
    // order.
    void CopyNonEmptyBlocks(const SparseContents& source);

    // Copies the element into the cell; true if that made a block.
    bool Insert(int x, int y, const void* element) {
        const Block block = FindBlock(m_grid.KeyOf(x, y));
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
        const Block block = FindBlock(m_grid.KeyOf(x, y));
        return block ? block.cells[m_grid.CellOf(x, y)] : nullptr;
    }

    bool Remove(int x, int y) noexcept {
        const Block block = FindBlock(m_grid.KeyOf(x, y));
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
        block.Filled(m_blocks.CellsPerBlock())[cell / 64] &= ~(std::uint64_t{1} << cell % 64);
        return true;
    }

    void Clear() noexcept;
    void Swap(SparseContents& other) noexcept;

    std::size_t ElementSize() const noexcept { return m_elements.ElementSize(); }
    std::size_t ElementsPerChunk() const noexcept { return m_elements.ElementsPerChunk(); }
    const BlockGrid& Grid() const noexcept { return m_grid; }
    const std::vector<ListedBlock>& Blocks() const noexcept { return m_list; }
    const slRTree& Tree() const noexcept { return m_tree; }
    std::size_t FilledWords() const noexcept { return m_blocks.FilledWords(); }
    const std::uint64_t* Filled(Block block) const noexcept { return block.Filled(m_blocks.CellsPerBlock()); }

    // Throws std::logic_error naming the first broken invariant. For tests and debug builds: it visits
    // everything.
    void CheckInvariants() const;

private:
    Block FindBlock(BlockKey key) noexcept {
        const std::uint64_t wanted = packed(key);
        // Neighbouring cells come one after the other, so most look-ups end here.
        if (m_lastBlock && wanted == m_lastKey) {
            return m_lastBlock;
        }
        const Block found = m_index.Find(key);
        if (found) {
            m_lastKey = wanted;
            m_lastBlock = found;
        }
        return found;
    }

    void InsertIntoNewBlock(int x, int y, const void* element);
    // Makes room for one block everywhere but in the tree; entering it then cannot fail.
    void ReserveBlock();
    Block EnterReservedBlock(BlockKey key) noexcept;
    void IndexNewestBlock() noexcept;
    void CopyBlockElements(const SparseContents& source, Block from, Block to);

    void Fill(Block block, std::size_t cell, void* slot, const void* element) noexcept {
        CopyElement(slot, element);
        block.cells[cell] = slot;
        block.Filled(m_blocks.CellsPerBlock())[cell / 64] |= std::uint64_t{1} << cell % 64;
    }

    void CopyElement(void* to, const void* from) const noexcept {
        const std::size_t size = m_elements.ElementSize();
        // A call costs more than copying a small record; sizes start at eight bytes.
        if (size > 64) {
            std::memcpy(to, from, size);
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
    std::vector<ListedBlock> m_list;  // in creation order; a block's place in it is its identifier
    slRTree m_tree;
    std::uint64_t m_lastKey = 0;
    Block m_lastBlock;
};

}  // namespace vex_util

#endif
