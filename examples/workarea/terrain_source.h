// What a terrain is before it is stored: a frame of cells, and rows of elevations from north to south.
#ifndef WORKAREA_TERRAIN_SOURCE_H
#define WORKAREA_TERRAIN_SOURCE_H

#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

/// Place and size of a grid of square cells, in degrees. Cell (0, 0) is the south-west one; x counts east, y
/// north.
struct GridFrame {
    int columns = 0;
    int rows = 0;
    double west = 0.0;       ///< western edge of the western cells, degrees
    double south = 0.0;      ///< southern edge of the southern cells, degrees
    double cell_size = 0.0;  ///< side of a cell, degrees

    std::int64_t cells() const { return std::int64_t{columns} * rows; }
    double east() const { return west + columns * cell_size; }
    double north() const { return south + rows * cell_size; }
    double centre_longitude(int x) const { return west + (x + 0.5) * cell_size; }
    double centre_latitude(int y) const { return south + (y + 0.5) * cell_size; }
};

/// No place on Earth is higher or lower, metres. A larger value is a marker such as -32768 that the header
/// does not declare.
inline constexpr double LARGEST_ELEVATION = 20'000.0;

/// Stands in a row for a cell without elevation.
inline constexpr double NO_ELEVATION = std::numeric_limits<double>::quiet_NaN();
inline bool has_elevation(double elevation) {
    return !std::isnan(elevation);
}

class TerrainSource {
public:
    virtual ~TerrainSource() = default;
    virtual const GridFrame& frame() const = 0;
    /// The next row's elevations in metres, west to east; rows come north to south. False after the last row.
    virtual bool next_row(std::vector<double>& elevations) = 0;
};

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
    std::vector<double> m_ridges;  // the hills' east-west profile, one value a column
};

#endif
