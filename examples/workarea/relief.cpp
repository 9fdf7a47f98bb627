#include "relief.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

namespace {

int sampled(int cells, int cells_per_sample) {
    return (cells + cells_per_sample - 1) / cells_per_sample;
}

}  // namespace

Relief::Relief(WorkArea& area)
    : m_lowest(std::numeric_limits<double>::infinity()), m_highest(-std::numeric_limits<double>::infinity()) {
    const GridFrame& frame = area.frame();
    const int side = sampled(std::max(frame.columns, frame.rows), LARGEST_SIDE);
    m_columns = sampled(frame.columns, side);
    m_rows = sampled(frame.rows, side);
    m_cells_per_sample = side;
    const geo_nee first = area.centre(0, 0, 0.0);
    m_metres_east = side * geo_horz_dist(first, area.centre(1, 0, 0.0));
    m_metres_north = side * geo_horz_dist(first, area.centre(0, 1, 0.0));

    const std::size_t count = static_cast<std::size_t>(m_columns) * static_cast<std::size_t>(m_rows);
    std::vector<std::int32_t> cells(count);
    m_samples.assign(count, 0.0F);
    area.select(whole_grid(frame));
    area.visit_selected([&](int x, int y, const CellRecord& record) {
        const std::size_t at = static_cast<std::size_t>(y / side) * static_cast<std::size_t>(m_columns) +
                               static_cast<std::size_t>(x / side);
        // The mean so far moves by its share, so that sums do not outgrow single precision.
        m_samples[at] +=
            (static_cast<float>(record.point.elevation) - m_samples[at]) / static_cast<float>(++cells[at]);
        m_lowest = std::min(m_lowest, record.point.elevation);
        m_highest = std::max(m_highest, record.point.elevation);
    });
    for (std::size_t i = 0; i < count; ++i) {
        if (cells[i] == 0) {
            m_samples[i] = static_cast<float>(NO_ELEVATION);
        }
    }
}

double Relief::sample(int column, int row) const {
    column = std::clamp(column, 0, m_columns - 1);
    row = std::clamp(row, 0, m_rows - 1);
    return static_cast<double>(m_samples[static_cast<std::size_t>(row) * static_cast<std::size_t>(m_columns) +
                                         static_cast<std::size_t>(column)]);
}

double Relief::elevation(double x, double y) const {
    const double column = std::floor(x / m_cells_per_sample - 0.5);
    const double row = std::floor(y / m_cells_per_sample - 0.5);
    const double east = x / m_cells_per_sample - 0.5 - column;
    const double north = y / m_cells_per_sample - 0.5 - row;
    const int i = static_cast<int>(column);
    const int j = static_cast<int>(row);
    const double between = (sample(i, j) * (1 - east) + sample(i + 1, j) * east) * (1 - north) +
                           (sample(i, j + 1) * (1 - east) + sample(i + 1, j + 1) * east) * north;
    return has_elevation(between) ? between : sample(i + (east < 0.5 ? 0 : 1), j + (north < 0.5 ? 0 : 1));
}

double Relief::light(double x, double y) const {
    const double step = m_cells_per_sample;
    const auto rise = [](double before, double after, double metres) {
        const double slope = (after - before) / metres;
        return std::isnan(slope) ? 0.0 : slope;
    };
    const double east = rise(elevation(x - step, y), elevation(x + step, y), 2 * m_metres_east);
    const double north = rise(elevation(x, y - step), elevation(x, y + step), 2 * m_metres_north);
    // The sun stands at (-1/2, 1/2, 1/sqrt 2): the ground's normal is (-east, -north, 1) by its length.
    constexpr double HALF_ROOT = 0.7071067811865476;
    const double towards_sun = (0.5 * east - 0.5 * north + HALF_ROOT) / std::hypot(east, north, 1.0);
    return std::max(0.0, towards_sun / HALF_ROOT);
}
