// Square blocks of cells and the memory they live in.
#ifndef BASALT_SRC_SPARSE_BLOCK_POOL_H
#define BASALT_SRC_SPARSE_BLOCK_POOL_H

#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

#include "src/sparse/slab.h"

namespace vex_util {

// A block: the cells' element pointers row by row, null for an empty cell, and behind them a bit for each
// filled cell. The pointers answer Find with one look; the bits let a visit of a thin block cost its elements
// and not its area. Cell i's bit is bit i % 64 of word i / 64.
struct Block {
    void** cells = nullptr;

    std::uint64_t* Filled(std::size_t cellsPerBlock) const noexcept {
        return reinterpret_cast<std::uint64_t*>(cells + cellsPerBlock);
    }
    explicit operator bool() const noexcept { return cells != nullptr; }
};

// Blocks of one size, carved from slabs and given back all at once.
class BlockPool {
public:
    explicit BlockPool(std::size_t cellsPerBlock) noexcept : m_cellsPerBlock(cellsPerBlock) {}
    ~BlockPool() = default;
    BlockPool(const BlockPool&) = delete;
    BlockPool& operator=(const BlockPool&) = delete;

    // Makes room for one block. Throws std::bad_alloc, with the pool as it was.
    void Reserve() {
        if (m_left == 0) {
            AddSlab();
        }
    }
    // A block of empty cells, for which room was made.
    Block TakeReserved() noexcept;
    void Clear() noexcept;

    std::size_t CellsPerBlock() const noexcept { return m_cellsPerBlock; }
    // 64-bit words of a block's `filled`.
    std::size_t FilledWords() const noexcept { return (m_cellsPerBlock + 63) / 64; }

    void Swap(BlockPool& other) noexcept {
        std::swap(m_cellsPerBlock, other.m_cellsPerBlock);
        std::swap(m_next, other.m_next);
        std::swap(m_left, other.m_left);
        std::swap(m_bytes, other.m_bytes);
        m_slabs.swap(other.m_slabs);
    }

private:
    std::size_t BlockBytes() const noexcept;
    void AddSlab();

    std::size_t m_cellsPerBlock;
    std::byte* m_next = nullptr;  // the newest slab's first byte not handed out
    std::size_t m_left = 0;       // blocks that still fit there
    std::size_t m_bytes = 0;
    std::vector<Slab> m_slabs;
};

}  // namespace vex_util

#endif
