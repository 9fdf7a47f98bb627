#include "terrain_source.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace {

/// One wave over so many cells. Columns and rows take different lengths, so no two hills are alike.
double wave(int cell, double length) {
    return std::sin(2.0 * std::numbers::pi * (cell + 0.5) / length);
}

}  // namespace

SyntheticTerrain::SyntheticTerrain(std::int64_t cells) : m_cells_left(cells) {
    const auto columns = static_cast<std::int64_t>(std::ceil(std::sqrt(static_cast<double>(cells))));
    m_frame.columns = static_cast<int>(columns);
    m_frame.rows = static_cast<int>((cells + columns - 1) / columns);
    m_frame.west = -84.0;
    m_frame.south = 36.5;
    m_frame.cell_size = 1e-5;
    for (int x = 0; x < m_frame.columns; ++x) {
        m_ridges.push_back(66.0 * wave(x, 1370.0));
    }
}

bool SyntheticTerrain::next_row(std::vector<double>& elevations) {
    if (m_rows_made == m_frame.rows) {
        return false;
    }
    const double ridge = wave(m_rows_made, 1130.0);
    ++m_rows_made;
    elevations.assign(m_ridges.size(), NO_ELEVATION);
    const std::int64_t filled = std::min<std::int64_t>(m_cells_left, m_frame.columns);
    for (std::size_t x = 0; x < static_cast<std::size_t>(filled); ++x) {
        elevations[x] = 300.0 + m_ridges[x] * ridge;
    }
    m_cells_left -= filled;
    return true;
}
