#include "work_area.h"

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
    const geo_nee south_west = m_plane.to_grid(west, south, 0.0);
    const geo_nee south_east = m_plane.to_grid(east, south, 0.0);
    const geo_nee north_west = m_plane.to_grid(west, north, 0.0);
    const geo_nee north_east = m_plane.to_grid(east, north, 0.0);
    return geo_triangle_area(south_west, south_east, north_east) +
           geo_triangle_area(south_west, north_east, north_west);
}

void WorkArea::insert(int x, int y, const CellRecord& record) {
    m_array.Insert(x, y, &record);
    ++m_cells;
    // The array raises this flag whenever it makes a block, which counts them without a table of our own.
    if (m_array.IsSelectionDirty()) {
        ++m_blocks;
        m_array.SetSelectionDirty(false);
    }
}

bool WorkArea::select(const CellBox& box) {
    const int min[2] = {box.west, box.south};
    const int max[2] = {box.east, box.north};
    return m_array.Select(min, max);
}
