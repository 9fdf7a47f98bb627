// The library's functions in plain loops over arrays, for the bindings to be held against: results and speed.
#include <initializer_list>

#include "loops.h"

// False for a name that is not there.
extern "C" bool run_loop(const char* name, std::size_t count, In in, Out out) {
    for (const auto find : {&plane_loop, &curve_and_observation_loop, &geodesy_loop, &time_and_unit_loop}) {
        if (const Loop loop = find(name)) {
            loop(count, in, out);
            return true;
        }
    }
    return false;
}

namespace {

template <class Test>
void each_point(std::size_t count, In points, bool* results, Test test) {
    for (std::size_t i = 0; i < count; ++i) {
        const geo_nee here{points[0][i], points[1][i], 0};
        results[i] = test(&here) != 0;
    }
}

}  // namespace

// Points against one outline, gathered once, as a C++ caller has it.
extern "C" bool run_outline_loop(const char* name, std::size_t count, In points, std::size_t vertices,
                                 const geo_nee* outline, double tolerance, bool* results) {
    const int n = static_cast<int>(vertices);
    if (std::strcmp(name, "in_polygon") == 0) {
        each_point(count, points, results,
                   [=](const geo_nee* here) { return geo_point_in_poly(n, outline, here); });
    } else if (std::strcmp(name, "in_polygon_or_near") == 0) {
        each_point(count, points, results,
                   [=](const geo_nee* here) { return geo_point_in_poly_2(n, outline, here, tolerance); });
    } else if (std::strcmp(name, "on_polyline") == 0) {
        each_point(count, points, results,
                   [=](const geo_nee* here) { return geo_point_on_polyline(n, outline, here, tolerance); });
    } else {
        return false;
    }
    return true;
}
