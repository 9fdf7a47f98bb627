// A generated laser scan: its points, and the order of the job.
#ifndef SCRATCH_SCAN_H
#define SCRATCH_SCAN_H

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

/// Points scattered over a square site of about four points a square metre, on ground that rises by one in
/// fifty to the north with up to two metres of growth on it. The same points in every run, drawn with the
/// minimal standard generator (Park and Miller, 1988), so that other programs can draw them too.
class Scan {
public:
    static constexpr std::int64_t MOST_POINTS = 400'000'000;
    static constexpr std::int32_t CELL = 1000;  ///< millimetres

    explicit Scan(std::int64_t points);

    std::int64_t points() const { return m_points; }
    /// Cells along a side of the site.
    std::int32_t side() const { return m_side; }
    /// The next point; called `points()` times at most.
    Point next();

private:
    std::int32_t draw(std::int32_t below);

    std::int64_t m_points;
    std::int32_t m_side;
    std::uint64_t m_state = 1;
    std::uint32_t m_index = 0;
};

#endif
