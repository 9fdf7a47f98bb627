#include "basalt/geo/arrays.h"

#include <cmath>

#include "basalt/geo/ellipsoid.h"
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
std::size_t for_each_four(std::size_t count, const Four& four, const One& one) {
    std::size_t refused = 0;
    std::size_t i = 0;
    if (geo::has_four_places()) {
        for (; i + 4 <= count; i += 4) {
            for (unsigned left = four(i); left != 0; left &= left - 1) {
                refused += one(i + static_cast<unsigned>(__builtin_ctz(left))) ? 1 : 0;
            }
        }
    }
    return refused + for_each(count, one, i);
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

std::size_t distances(const geo_nee* from, const geo_nee* to, double* out, std::size_t count) {
    return for_each(count, [=](std::size_t i) { return std::isnan(out[i] = geo_horz_dist(from[i], to[i])); });
}
std::size_t distances(const geo_llh* from, const geo_llh* to, double* out, std::size_t count) {
    return for_each_four(
        count, [=](std::size_t i) { return geo::distances_four(from + i, to + i, out + i); },
        [=](std::size_t i) { return std::isnan(out[i] = geo_vincenty_distance(from[i], to[i])); });
}

}  // namespace basalt
