#include "terrain_loader.h"

#include <chrono>
#include <cmath>
#include <cstddef>
#include <utility>
#include <vector>

#include "progress.h"

namespace {

using Clock = std::chrono::steady_clock;

double seconds_since(Clock::time_point& start) {
    const Clock::time_point now = Clock::now();
    return std::chrono::duration<double>(now - std::exchange(start, now)).count();
}

struct Gradient {
    double rise = 0.0;  // per metre
    std::uint32_t flags = 0;
};

/// Rise per metre along one axis at `here`, from its neighbours a step before and a step after it.
Gradient gradient(double before, double here, double after, double step) {
    const int steps = (has_elevation(before) ? 1 : 0) + (has_elevation(after) ? 1 : 0);
    if (steps == 0) {
        return {0.0, CellRecord::SLOPE_UNKNOWN};
    }
    const double rise = (has_elevation(after) ? after : here) - (has_elevation(before) ? before : here);
    return {rise / (steps * step), steps == 2 ? 0U : CellRecord::SLOPE_ONE_SIDED};
}

void store_row(WorkArea& area, int y, const std::vector<double>& north, const std::vector<double>& row,
               const std::vector<double>& south) {
    const int middle = area.frame().columns / 2;
    const geo_nee first = area.centre(middle, y, 0.0);
    const double step_east = geo_horz_dist(first, area.centre(middle + 1, y, 0.0));
    const double step_north = geo_horz_dist(first, area.centre(middle, y + 1, 0.0));
    const std::size_t columns = row.size();
    for (std::size_t i = 0; i < columns; ++i) {
        if (!has_elevation(row[i])) {
            continue;
        }
        const Gradient east = gradient(i > 0 ? row[i - 1] : NO_ELEVATION, row[i],
                                       i + 1 < columns ? row[i + 1] : NO_ELEVATION, step_east);
        const Gradient up = gradient(south[i], row[i], north[i], step_north);
        CellRecord record = {};
        const int x = static_cast<int>(i);
        record.point = area.centre(x, y, row[i]);
        record.flags = east.flags | up.flags;
        if ((record.flags & CellRecord::SLOPE_UNKNOWN) == 0) {
            record.slope = static_cast<float>(std::sqrt(east.rise * east.rise + up.rise * up.rise));
        }
        area.insert(x, y, record);
    }
}

}  // namespace

LoadTimes load_terrain(TerrainSource& source, WorkArea& area) {
    LoadTimes times;
    const int rows = source.frame().rows;
    Progress progress("Loading", rows);
    Clock::time_point start = Clock::now();
    std::vector<double> row;
    source.next_row(row);
    std::vector<double> north(row.size(), NO_ELEVATION);
    std::vector<double> south;
    for (int y = rows - 1; y >= 0; --y) {
        if (!source.next_row(south)) {
            south.assign(row.size(), NO_ELEVATION);
        }
        times.read += seconds_since(start);
        store_row(area, y, north, row, south);
        times.store += seconds_since(start);
        north.swap(row);
        row.swap(south);
        progress.update(rows - y);
    }
    return times;
}
