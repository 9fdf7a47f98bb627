#include "work_area.h"

#include <cstddef>
#include <iterator>

#include "input_error.h"

namespace {

constexpr double SEMI_MAJOR_AXIS = 6378137.0;  // WGS84, metres
constexpr int BLOCK_SIDE = 16;                 // cells
constexpr std::size_t CELLS_PER_CHUNK = 64;

geo_llh on_ellipsoid(double longitude, double latitude) {
    // The library refuses the all-zero record. This height vanishes in the rounding of a coordinate.
    constexpr double NO_HEIGHT = 1e-10;
    return {_degtorad(latitude), _degtorad(longitude), latitude == 0 && longitude == 0 ? NO_HEIGHT : 0.0};
}

}  // namespace

LocalPlane::LocalPlane(double longitude, double latitude) : m_frame(on_ellipsoid(longitude, latitude)) {}

geo_nee LocalPlane::local(double longitude, double latitude) const {
    return m_frame.to_local(on_ellipsoid(longitude, latitude));
}

geo_nee LocalPlane::to_grid(double longitude, double latitude, double elevation) const {
    geo_nee point = local(longitude, latitude);
    point.elevation = elevation;
    return point;
}

double LocalPlane::shortening(double longitude, double latitude) const {
    // The plumb lines of place and origin meet at an angle; 1 less its cosine is the drop over the radius.
    return -local(longitude, latitude).elevation / SEMI_MAJOR_AXIS;
}

CellBox cells_in_view(const GridFrame& frame, const DegreeBox& view) {
    if (view.west >= frame.east() || view.east <= frame.west || view.south >= frame.north() ||
        view.north <= frame.south) {
        throw InputError("--view lies outside the grid, which is " + std::to_string(frame.west) + "," +
                         std::to_string(frame.south) + "," + std::to_string(frame.east()) + "," +
                         std::to_string(frame.north()));
    }
    // First of `count` cells that does not lie before an edge; count if all do.
    const auto first_not = [](int count, auto before) {
        int low = 0;
        while (low < count) {
            const int middle = low + (count - low) / 2;
            if (before(middle)) {
                low = middle + 1;
            } else {
                count = middle;
            }
        }
        return low;
    };
    const CellBox box = {
        first_not(frame.columns, [&](int x) { return frame.centre_longitude(x) < view.west; }),
        first_not(frame.rows, [&](int y) { return frame.centre_latitude(y) < view.south; }),
        first_not(frame.columns, [&](int x) { return frame.centre_longitude(x) <= view.east; }) - 1,
        first_not(frame.rows, [&](int y) { return frame.centre_latitude(y) <= view.north; }) - 1};
    if (box.west > box.east || box.south > box.north) {
        throw InputError("--view is too small: no cell centre lies in it");
    }
    return box;
}

WorkArea::WorkArea(const GridFrame& frame)
    : m_frame(frame),
      m_plane(0.5 * (frame.west + frame.east()), 0.5 * (frame.south + frame.north())),
      m_array(sizeof(CellRecord), BLOCK_SIDE, CELLS_PER_CHUNK) {}

geo_nee WorkArea::centre(int x, int y, double elevation) const {
    return m_plane.to_grid(m_frame.centre_longitude(x), m_frame.centre_latitude(y), elevation);
}

double WorkArea::cell_area(int y) const {
    const double south = m_frame.south + y * m_frame.cell_size;
    const double north = m_frame.south + (y + 1) * m_frame.cell_size;
    // The row's cells are equal on the ellipsoid; in the plane the middle one is the least shortened.
    const double west = m_frame.west + (m_frame.columns / 2) * m_frame.cell_size;
    const double east = m_frame.west + (m_frame.columns / 2 + 1) * m_frame.cell_size;
    const geo_nee corners[] = {m_plane.to_grid(west, south, 0.0), m_plane.to_grid(west, north, 0.0),
                               m_plane.to_grid(east, north, 0.0), m_plane.to_grid(east, south, 0.0)};
    return basalt::polygon_area(corners, std::size(corners));
}

void WorkArea::insert(int x, int y, const CellRecord& record) {
    m_array.Insert(x, y, &record);
    ++m_cells;
}

bool WorkArea::select(const CellBox& box) {
    const int min[2] = {box.west, box.south};
    const int max[2] = {box.east, box.north};
    return m_array.Select(min, max);
}
