// The terrain as a sparse array of cell records.
#ifndef WORKAREA_WORK_AREA_H
#define WORKAREA_WORK_AREA_H

#include <basalt/geo.h>
#include <basalt/sparse.h>

#include <cstddef>
#include <cstdint>

#include "local_plane.h"
#include "terrain_source.h"

/// What is kept of a cell.
struct CellRecord {
    enum Flag : std::uint32_t {
        SLOPE_ONE_SIDED = 1,  ///< a neighbour is missing: the difference was taken to one side
        SLOPE_UNKNOWN = 2     ///< neighbours are missing on both sides: slope is 0 and means nothing
    };

    geo_nee point;  ///< cell centre in the local plane
    float slope;    ///< steepest rise over run, 0 upwards
    std::uint32_t flags;
};
static_assert(sizeof(CellRecord) == 32);

/// Cells from (west, south) to (east, north), both included.
struct CellBox {
    int west;
    int south;
    int east;
    int north;

    bool contains(int x, int y) const { return x >= west && x <= east && y >= south && y <= north; }
    std::int64_t cells() const { return (std::int64_t{east} - west + 1) * (std::int64_t{north} - south + 1); }
};

class WorkArea {
public:
    static constexpr int BLOCK_SIDE = 16;
    static constexpr std::size_t CELLS_PER_CHUNK = 64;
    static constexpr std::size_t BLOCK_BYTES = sizeof(void*) * BLOCK_SIDE * BLOCK_SIDE;

    /// An empty work area on the grid's frame; its plane has its origin in the middle of the grid.
    explicit WorkArea(const GridFrame& frame);

    const GridFrame& frame() const { return m_frame; }
    const LocalPlane& plane() const { return m_plane; }
    std::int64_t cells() const { return m_cells; }
    std::int64_t blocks() const { return m_blocks; }

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
        struct Context {
            Visit* visit;
        };
        const Context context = {&visit};
        m_array.IterateSelected(
            [](int x, int y, const void* element, const void* given) {
                (*static_cast<const Context*>(given)->visit)(x, y, *static_cast<const CellRecord*>(element));
                return true;
            },
            &context);
    }

private:
    GridFrame m_frame;
    LocalPlane m_plane;
    vex_util::Sparse2DArray m_array;
    std::int64_t m_cells = 0;
    std::int64_t m_blocks = 0;
};

#endif
