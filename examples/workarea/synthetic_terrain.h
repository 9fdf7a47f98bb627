// A generated terrain of any size, for measuring.
#ifndef WORKAREA_SYNTHETIC_TERRAIN_H
#define WORKAREA_SYNTHETIC_TERRAIN_H

#include <cstdint>
#include <vector>

#include "terrain_source.h"

/// Smooth hills between 230 and 370 m over a nearly square grid of cells of 0.00001 degrees, the same on
/// every run. Exactly `cells` cells have an elevation: the southernmost row may end early.
class SyntheticTerrain : public TerrainSource {
public:
    static constexpr std::int64_t LARGEST = 100'000'000;

    /// cells: 1 to LARGEST.
    explicit SyntheticTerrain(std::int64_t cells);

    const GridFrame& frame() const override { return m_frame; }
    bool next_row(std::vector<double>& elevations) override;

private:
    GridFrame m_frame;
    std::int64_t m_cells_left;
    int m_rows_made = 0;
    std::vector<double> m_ridges;  // the hills' east-west profiles, one value a column
    std::vector<double> m_knolls;
};

#endif
