// The terrain as a sparse array of cell records.
#ifndef WORKAREA_WORK_AREA_H
#define WORKAREA_WORK_AREA_H

#include <basalt/geo.h>
#include <basalt/sparse.h>

#include <cstdint>

#include "terrain_source.h"

/// A plane of metres north and east that touches the WGS84 ellipsoid at an origin, all other places dropped
/// on it along the origin's plumb line.
///
/// Lengths at the origin are true. Towards or away from it they come out short by about d^2 / 2 R^2 at a
/// distance d: 1 ppm at 9 km, 120 ppm at 100 km; lengths across that direction stay true to the second order.
/// Lengths are those on the ellipsoid: 500 m above it the ground is 78 ppm longer.
class LocalPlane {
public:
    /// Origin in degrees.
    LocalPlane(double longitude, double latitude);

    /// Grid point of a place in degrees. Its elevation is the place's own, in metres, not what is left above
    /// the plane: that falls away with the earth's curvature, 8 cm at 1 km, and heights are what earthwork
    /// counts.
    geo_nee to_grid(double longitude, double latitude, double elevation) const;

    /// How much too short lengths towards the origin are at a place in degrees: 0 at the origin.
    double shortening(double longitude, double latitude) const;

private:
    geo_nee local(double longitude, double latitude) const;

    basalt::LocalFrame m_frame;
};

/// What is kept of a cell.
struct CellRecord {
    geo_nee point;  ///< cell centre in the local plane
    float slope;    ///< steepest rise over run; NaN where neighbours are missing on both sides
};

/// Cells from (west, south) to (east, north), both included.
struct CellBox {
    int west;
    int south;
    int east;
    int north;

    bool contains(int x, int y) const { return x >= west && x <= east && y >= south && y <= north; }
    std::int64_t cells() const { return (std::int64_t{east} - west + 1) * (std::int64_t{north} - south + 1); }
};

/// A rectangle in the terrain's own coordinates, degrees.
struct DegreeBox {
    double west;
    double south;
    double east;
    double north;
};

/// All cells of the grid.
inline CellBox whole_grid(const GridFrame& frame) {
    return {0, 0, frame.columns - 1, frame.rows - 1};
}

/// The cells of the grid whose centres lie in the view, its edges included. InputError when there is none.
CellBox cells_in_view(const GridFrame& frame, const DegreeBox& view);

class WorkArea {
public:
    /// An empty work area on the grid's frame; its plane has its origin in the middle of the grid.
    explicit WorkArea(const GridFrame& frame);

    const GridFrame& frame() const { return m_frame; }
    const LocalPlane& plane() const { return m_plane; }
    std::int64_t cells() const { return m_cells; }

    /// Centre of cell (x, y) in the local plane.
    geo_nee centre(int x, int y, double elevation) const;
    /// Area of each cell of row y, square metres.
    double cell_area(int y) const;

    /// Stores a cell that is not yet stored.
    void insert(int x, int y, const CellRecord& record);

    /// Selects the blocks that meet the box; false when there is none.
    bool select(const CellBox& box);

    /// Calls visit(x, y, const CellRecord&) for every cell of the selected blocks, inside the box or not.
    template <typename Visit>
    void visit_selected(Visit visit) {
        Visit* const at = &visit;
        m_array.IterateSelected(
            [](int x, int y, const void* element, const void* given) {
                Visit* const target = *static_cast<Visit* const*>(given);
                (*target)(x, y, *static_cast<const CellRecord*>(element));
                return true;
            },
            &at);
    }

private:
    GridFrame m_frame;
    LocalPlane m_plane;
    vex_util::Sparse2DArray m_array;
    std::int64_t m_cells = 0;
};

/// Stores every cell of the source that has an elevation. Three rows are held at a time, so beyond the work
/// area itself memory does not depend on the number of rows.
///
/// Slopes are central differences over the four neighbours, the scheme of Fleming and Hoffer (1979) and of
/// Zevenbergen and Thorne (1987); at an edge or beside a missing cell the difference is taken to one side.
void load_terrain(TerrainSource& source, WorkArea& area);

#endif
