#include <cmath>
#include <cstddef>
#include <limits>
#include <vector>

#include "progress.h"
#include "work_area.h"

namespace {

/// Rise per metre along one axis at `here`, from its neighbours a step before and a step after it; NaN when
/// both are missing.
double gradient(double before, double here, double after, double step) {
    const int steps = (has_elevation(before) ? 1 : 0) + (has_elevation(after) ? 1 : 0);
    if (steps == 0) {
        return std::numeric_limits<double>::quiet_NaN();
    }
    const double rise = (has_elevation(after) ? after : here) - (has_elevation(before) ? before : here);
    return rise / (steps * step);
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
        const double east = gradient(i > 0 ? row[i - 1] : NO_ELEVATION, row[i],
                                     i + 1 < columns ? row[i + 1] : NO_ELEVATION, step_east);
        const double up = gradient(south[i], row[i], north[i], step_north);
        const int x = static_cast<int>(i);
        area.insert(x, y, {area.centre(x, y, row[i]), static_cast<float>(std::sqrt(east * east + up * up))});
    }
}

}  // namespace

void load_terrain(TerrainSource& source, WorkArea& area) {
    const int rows = source.frame().rows;
    Progress progress("Loading", rows);
    std::vector<double> row;
    source.next_row(row);
    std::vector<double> north(row.size(), NO_ELEVATION);
    std::vector<double> south;
    for (int y = rows - 1; y >= 0; --y) {
        if (!source.next_row(south)) {
            south.assign(row.size(), NO_ELEVATION);
        }
        store_row(area, y, north, row, south);
        north.swap(row);
        row.swap(south);
        progress.update(rows - y);
    }
}
