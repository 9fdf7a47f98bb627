#include "survey.h"

#include <algorithm>
#include <tuple>

#include "progress.h"

namespace {

/// A selection comes as whole blocks: this says which of their cells count.
class CellFilter {
public:
    CellFilter(const CellBox& view, const std::vector<geo_nee>& boundary)
        : m_view(view), m_boundary(boundary) {}

    bool in_view(int x, int y) const { return m_view.contains(x, y); }
    bool inside_boundary(const geo_nee& point) const {
        return m_boundary.empty() ||
               geo_point_in_poly(static_cast<int>(m_boundary.size()), m_boundary.data(), &point) == 1;
    }

private:
    const CellBox& m_view;
    const std::vector<geo_nee>& m_boundary;
};

/// Area of a cell by row, for the view's rows.
class RowAreas {
public:
    RowAreas(const WorkArea& area, const CellBox& view) : m_south(view.south) {
        for (int y = view.south; y <= view.north; ++y) {
            m_areas.push_back(area.cell_area(y));
        }
    }
    double operator[](int y) const { return m_areas[static_cast<std::size_t>(y - m_south)]; }

private:
    int m_south;
    std::vector<double> m_areas;
};

/// The visit's order is the array's business; ties go to the southernmost, then westernmost cell.
void widen(Survey& survey, const Extreme& cell) {
    const auto place = [](const Extreme& e) { return std::tie(e.y, e.x); };
    const bool first = survey.inside == 1;
    Extreme& lowest = survey.lowest;
    Extreme& highest = survey.highest;
    if (first || cell.elevation < lowest.elevation ||
        (cell.elevation == lowest.elevation && place(cell) < place(lowest))) {
        lowest = cell;
    }
    if (first || cell.elevation > highest.elevation ||
        (cell.elevation == highest.elevation && place(cell) < place(highest))) {
        highest = cell;
    }
}

void add_earthwork(Survey& survey, double elevation, double cell_area) {
    const double above = elevation - survey.grade;
    (above > 0.0 ? survey.cut : survey.fill) += (above > 0.0 ? above : -above) * cell_area;
}

}  // namespace

Survey survey_cells(WorkArea& area, const CellBox& view, const std::vector<geo_nee>& boundary,
                    std::optional<double> grade) {
    const CellFilter filter(view, boundary);
    const RowAreas areas(area, view);
    Survey survey;
    survey.grade_given = grade.has_value();
    survey.grade = grade.value_or(0.0);
    double elevation_sum = 0.0;
    double slope_sum = 0.0;
    double slope_area = 0.0;
    std::pair<int, int> block;  // blocks come whole, one after the other
    Progress progress("Visiting", std::min(area.cells(), view.cells()));
    area.visit_selected([&](int x, int y, const CellRecord& record) {
        const std::pair<int, int> cell_block(x / WorkArea::BLOCK_SIDE, y / WorkArea::BLOCK_SIDE);
        if (survey.visited++ == 0 || cell_block != block) {
            block = cell_block;
            ++survey.blocks;
            progress.update(survey.in_view);
        }
        if (!filter.in_view(x, y)) {
            return;
        }
        ++survey.in_view;
        if (!filter.inside_boundary(record.point)) {
            return;
        }
        ++survey.inside;
        const double cell_area = areas[y];
        const double elevation = record.point.elevation;
        survey.area += cell_area;
        elevation_sum += elevation * cell_area;
        widen(survey, {elevation, x, y});
        if ((record.flags & CellRecord::SLOPE_UNKNOWN) == 0) {
            const auto slope = static_cast<double>(record.slope);
            ++survey.with_slope;
            slope_area += cell_area;
            slope_sum += slope * cell_area;
            survey.steepest = std::max(survey.steepest, slope);
        }
        if (grade) {
            add_earthwork(survey, elevation, cell_area);
        }
    });
    if (survey.inside == 0) {
        return survey;
    }
    survey.mean_elevation = elevation_sum / survey.area;
    survey.mean_slope = slope_area > 0.0 ? slope_sum / slope_area : 0.0;
    if (!grade) {
        survey.grade = survey.mean_elevation;
        area.visit_selected([&](int x, int y, const CellRecord& record) {
            if (filter.in_view(x, y) && filter.inside_boundary(record.point)) {
                add_earthwork(survey, record.point.elevation, areas[y]);
            }
        });
    }
    return survey;
}
