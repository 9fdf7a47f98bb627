// Points against polygons and lines: whole outlines are one item, points are broadcast against them.
#include <pybind11/numpy.h>

#include <algorithm>
#include <cstddef>
#include <memory>
#include <optional>
#include <stdexcept>
#include <utility>
#include <vector>

#include "basalt/geo.h"
#include "basalt/geo/arrays.h"
#include "basalt/geo/polygon_measures.h"
#include "basalt/geo/prepared_polygon.h"
#include "universal.h"

namespace basalt_python {

namespace {

double number_at(const char* place) {
    return *reinterpret_cast<const double*>(place);
}

// Preparing a polygon costs as much as testing it directly for some 60 points.
constexpr npy_intp POINTS_WORTH_PREPARING = 100;

// Arguments: point's north and east, the outline's norths and easts, and a tolerance where there is one.
// Usually one outline meets many points: it is copied only when it changes, and prepared for many.
template <bool HAS_TOLERANCE, bool IS_AREA, class Test>
void each_point(char** arguments, const npy_intp* sizes, const npy_intp* steps, void*) {
    as_python_error([&] {
        constexpr int OUT = HAS_TOLERANCE ? 5 : 4;
        constexpr int CORE = OUT + 1;  // where the steps inside the outline's arrays stand
        const npy_intp vertices = sizes[1];
        if (vertices > 2'147'483'647) {
            throw std::length_error("an outline has at most 2147483647 vertices");
        }
        std::vector<geo_nee> outline(static_cast<std::size_t>(vertices));
        const bool is_one_outline = steps[2] == 0 && steps[3] == 0;
        std::optional<basalt::PreparedPolygon> prepared;
        for (npy_intp i = 0; i < sizes[0]; ++i) {
            if (i == 0 || !is_one_outline) {
                for (npy_intp v = 0; v < vertices; ++v) {
                    outline[static_cast<std::size_t>(v)] = {
                        number_at(arguments[2] + i * steps[2] + v * steps[CORE]),
                        number_at(arguments[3] + i * steps[3] + v * steps[CORE + 1]), 0};
                }
                if (IS_AREA && is_one_outline && sizes[0] >= POINTS_WORTH_PREPARING) {
                    prepared.emplace(outline);
                }
            }
            const geo_nee point{number_at(arguments[0] + i * steps[0]),
                                number_at(arguments[1] + i * steps[1]), 0};
            const double tolerance = HAS_TOLERANCE ? number_at(arguments[4] + i * steps[4]) : 0;
            *reinterpret_cast<bool*>(arguments[OUT] + i * steps[OUT]) =
                !prepared       ? Test{}(static_cast<int>(vertices), outline.data(), point, tolerance) != 0
                : HAS_TOLERANCE ? prepared->contains(point, tolerance)
                                : prepared->contains(point);
        }
    });
    clear_float_flags();
}

template <bool HAS_TOLERANCE, bool IS_AREA, class Test>
void add_outline_test(pybind11::module_& m, const char* name, const char* text, Test) {
    static PyUFuncGenericFunction loop = &each_point<HAS_TOLERANCE, IS_AREA, Test>;
    if constexpr (HAS_TOLERANCE) {
        static char types[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_BOOL};
        add_general(m, name, text, "(),(),(n),(n),()->()", &loop, types, 5, 1);
    } else {
        static char types[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_BOOL};
        add_general(m, name, text, "(),(),(n),(n)->()", &loop, types, 4, 1);
    }
}

using Measure = double (*)(const geo_nee*, std::size_t) noexcept;
using MeasureOfColumns = double (*)(const double*, const double*, std::size_t) noexcept;

// Arguments: the outline's norths and easts; a number out. What measures columns needs no copy of them.
template <Measure MEASURE, MeasureOfColumns OF_COLUMNS = nullptr>
void each_outline(char** arguments, const npy_intp* sizes, const npy_intp* steps, void*) {
    as_python_error([&] {
        const auto vertices = static_cast<std::size_t>(sizes[1]);
        const bool is_in_place =
            OF_COLUMNS != nullptr && steps[3] == sizeof(double) && steps[4] == sizeof(double);
        std::vector<geo_nee> outline(is_in_place ? 0 : vertices);
        for (npy_intp i = 0; i < sizes[0]; ++i) {
            double& measured = *reinterpret_cast<double*>(arguments[2] + i * steps[2]);
            if constexpr (OF_COLUMNS != nullptr) {
                if (is_in_place) {
                    measured =
                        OF_COLUMNS(reinterpret_cast<const double*>(arguments[0] + i * steps[0]),
                                   reinterpret_cast<const double*>(arguments[1] + i * steps[1]), vertices);
                    continue;
                }
            }
            for (npy_intp v = 0; v < sizes[1]; ++v) {
                outline[static_cast<std::size_t>(v)] = {number_at(arguments[0] + i * steps[0] + v * steps[3]),
                                                        number_at(arguments[1] + i * steps[1] + v * steps[4]),
                                                        0};
            }
            measured = MEASURE(outline.data(), vertices);
        }
    });
    clear_float_flags();
}

template <Measure MEASURE, MeasureOfColumns OF_COLUMNS = nullptr>
void add_measure(pybind11::module_& m, const char* name, const char* text) {
    static PyUFuncGenericFunction loop = &each_outline<MEASURE, OF_COLUMNS>;
    static char types[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE};
    add_general(m, name, text, "(n),(n)->()", &loop, types, 2, 1);
}

// A prepared polygon, owned by each of the universal functions that test points against it.
struct Prepared {
    basalt::PreparedPolygon polygon;
    void* data = &polygon;

    explicit Prepared(const std::vector<geo_nee>& outline) : polygon(outline) {}
};

void each_prepared(char** arguments, const npy_intp* sizes, const npy_intp* steps, void* data) {
    const auto& polygon = *static_cast<const basalt::PreparedPolygon*>(data);
    const Column norths{arguments[0], steps[0]}, easts{arguments[1], steps[1]},
        results{arguments[2], steps[2]};
    geo_nee points[BLOCK];
    bool inside[BLOCK];
    const auto total = static_cast<std::size_t>(*sizes);
    for (std::size_t first = 0; first < total; first += BLOCK) {
        const std::size_t count = std::min(total - first, BLOCK);
        for (std::size_t i = 0; i < count; ++i) {
            points[i] = {norths[first + i], easts[first + i], 0};
        }
        polygon.contains(points, count, inside);
        for (std::size_t i = 0; i < count; ++i) {
            results.at<bool>(first + i) = inside[i];
        }
    }
    clear_float_flags();
}

void each_prepared_or_near(char** arguments, const npy_intp* sizes, const npy_intp* steps, void* data) {
    const auto& polygon = *static_cast<const basalt::PreparedPolygon*>(data);
    for (npy_intp i = 0; i < *sizes; ++i) {
        const auto number = [&](int argument) {
            return number_at(arguments[argument] + i * steps[argument]);
        };
        *reinterpret_cast<bool*>(arguments[3] + i * steps[3]) =
            polygon.contains({number(0), number(1), 0}, number(2));
    }
    clear_float_flags();
}

pybind11::object made_with(Prepared& prepared, const pybind11::object& owner, PyUFuncGenericFunction* loop,
                           char* types, int inputs, const char* name) {
    PyObject* made = PyUFunc_FromFuncAndData(loop, &prepared.data, types, 1, inputs, 1, PyUFunc_None, name,
                                             "See PreparedPolygon.", 0);
    const pybind11::object function = owned(made);
    reinterpret_cast<PyUFuncObject*>(made)->obj = owner.inc_ref().ptr();  // released with the function
    return function;
}

using Numbers = pybind11::array_t<double, pybind11::array::c_style>;

// Two functions: of north and east, and of these and a tolerance.
std::pair<pybind11::object, pybind11::object> prepared_polygon(const Numbers& norths, const Numbers& easts) {
    if (norths.ndim() != 1 || easts.ndim() != 1 || norths.size() != easts.size()) {
        throw std::invalid_argument("an outline has as many norths as easts, along one axis");
    }
    std::vector<geo_nee> outline(static_cast<std::size_t>(norths.size()));
    for (std::size_t i = 0; i < outline.size(); ++i) {
        outline[i] = {norths.data()[i], easts.data()[i], 0};
    }
    auto prepared = std::make_unique<Prepared>(outline);
    const pybind11::capsule owner(prepared.get(), [](void* held) { delete static_cast<Prepared*>(held); });
    Prepared& kept = *prepared.release();
    static PyUFuncGenericFunction loops[] = {&each_prepared, &each_prepared_or_near};
    static char types[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_BOOL};
    static char types_near[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_BOOL};
    return {made_with(kept, owner, &loops[0], types, 2, "contains"),
            made_with(kept, owner, &loops[1], types_near, 3, "contains_or_near")};
}

}  // namespace

void add_polygons(pybind11::module_& m) {
    add_outline_test<false, true>(
        m, "in_polygon",
        "in_polygon(north, east, norths, easts): whether points lie inside polygons, "
        "whose vertices lie along the last axis; on an edge either, by rounding "
        "(geo_point_in_poly).",
        [](int n, const geo_nee* polygon, const geo_nee& point, double) {
            return geo_point_in_poly(n, polygon, &point);
        });
    add_outline_test<true, true>(
        m, "in_polygon_or_near",
        "in_polygon_or_near(north, east, norths, easts, tolerance): as in_polygon, or "
        "within so many metres of the outline (geo_point_in_poly_2).",
        [](int n, const geo_nee* polygon, const geo_nee& point, double tolerance) {
            return geo_point_in_poly_2(n, polygon, &point, tolerance);
        });
    add_outline_test<true, false>(
        m, "on_polyline",
        "on_polyline(north, east, norths, easts, tolerance): whether points lie within "
        "so many metres of a closed chain of segments (geo_point_on_polyline).",
        [](int n, const geo_nee* vertices, const geo_nee& point, double tolerance) {
            return geo_point_on_polyline(n, vertices, &point, tolerance);
        });
    add_measure<&basalt::polygon_area, &basalt::polygon_area>(
        m, "polygon_area",
        "polygon_area(norths, easts): square metres enclosed by polygons, whose vertices lie along the last "
        "axis; positive where they run clockwise (basalt::polygon_area).");
    add_measure<&basalt::polygon_perimeter>(
        m, "polygon_perimeter",
        "polygon_perimeter(norths, easts): metres around polygons, whose vertices lie along the last axis; "
        "the closing edge counts (basalt::polygon_perimeter).");
    m.def("_prepared_polygon", &prepared_polygon);
    add_blocks<7, 1, bool>(
        m, "on_line",
        "on_line(north1, east1, north2, east2, north, east, tolerance): whether a point lies within so "
        "many metres of a segment (geo_point_on_line).",
        [](const Column* columns, std::size_t count) {
            geo_nee points[3][BLOCK];
            double tolerances[BLOCK];
            bool is_on[BLOCK];
            for (std::size_t i = 0; i < count; ++i) {
                for (std::size_t k = 0; k < 3; ++k) {
                    points[k][i] = {columns[2 * k][i], columns[2 * k + 1][i], 0};
                }
            }
            read_numbers(columns[6], tolerances, count);
            basalt::on_segments(points[0], points[1], points[2], tolerances, is_on, count);
            for (std::size_t i = 0; i < count; ++i) {
                columns[7].at<bool>(i) = is_on[i];
            }
        });
    add(m, "lines_cross",
        "lines_cross(p_north1, p_east1, p_north2, p_east2, q_north1, q_east1, q_north2, q_east2): whether "
        "two segments cross (geo_lines_cross).",
        [](double pn1, double pe1, double pn2, double pe2, double qn1, double qe1, double qn2, double qe2) {
            return geo_lines_cross({pn1, pe1, 0}, {pn2, pe2, 0}, {qn1, qe1, 0}, {qn2, qe2, 0}) != 0;
        });
}

}  // namespace basalt_python
