// Points against polygons and lines: whole outlines are one item, points are broadcast against them.
#include <vector>

#include "basalt/geo.h"
#include "universal.h"

namespace basalt_python {

namespace {

double number_at(const char* place) {
    return *reinterpret_cast<const double*>(place);
}

// Arguments: point's north and east, the outline's norths and easts, and a tolerance where there is one.
// Usually one outline meets many points: it is copied only when it changes.
template <bool HAS_TOLERANCE, class Test>
void each_point(char** arguments, const npy_intp* sizes, const npy_intp* steps, void*) {
    as_python_error([&] {
        constexpr int OUT = HAS_TOLERANCE ? 5 : 4;
        constexpr int CORE = OUT + 1;  // where the steps inside the outline's arrays stand
        const npy_intp vertices = sizes[1];
        if (vertices > 2'147'483'647) {
            throw std::length_error("an outline has at most 2147483647 vertices");
        }
        std::vector<geo_nee> outline(static_cast<std::size_t>(vertices));
        for (npy_intp i = 0; i < sizes[0]; ++i) {
            if (i == 0 || steps[2] != 0 || steps[3] != 0) {
                for (npy_intp v = 0; v < vertices; ++v) {
                    outline[static_cast<std::size_t>(v)] = {
                        number_at(arguments[2] + i * steps[2] + v * steps[CORE]),
                        number_at(arguments[3] + i * steps[3] + v * steps[CORE + 1]), 0};
                }
            }
            const geo_nee point{number_at(arguments[0] + i * steps[0]),
                                number_at(arguments[1] + i * steps[1]), 0};
            const double tolerance = HAS_TOLERANCE ? number_at(arguments[4] + i * steps[4]) : 0;
            *reinterpret_cast<bool*>(arguments[OUT] + i * steps[OUT]) =
                Test{}(static_cast<int>(vertices), outline.data(), point, tolerance) != 0;
        }
    });
    forget_float_flags();
}

template <bool HAS_TOLERANCE, class Test>
void add_outline_test(pybind11::module_& m, const char* name, const char* text, Test) {
    static PyUFuncGenericFunction loop = &each_point<HAS_TOLERANCE, Test>;
    if constexpr (HAS_TOLERANCE) {
        static char types[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_BOOL};
        add_general(m, name, text, "(),(),(n),(n),()->()", &loop, types, 5, 1);
    } else {
        static char types[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_BOOL};
        add_general(m, name, text, "(),(),(n),(n)->()", &loop, types, 4, 1);
    }
}

}  // namespace

void add_polygons(pybind11::module_& m) {
    add_outline_test<false>(m, "in_polygon",
                            "in_polygon(north, east, norths, easts): whether points lie inside polygons, "
                            "whose vertices lie along the last axis; on an edge what rounding leaves "
                            "(geo_point_in_poly).",
                            [](int n, const geo_nee* polygon, const geo_nee& point, double) {
                                return geo_point_in_poly(n, polygon, &point);
                            });
    add_outline_test<true>(m, "in_polygon_or_near",
                           "in_polygon_or_near(north, east, norths, easts, tolerance): as in_polygon, or "
                           "within so many metres of the outline (geo_point_in_poly_2).",
                           [](int n, const geo_nee* polygon, const geo_nee& point, double tolerance) {
                               return geo_point_in_poly_2(n, polygon, &point, tolerance);
                           });
    add_outline_test<true>(m, "on_polyline",
                           "on_polyline(north, east, norths, easts, tolerance): whether points lie within "
                           "so many metres of a closed chain of segments (geo_point_on_polyline).",
                           [](int n, const geo_nee* vertices, const geo_nee& point, double tolerance) {
                               return geo_point_on_polyline(n, vertices, &point, tolerance);
                           });
    add(m, "on_line",
        "on_line(north1, east1, north2, east2, north, east, tolerance): whether a point lies within so "
        "many metres of a segment (geo_point_on_line).",
        [](double n1, double e1, double n2, double e2, double n, double e, double tolerance) {
            return geo_point_on_line({n1, e1, 0}, {n2, e2, 0}, {n, e, 0}, tolerance) != 0;
        });
    add(m, "lines_cross",
        "lines_cross(p_north1, p_east1, p_north2, p_east2, q_north1, q_east1, q_north2, q_east2): whether "
        "two segments cross (geo_lines_cross).",
        [](double pn1, double pe1, double pn2, double pe2, double qn1, double qe1, double qn2, double qe2) {
            return geo_lines_cross({pn1, pe1, 0}, {pn2, pe2, 0}, {qn1, qe1, 0}, {qn2, qe2, 0}) != 0;
        });
}

}  // namespace basalt_python
