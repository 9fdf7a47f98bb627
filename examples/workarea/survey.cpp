#include "survey.h"

#include <algorithm>
#include <cmath>
#include <tuple>

#include "progress.h"

namespace {

/// Compensated sum: the error does not grow with the number of terms. A plain sum over 100 million cells
/// leaves tens of cubic metres between a cut and a fill that must be equal. Source: Neumaier, 1974.
class ExactSum {
public:
    void add(double term) {
        const double sum = m_sum + term;
        m_lost += std::abs(m_sum) >= std::abs(term) ? (m_sum - sum) + term : (term - sum) + m_sum;
        m_sum = sum;
    }
    double value() const { return m_sum + m_lost; }

private:
    double m_sum = 0.0;
    double m_lost = 0.0;
};

}  // namespace

Survey survey_cells(WorkArea& area, const CellBox& view, const std::vector<geo_nee>& boundary,
                    std::optional<double> grade) {
    const basalt::PreparedPolygon polygon(boundary);
    const auto is_inside = [&](const geo_nee& point) { return boundary.empty() || polygon.contains(point); };
    std::vector<double> row_areas;  // of a cell, by row of the view
    for (int y = view.south; y <= view.north; ++y) {
        row_areas.push_back(area.cell_area(y));
    }
    const auto area_of = [&](int y) { return row_areas[static_cast<std::size_t>(y - view.south)]; };
    ExactSum cut;
    ExactSum fill;
    const auto add_earthwork = [&](double above, double cell_area) {
        (above > 0.0 ? cut : fill).add(std::abs(above) * cell_area);
    };

    Survey survey;
    ExactSum areas;
    ExactSum elevations;
    ExactSum slope_areas;
    ExactSum slopes;
    Progress progress("Visiting", std::min(area.cells(), view.cells()));
    area.visit_selected([&](int x, int y, const CellRecord& record) {
        if (++survey.visited % 4096 == 0) {
            progress.update(survey.in_view);
        }
        // Selections consist of whole blocks.
        if (!view.contains(x, y)) {
            return;
        }
        ++survey.in_view;
        if (!is_inside(record.point)) {
            return;
        }
        const double elevation = record.point.elevation;
        const double cell_area = area_of(y);
        const bool is_first = survey.inside++ == 0;
        areas.add(cell_area);
        elevations.add(elevation * cell_area);
        // Independent of the order of the visit: ties go to the southernmost, then westernmost cell.
        if (is_first ||
            std::tie(elevation, y, x) < std::tie(survey.lowest.elevation, survey.lowest.y, survey.lowest.x)) {
            survey.lowest = {elevation, x, y};
        }
        if (is_first || std::tie(survey.highest.elevation, y, x) <
                            std::tie(elevation, survey.highest.y, survey.highest.x)) {
            survey.highest = {elevation, x, y};
        }
        const auto slope = static_cast<double>(record.slope);
        if (!std::isnan(slope)) {
            ++survey.with_slope;
            slope_areas.add(cell_area);
            slopes.add(slope * cell_area);
            survey.steepest = std::max(survey.steepest, slope);
        }
        if (grade) {
            add_earthwork(elevation - *grade, cell_area);
        }
    });
    survey.area = areas.value();
    survey.mean_elevation = survey.inside > 0 ? elevations.value() / survey.area : 0.0;
    survey.mean_slope = survey.with_slope > 0 ? slopes.value() / slope_areas.value() : 0.0;
    survey.grade = grade.value_or(survey.mean_elevation);
    if (!grade && survey.inside > 0) {
        area.visit_selected([&](int x, int y, const CellRecord& record) {
            if (view.contains(x, y) && is_inside(record.point)) {
                add_earthwork(record.point.elevation - survey.grade, area_of(y));
            }
        });
    }
    survey.cut = cut.value();
    survey.fill = fill.value();
    return survey;
}
