// The calls of survey geometry by name, numbers in and numbers out: for tables of facts and for random input.
#ifndef BASALT_TESTS_GEO_CALLS_H
#define BASALT_TESTS_GEO_CALLS_H

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>
#include <initializer_list>
#include <limits>
#include <tuple>
#include <type_traits>
#include <vector>

#include "basalt/geo.h"

namespace geo_calls {

inline constexpr double UNTOUCHED = 77.0;  // in results before the call

inline double whole(double value, double low, double high) {
    return std::isnan(value) ? 0.0 : std::trunc(std::clamp(value, low, high));
}

// One argument: read from the numbers, or written and appended to the results.
template <class P>
struct Slot {
    using Target = std::remove_reference_t<std::remove_pointer_t<P>>;
    using Value = std::remove_const_t<Target>;
    using Limits = std::numeric_limits<Value>;
    static constexpr bool IS_RECORD = std::is_class_v<Value>;
    static constexpr bool IS_RESULT = !std::is_same_v<Target, P> && !std::is_const_v<Target>;
    static constexpr int SIZE = IS_RECORD ? 3 : 1;
    static constexpr int INPUTS = IS_RESULT ? 0 : SIZE;

    explicit Slot(const double*& in) {
        const double untouched[3] = {UNTOUCHED, UNTOUCHED, UNTOUCHED};
        const double* from = IS_RESULT ? untouched : in;
        if constexpr (IS_RECORD) {
            std::memcpy(&value, from, sizeof value);
        } else if constexpr (std::is_integral_v<Value>) {
            value = static_cast<Value>(whole(*from, Limits::lowest(), static_cast<double>(Limits::max())));
        } else {
            value = *from;
        }
        in += INPUTS;
    }
    operator P() {
        if constexpr (std::is_pointer_v<P>) {
            return &value;
        } else {
            return static_cast<P>(value);
        }
    }
    void append_to(std::vector<double>& out) const {
        if constexpr (IS_RESULT && IS_RECORD) {
            out.resize(out.size() + 3);
            std::memcpy(&out[out.size() - 3], &value, sizeof value);
        } else if constexpr (IS_RESULT) {
            out.push_back(static_cast<double>(value));
        }
    }
    Value value;
};

// Result first, then what was written, in the order of the arguments.
struct Call {
    const char* name;
    double low, high;  // limits of the first number, unless it is NaN
    int inputs;
    void (*run)(const double* in, std::vector<double>& out);
};

template <auto F>
struct Caller;
template <class R, class... P, R (*F)(P...)>
struct Caller<F> {
    static constexpr int INPUTS = (0 + ... + Slot<P>::INPUTS);
    static void run(const double* in, std::vector<double>& out) {
        std::tuple<Slot<P>...> slots{Slot<P>(in)...};
        const auto call = [&out](auto&... slot) {
            if constexpr (std::is_void_v<R>) {
                F(slot...);
            } else {
                out.push_back(static_cast<double>(F(slot...)));
            }
            (slot.append_to(out), ...);
        };
        std::apply(call, slots);
    }
};

template <auto F>
std::vector<double> results(std::initializer_list<double> in) {
    std::vector<double> out;
    Caller<F>::run(in.begin(), out);
    return out;
}

inline constexpr double INF = std::numeric_limits<double>::infinity();
inline constexpr double PI = 3.141592653589793;

template <auto F>
constexpr Call call(const char* name, double low = -INF, double high = INF) {
    return {name, low, high, Caller<F>::INPUTS, Caller<F>::run};
}

// Calls whose shape is another: records changed in place, six numbers, overloads.
inline void normalise_obs(const geo_hvd& obs, geo_hvd& out) {
    out = obs;
    out = &geo_normalise_obs(out) == &out ? out : geo_hvd{};
}
inline void vector_reverse(const geo_vector& v, geo_vector& out) {
    out = v;
    out = &geo_vector_reverse(out) == &out ? out : geo_vector{};
}
template <int (*F)(const geo_vector*, const double*, double*)>
int propagate(const geo_vector& at, const geo_vector& variances, const geo_vector& covariances,
              geo_vector& out_variances, geo_vector& out_covariances) {
    double six[6] = {};
    std::memcpy(six, &variances, sizeof variances);
    std::memcpy(six + 3, &covariances, sizeof covariances);
    const int result = F(&at, six, six);  // over its input
    std::memcpy(&out_variances, six, sizeof variances);
    std::memcpy(&out_covariances, six + 3, sizeof covariances);
    return result;
}
// In place where the call allows it.
inline void centroid(const geo_nee& a, const geo_nee& b, geo_nee& out) {
    out = b;
    geo_grid_centroid(a, out, out);
}
inline int intersect(const geo_nee& p1, const geo_nee& p2, double bearing1, double bearing2, geo_nee& out) {
    out = p1;
    return geo_grid_bb_intersect(out, p2, bearing1, bearing2, out);
}
inline double inverse(const geo_llh& from, const geo_llh& to, double& azimuth_from, double& azimuth_to) {
    const basalt::GeodesicInverse line = basalt::geodesic_inverse(from, to);
    azimuth_from = line.azimuth_from;
    azimuth_to = line.azimuth_to;
    return line.distance;
}
using Angles = double (*)(double, double);
using Lines = double (*)(const geo_nee&, const geo_nee&, const geo_nee&, const geo_nee&);
using OfVector = double (*)(const geo_vector&);
using OfVectors = double (*)(const geo_vector&, const geo_vector&);
using AddVectors = void (*)(const geo_vector&, const geo_vector&, geo_vector&);

template <class... Calls>
constexpr std::array<Call, sizeof...(Calls)> table(const Calls&... calls) {
    return {calls...};
}

inline constexpr auto CALLS = table(
    call<geo_normalised_bearing>("geo_normalised_bearing"), call<geo_horz_dist>("geo_horz_dist", 0),
    call<geo_horz_distSq>("geo_horz_distSq", 0), call<geo_vert_dist>("geo_vert_dist"),
    call<geo_slope_dist>("geo_slope_dist", 0), call<nee_equal>("nee_equal", 0, 1),
    call<geo_dist_equal>("geo_dist_equal", 0, 1), call<geo_grid_bearing>("geo_grid_bearing", 0, 2 * PI),
    call<geo_gradient>("geo_gradient", -PI / 2, PI / 2), call<geo_gradient2>("geo_gradient2"),
    call<Angles(geo_grid_divergence)>("geo_grid_divergence"),
    call<Lines(geo_grid_divergence)>("divergence_of_lines", 0, PI),
    call<geo_bisected_bearing>("geo_bisected_bearing"),
    call<OfVectors(geo_vector_length)>("geo_vector_length", 0),
    call<OfVector(geo_vector_len)>("geo_vector_len", 0),
    call<OfVector(geo_vector_direction)>("geo_vector_direction", 0, 2 * PI),
    call<OfVector(geo_vector_gradient)>("geo_vector_gradient", -PI / 2, PI / 2),
    call<OfVector(geo_vector_x_component_gradient)>("geo_vector_x_component_gradient", -PI / 2, PI / 2),
    call<OfVector(geo_vector_y_component_gradient)>("geo_vector_y_component_gradient", -PI / 2, PI / 2),
    call<vector_reverse>("geo_vector_reverse"), call<AddVectors(geo_vector_add)>("geo_vector_add"),
    call<centroid>("geo_grid_centroid"), call<geo_triangle_area>("geo_triangle_area", 0),
    call<geo_point_on_line>("geo_point_on_line", 0, 1), call<geo_lines_cross>("geo_lines_cross", 0, 1),
    call<intersect>("geo_grid_bb_intersect", 0, 1), call<normalise_obs>("geo_normalise_obs"),
    call<geo_reduce_obs>("geo_reduce_obs"), call<geo_calc_obs>("geo_calc_obs"),
    call<geo_grid_follow>("geo_grid_follow"), call<geo_grid_follow2>("geo_grid_follow2"),
    call<geo_grid_follow3>("geo_grid_follow3"), call<geo_arc_angle_to_length>("geo_arc_angle_to_length"),
    call<geo_arc_length_to_angle>("geo_arc_length_to_angle"), call<geo_arc_to_chord>("geo_arc_to_chord"),
    call<geo_spiral_deflection>("geo_spiral_deflection"), call<geo_spiral_deltas>("geo_spiral_deltas"),
    call<_xyz2llh>("_xyz2llh", 0, 1), call<_llh2xyz>("_llh2xyz", 0, 1), call<_xyz2nez>("_xyz2nez", 1, 1),
    call<_wgs84curvature>("_wgs84curvature"), call<llh_equal>("llh_equal", 0, 1),
    call<propagate<Varxyz2varllh>>("Varxyz2varllh", 1, 1),
    call<propagate<Varxyz2varneu>>("Varxyz2varneu", 1, 1),
    call<geo_vincenty_direct>("geo_vincenty_direct", -PI, PI),
    call<geo_vincenty_distance>("geo_vincenty_distance", 0, 20015087),
    call<geo_vincenty_bearing>("geo_vincenty_bearing", 0, 2 * PI),
    call<geo_vincenty_crosstrack>("geo_vincenty_crosstrack", -20015087, 20015087),
    call<inverse>("geodesic_inverse", 0, 20003931.459), call<_degtorad>("_degtorad"),
    call<_radtodms>("_radtodms", -2147483647, 2147483647), call<_dmstorad>("_dmstorad"),
    call<_mtoftin>("_mtoftin", 0, 1), call<_ftintom>("_ftintom"),
    call<_normalisedbearing>("_normalisedbearing"), call<factorial>("factorial", 1),
    call<_greg2mjd>("_greg2mjd", 0, 4294967295.0), call<_mjd2greg>("_mjd2greg", 0, 65535),
    call<_mjd2gps>("_mjd2gps", 0, 9362), call<_gps2mjd>("_gps2mjd"));

}  // namespace geo_calls

#endif
