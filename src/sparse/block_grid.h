// Which block a cell lies in, and where.
#ifndef BASALT_SRC_SPARSE_BLOCK_GRID_H
#define BASALT_SRC_SPARSE_BLOCK_GRID_H

#include <cstddef>
#include <cstdint>

#include "src/sparse/block_index.h"

namespace vex_util {

// The plane divided into blocks whose side is a power of two: a shift and a mask address every cell.
class BlockGrid {
public:
    // The side is rounded up to a power of two, at least 1. Sides above 2^31 count as 2^31: either way four
    // blocks cover the plane, and a block of that size can never be allocated.
    explicit BlockGrid(std::size_t side) noexcept {
        while (m_shift < 31 && Side() < side) {
            ++m_shift;
        }
    }

    std::size_t Side() const noexcept { return std::size_t{1} << m_shift; }
    std::size_t CellsPerBlock() const noexcept { return Side() << m_shift; }

    BlockKey KeyOf(int x, int y) const noexcept { return {x >> m_shift, y >> m_shift}; }

    // The index of the cell in its block, row by row.
    std::size_t CellOf(int x, int y) const noexcept { return (Offset(y) << m_shift) + Offset(x); }
    int X(BlockKey key, std::size_t cell) const noexcept { return Coordinate(key.bx, cell & (Side() - 1)); }
    int Y(BlockKey key, std::size_t cell) const noexcept { return Coordinate(key.by, cell >> m_shift); }

private:
    std::size_t Offset(int coordinate) const noexcept {
        return static_cast<std::uint32_t>(coordinate) & (Side() - 1);
    }
    int Coordinate(std::int32_t block, std::size_t offset) const noexcept {
        return static_cast<int>((static_cast<std::uint32_t>(block) << m_shift) +
                                static_cast<std::uint32_t>(offset));
    }

    unsigned m_shift = 0;
};

}  // namespace vex_util

#endif
