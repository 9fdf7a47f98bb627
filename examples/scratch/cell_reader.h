// Cells out of sorted points.
#ifndef SCRATCH_CELL_READER_H
#define SCRATCH_CELL_READER_H

#include <cstdint>

#include "point_store.h"

/// One cell that has points; heights in millimetres.
struct Cell {
    std::int32_t row;
    std::int32_t column;
    std::int64_t points;
    std::int32_t lowest;
    std::int32_t median;  ///< of an even number, the lower of the two in the middle
    std::int32_t highest;
};

/// Reads cell after cell of a store whose points are in order.
class CellReader {
public:
    explicit CellReader(const PointStore& store) : m_store(store) {}

    /// False after the last.
    bool next(Cell& cell);

private:
    const PointStore& m_store;
    std::int64_t m_next = 0;
};

#endif
