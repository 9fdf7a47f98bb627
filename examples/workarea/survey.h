// What the report says about the selected cells.
#ifndef WORKAREA_SURVEY_H
#define WORKAREA_SURVEY_H

#include <cstdint>
#include <optional>
#include <vector>

#include "work_area.h"

/// An elevation and the cell it stands in.
struct Extreme {
    double elevation = 0.0;
    int x = 0;
    int y = 0;
};

/// Measures in metres, square metres and cubic metres. Means are over the area.
struct Survey {
    std::int64_t visited = 0;     ///< cells of the selected blocks
    std::int64_t in_view = 0;     ///< of them in the view
    std::int64_t inside = 0;      ///< of them inside the boundary; everything below is about these
    std::int64_t with_slope = 0;  ///< of them with a slope
    double area = 0.0;
    Extreme lowest;
    Extreme highest;
    double mean_elevation = 0.0;
    double mean_slope = 0.0;  ///< rise over run
    double steepest = 0.0;    ///< rise over run
    double grade = 0.0;
    double cut = 0.0;   ///< volume above the grade
    double fill = 0.0;  ///< volume missing below it
};

/// Visits the selected blocks and measures the cells that lie in the view and inside the boundary (vertices
/// in the local plane; none: no boundary). Without a grade the mean elevation is taken, which needs a second
/// visit.
Survey survey_cells(WorkArea& area, const CellBox& view, const std::vector<geo_nee>& boundary,
                    std::optional<double> grade);

#endif
