#include "basalt/geo/arrays.h"

#include <cmath>

#include "basalt/geo/ellipsoid.h"
#include "basalt/geo/plane.h"
#include "src/geo/four_places.h"

namespace basalt {

namespace {

/// Four records at a time where four(i) can, else one by one(i), which is true for those refused.
template <class Four, class One>
std::size_t for_each(std::size_t count, const Four& four, const One& one) {
    std::size_t refused = 0;
    for (std::size_t i = 0; i < count;) {
        if (count - i >= 4 && geo::has_four_places() && four(i)) {
            i += 4;
            continue;
        }
        for (const std::size_t end = count - i < 4 ? count : i + 4; i < end; ++i) {
            refused += one(i) ? 1 : 0;
        }
    }
    return refused;
}

template <class One>
std::size_t for_each(std::size_t count, const One& one) {
    return for_each(
        count, [](std::size_t) { return false; }, one);
}

}  // namespace

std::size_t to_cartesian(const geo_llh* in, geo_vector* out, std::size_t count) {
    return for_each(
        count, [=](std::size_t i) { return geo::to_cartesian_four(in + i, out + i); },
        [=](std::size_t i) { return _llh2xyz(in + i, out + i) == 0; });
}

std::size_t to_geodetic(const geo_vector* in, geo_llh* out, std::size_t count, double tolerance) {
    return for_each(
        count, [=](std::size_t i) { return geo::to_geodetic_four(in + i, out + i, tolerance); },
        [=](std::size_t i) { return _xyz2llh(in + i, out + i, tolerance) == 0; });
}

std::size_t direct(const geo_llh* starts, const double* azimuths, const double* distances, geo_llh* ends,
                   double* final_azimuths, std::size_t count) {
    return for_each(
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
    return for_each(count, [=](std::size_t i) {
        out[i] = geodesic_inverse(from[i], to[i]);
        return std::isnan(out[i].distance);
    });
}

std::size_t bearings(const geo_nee* from, const geo_nee* to, double* out, std::size_t count) {
    return for_each(count,
                    [=](std::size_t i) { return std::isnan(out[i] = geo_grid_bearing(from[i], to[i])); });
}
std::size_t bearings(const geo_llh* from, const geo_llh* to, double* out, std::size_t count) {
    return for_each(count,
                    [=](std::size_t i) { return std::isnan(out[i] = geo_vincenty_bearing(from[i], to[i])); });
}

std::size_t distances(const geo_nee* from, const geo_nee* to, double* out, std::size_t count) {
    return for_each(count, [=](std::size_t i) { return std::isnan(out[i] = geo_horz_dist(from[i], to[i])); });
}
std::size_t distances(const geo_llh* from, const geo_llh* to, double* out, std::size_t count) {
    return for_each(
        count, [=](std::size_t i) { return std::isnan(out[i] = geo_vincenty_distance(from[i], to[i])); });
}

}  // namespace basalt
