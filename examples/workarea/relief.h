// Elevations and light anywhere on a work area, for a picture of it.
#ifndef WORKAREA_RELIEF_H
#define WORKAREA_RELIEF_H

#include <cstddef>
#include <vector>

#include "work_area.h"

/// Samples of the whole grid: one a cell, or the mean of a square of cells where there are more than a
/// picture could show. Places are counted in cells from the grid's south-west corner, (0.5, 0.5) being the
/// middle of the first cell.
class Relief {
public:
    static constexpr int LARGEST_SIDE = 2048;  ///< samples

    /// Selects the whole grid and visits it.
    explicit Relief(WorkArea& area);

    double lowest() const { return m_lowest; }
    double highest() const { return m_highest; }

    /// Elevation at a place, metres: between the four samples around it, or where one of them is missing that
    /// of the nearest, which may be NO_ELEVATION.
    double elevation(double x, double y) const;

    /// Light that a place gets from the north-west, as a part of what level ground gets: 0 for none, up to
    /// 1.41. The law is Lambert's, with the sun at 45 degrees (Horn, 1981).
    double light(double x, double y) const;

private:
    double sample(int column, int row) const;

    int m_columns;
    int m_rows;
    double m_cells_per_sample;
    double m_metres_east;  // per sample
    double m_metres_north;
    double m_lowest;
    double m_highest;
    std::vector<float> m_samples;
};

#endif
