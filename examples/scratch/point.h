// One measured point, and the order of the job.
#ifndef SCRATCH_POINT_H
#define SCRATCH_POINT_H

#include <compare>
#include <cstdint>

/// A point of the scan, in whole millimetres and assigned to its cell: points sort by row, then column,
/// then height, so that a cell's points come together with their median in the middle.
struct Point {
    std::int32_t row;
    std::int32_t column;
    std::int32_t up;      ///< millimetres
    std::uint32_t index;  ///< place in the scan, which makes the order of equal heights the same every time

    friend auto operator<=>(const Point&, const Point&) = default;
};
static_assert(sizeof(Point) == 16);

/// An order-independent checksum of points.
inline std::uint64_t fingerprint(const Point& point) {
    std::uint64_t mixed =
        (static_cast<std::uint64_t>(point.row) << 32 | static_cast<std::uint32_t>(point.column));
    mixed = mixed * 0x9E3779B97F4A7C15U + (static_cast<std::uint64_t>(point.up) << 32 | point.index);
    mixed = (mixed ^ mixed >> 29) * 0xBF58476D1CE4E5B9U;
    return mixed ^ mixed >> 32;
}

#endif
