#include "basalt/geo/arrays.h"

#include <cmath>

#include "basalt/geo/ellipsoid.h"
#include "basalt/geo/observations.h"
#include "basalt/geo/plane.h"
#include "src/geo/four_places.h"

namespace basalt {

namespace {

template <class One>
std::size_t for_each(std::size_t count, const One& one, std::size_t first = 0) {
    std::size_t refused = 0;
    for (std::size_t i = first; i < count; ++i) {
        refused += one(i) ? 1 : 0;
    }
    return refused;
}

/// Four records at a time by four(i), which returns a bit for each that is left to one(i); that returns
/// whether it refused.
template <class Four, class One>
std::size_t for_each_four(std::size_t count, [[maybe_unused]] const Four& four, const One& one) {
    std::size_t refused = 0;
    std::size_t i = 0;
#if defined(__x86_64__)
    if (__builtin_cpu_supports("avx2") != 0) {
        for (; i + 4 <= count; i += 4) {
            for (unsigned left = four(i); left != 0; left &= left - 1) {
                refused += one(i + static_cast<unsigned>(__builtin_ctz(left))) ? 1 : 0;
            }
        }
    }
#endif
    return refused + for_each(count, one, i);
}

std::size_t follow_each(geo::Rise given, decltype(geo_grid_follow)* one, const geo_nee* starts,
                        const double* bearings, const double* distances, const double* rises, geo_nee* out,
                        std::size_t count) {
    return for_each_four(
        count,
        [=](std::size_t i) {
            return geo::follow_four(given, starts + i, bearings + i, distances + i, rises + i, out + i);
        },
        [=](std::size_t i) {
            one(starts[i], bearings[i], distances[i], rises[i], out[i]);
            return std::isnan(out[i].north);
        });
}

}  // namespace

std::size_t to_cartesian(const geo_llh* in, geo_vector* out, std::size_t count) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::to_cartesian_four(in + i, out + i); },
        [=](std::size_t i) { return _llh2xyz(in + i, out + i) == 0; });
}

std::size_t to_geodetic(const geo_vector* in, geo_llh* out, std::size_t count, double tolerance) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::to_geodetic_four(in + i, out + i, tolerance); },
        [=](std::size_t i) { return _xyz2llh(in + i, out + i, tolerance) == 0; });
}

std::size_t direct(const geo_llh* starts, const double* azimuths, const double* distances, geo_llh* ends,
                   double* final_azimuths, std::size_t count) {
    return for_each_four(
        count,
        [=](std::size_t i) {
            return geo::direct_four(starts + i, azimuths + i, distances + i, ends + i, final_azimuths + i);
        },
        [=](std::size_t i) {
            geo_vincenty_direct(starts[i], azimuths[i], distances[i], final_azimuths[i], ends[i]);
            return std::isnan(ends[i].latitude);
        });
}

std::size_t inverse(const geo_llh* from, const geo_llh* to, GeodesicInverse* out, std::size_t count) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::inverse_four(from + i, to + i, out + i); },
        [=](std::size_t i) {
            out[i] = geodesic_inverse(from[i], to[i]);
            return std::isnan(out[i].distance);
        });
}

std::size_t bearings(const geo_nee* from, const geo_nee* to, double* out, std::size_t count) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::bearings_four(from + i, to + i, out + i); },
        [=](std::size_t i) { return std::isnan(out[i] = geo_grid_bearing(from[i], to[i])); });
}
std::size_t bearings(const geo_llh* from, const geo_llh* to, double* out, std::size_t count) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::bearings_four(from + i, to + i, out + i); },
        [=](std::size_t i) { return std::isnan(out[i] = geo_vincenty_bearing(from[i], to[i])); });
}
std::size_t bearings(const geo_vector* in, double* out, std::size_t count) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::bearings_four(in + i, out + i); },
        [=](std::size_t i) {
            geo_vector v = in[i];
            return std::isnan(out[i] = geo_vector_direction(v));
        });
}

std::size_t distances(const geo_nee* from, const geo_nee* to, double* out, std::size_t count) {
    return for_each(count, [=](std::size_t i) { return std::isnan(out[i] = geo_horz_dist(from[i], to[i])); });
}
std::size_t distances(const geo_llh* from, const geo_llh* to, double* out, std::size_t count) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::distances_four(from + i, to + i, out + i); },
        [=](std::size_t i) { return std::isnan(out[i] = geo_vincenty_distance(from[i], to[i])); });
}

void on_segments(const geo_nee* from, const geo_nee* to, const geo_nee* points, const double* tolerances,
                 bool* out, std::size_t count) {
    for_each_four(
        count,
        [=](std::size_t i) {
            return geo::on_segments_four(from + i, to + i, points + i, tolerances + i, out + i);
        },
        [=](std::size_t i) {
            out[i] = geo_point_on_line(from[i], to[i], points[i], tolerances[i]) != 0;
            return false;
        });
}

std::size_t follow(const geo_nee* starts, const double* bearings, const double* distances,
                   const double* slope_angles, geo_nee* out, std::size_t count) {
    return follow_each(geo::Rise::ANGLE, geo_grid_follow, starts, bearings, distances, slope_angles, out,
                       count);
}
std::size_t follow_grade(const geo_nee* starts, const double* bearings, const double* distances,
                         const double* grades, geo_nee* out, std::size_t count) {
    return follow_each(geo::Rise::GRADE, geo_grid_follow2, starts, bearings, distances, grades, out, count);
}
std::size_t follow_height_change(const geo_nee* starts, const double* bearings, const double* distances,
                                 const double* height_changes, geo_nee* out, std::size_t count) {
    return follow_each(geo::Rise::METRES, geo_grid_follow3, starts, bearings, distances, height_changes, out,
                       count);
}

std::size_t reduce(const geo_hvd* observations, const geo_nee* stations, const double* height_offsets,
                   const double* scale_factors, geo_nee* out, std::size_t count) {
    return for_each_four(
        count,
        [=](std::size_t i) {
            return geo::reduce_four(observations + i, stations + i, height_offsets + i, scale_factors + i,
                                    out + i);
        },
        [=](std::size_t i) {
            geo_reduce_obs(observations[i], stations[i], height_offsets[i], out[i], scale_factors[i]);
            return is_null(out[i].north) || std::isnan(out[i].north);
        });
}

}  // namespace basalt
