// Square blocks of cells and their memory.
#ifndef BASALT_SRC_SPARSE_BLOCK_POOL_H
#define BASALT_SRC_SPARSE_BLOCK_POOL_H

#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

#include "src/sparse/slab.h"

namespace vex_util {

// The cells' element pointers row by row, null for an empty cell, followed by one bit per cell that is set if
// it is filled: Find reads the pointers, a visit of a thin block the bits. Cell i has bit i % 64 of word
// i / 64.
struct CellBlock {
    void** cells = nullptr;

    std::uint64_t* Filled(std::size_t cellsPerBlock) const noexcept {
        return reinterpret_cast<std::uint64_t*>(cells + cellsPerBlock);
    }
    explicit operator bool() const noexcept { return cells != nullptr; }
};

// Blocks of one size, allocated in slabs and released all at once.
class BlockPool {
public:
    explicit BlockPool(std::size_t cellsPerBlock) noexcept : m_cellsPerBlock(cellsPerBlock) {}
    ~BlockPool() = default;
    BlockPool(const BlockPool&) = delete;
    BlockPool& operator=(const BlockPool&) = delete;

    // Makes the next `count` calls of Take() sure to succeed. Throws std::bad_alloc; some slabs may then be
    // reserved.
    void Reserve(std::size_t count) {
        while (m_spare < count) {
            AddSlab();
        }
    }
    // Frees the slabs that no block was taken of.
    void ReleaseReserved() noexcept;
    // A reserved block, with all cells empty.
    CellBlock Take() noexcept;
    void Clear() noexcept;

    std::size_t CellsPerBlock() const noexcept { return m_cellsPerBlock; }
    // 64-bit words of a block's bits.
    std::size_t FilledWords() const noexcept { return (m_cellsPerBlock + 63) / 64; }

    void Swap(BlockPool& other) noexcept {
        std::swap(m_cellsPerBlock, other.m_cellsPerBlock);
        std::swap(m_next, other.m_next);
        std::swap(m_left, other.m_left);
        std::swap(m_spare, other.m_spare);
        std::swap(m_bytes, other.m_bytes);
        std::swap(m_opened, other.m_opened);
        m_slabs.swap(other.m_slabs);
    }

private:
    std::size_t BlockBytes() const noexcept;
    void AddSlab();

    std::size_t m_cellsPerBlock;
    std::byte* m_next = nullptr;  // the next block of the slab opened last
    std::size_t m_left = 0;       // blocks left in it
    std::size_t m_spare = 0;      // blocks left in all slabs
    std::size_t m_bytes = 0;      // of all slabs
    std::size_t m_opened = 0;     // slabs behind these are reserved
    std::vector<Slab> m_slabs;
};

}  // namespace vex_util

#endif
