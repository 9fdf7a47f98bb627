#include "survey.h"

#include <algorithm>
#include <cmath>
#include <tuple>
#include <utility>

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

/// Selections consist of whole blocks: this filters their cells.
class CellFilter {
public:
    CellFilter(const CellBox& view, const std::vector<geo_nee>& boundary)
        : m_view(view), m_has_boundary(!boundary.empty()), m_boundary(boundary) {}

    bool in_view(int x, int y) const { return m_view.contains(x, y); }
    bool inside_boundary(const geo_nee& point) const { return !m_has_boundary || m_boundary.contains(point); }

private:
    const CellBox& m_view;
    bool m_has_boundary;
    basalt::PreparedPolygon m_boundary;
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

/// Volumes against a grade.
class Earthwork {
public:
    explicit Earthwork(double grade) : m_grade(grade) {}
    void add(double elevation, double cell_area) {
        const double above = elevation - m_grade;
        (above > 0.0 ? m_cut : m_fill).add(std::abs(above) * cell_area);
    }
    void store(Survey& survey) const {
        survey.grade = m_grade;
        survey.cut = m_cut.value();
        survey.fill = m_fill.value();
    }

private:
    double m_grade;
    ExactSum m_cut;
    ExactSum m_fill;
};

/// Area, elevations and slopes of the cells that count.
class Measures {
public:
    void add(int x, int y, const CellRecord& record, double cell_area) {
        ++m_cells;
        const double elevation = record.point.elevation;
        m_area.add(cell_area);
        m_elevation.add(elevation * cell_area);
        widen({elevation, x, y});
        if ((record.flags & CellRecord::SLOPE_UNKNOWN) == 0) {
            const auto slope = static_cast<double>(record.slope);
            ++m_with_slope;
            m_slope_area.add(cell_area);
            m_slope.add(slope * cell_area);
            m_steepest = std::max(m_steepest, slope);
        }
    }
    void store(Survey& survey) const {
        survey.inside = m_cells;
        survey.with_slope = m_with_slope;
        survey.area = m_area.value();
        survey.lowest = m_lowest;
        survey.highest = m_highest;
        survey.mean_elevation = m_cells > 0 ? m_elevation.value() / m_area.value() : 0.0;
        survey.mean_slope = m_with_slope > 0 ? m_slope.value() / m_slope_area.value() : 0.0;
        survey.steepest = m_steepest;
    }

private:
    /// Independent of the order of the visit: ties go to the southernmost, then westernmost cell.
    void widen(const Extreme& cell) {
        const auto place = [](const Extreme& e) { return std::tie(e.y, e.x); };
        const auto ties = [&](const Extreme& e) {
            return cell.elevation == e.elevation && place(cell) < place(e);
        };
        if (m_cells == 1 || cell.elevation < m_lowest.elevation || ties(m_lowest)) {
            m_lowest = cell;
        }
        if (m_cells == 1 || cell.elevation > m_highest.elevation || ties(m_highest)) {
            m_highest = cell;
        }
    }

    std::int64_t m_cells = 0;
    std::int64_t m_with_slope = 0;
    ExactSum m_area;
    ExactSum m_elevation;
    ExactSum m_slope_area;
    ExactSum m_slope;
    Extreme m_lowest;
    Extreme m_highest;
    double m_steepest = 0.0;
};

}  // namespace

Survey survey_cells(WorkArea& area, const CellBox& view, const std::vector<geo_nee>& boundary,
                    std::optional<double> grade) {
    const CellFilter filter(view, boundary);
    const RowAreas areas(area, view);
    Survey survey;
    survey.grade_given = grade.has_value();
    Measures measures;
    Earthwork earthwork(grade.value_or(0.0));
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
        measures.add(x, y, record, areas[y]);
        if (grade) {
            earthwork.add(record.point.elevation, areas[y]);
        }
    });
    measures.store(survey);
    if (!grade && survey.inside > 0) {
        earthwork = Earthwork(survey.mean_elevation);
        area.visit_selected([&](int x, int y, const CellRecord& record) {
            if (filter.in_view(x, y) && filter.inside_boundary(record.point)) {
                earthwork.add(record.point.elevation, areas[y]);
            }
        });
    }
    earthwork.store(survey);
    return survey;
}
