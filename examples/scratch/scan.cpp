#include "scan.h"

#include <algorithm>
#include <cmath>

std::uint64_t fingerprint(const Point& point) {
    std::uint64_t mixed =
        (static_cast<std::uint64_t>(point.row) << 32 | static_cast<std::uint32_t>(point.column));
    mixed = mixed * 0x9E3779B97F4A7C15U + (static_cast<std::uint64_t>(point.up) << 32 | point.index);
    mixed = (mixed ^ mixed >> 29) * 0xBF58476D1CE4E5B9U;
    return mixed ^ mixed >> 32;
}

Scan::Scan(std::int64_t points)
    : m_points(points),
      m_side(std::max(1, static_cast<std::int32_t>(std::sqrt(static_cast<double>(points) / 4)))) {}

std::int32_t Scan::draw(std::int32_t below) {
    m_state = m_state * 16807 % 2147483647;
    return static_cast<std::int32_t>(m_state % static_cast<std::uint64_t>(below));
}

Point Scan::next() {
    const std::int32_t north = draw(m_side * CELL);
    const std::int32_t east = draw(m_side * CELL);
    const std::int32_t growth = draw(2000);
    return {north / CELL, east / CELL, north / 50 + growth, m_index++};
}
