#include "scan.h"

#include <algorithm>
#include <cmath>

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
