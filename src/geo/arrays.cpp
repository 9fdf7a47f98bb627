#include "basalt/geo/arrays.h"

#include <cmath>

#include "basalt/geo/ellipsoid.h"
#include "basalt/geo/plane.h"

namespace basalt {

namespace {

/// Calls form(i) for each index; counts the results that are NaN.
template <class Form>
std::size_t for_each(std::size_t count, const Form& form) {
    std::size_t refused = 0;
    for (std::size_t i = 0; i < count; ++i) {
        refused += std::isnan(form(i)) ? 1 : 0;
    }
    return refused;
}

}  // namespace

std::size_t to_cartesian(const geo_llh* in, geo_vector* out, std::size_t count) {
    std::size_t refused = 0;
    for (std::size_t i = 0; i < count; ++i) {
        refused += _llh2xyz(in + i, out + i) == 0 ? 1 : 0;
    }
    return refused;
}

std::size_t to_geodetic(const geo_vector* in, geo_llh* out, std::size_t count, double tolerance) {
    std::size_t refused = 0;
    for (std::size_t i = 0; i < count; ++i) {
        refused += _xyz2llh(in + i, out + i, tolerance) == 0 ? 1 : 0;
    }
    return refused;
}

std::size_t direct(const geo_llh* starts, const double* azimuths, const double* distances, geo_llh* ends,
                   double* final_azimuths, std::size_t count) {
    return for_each(count, [=](std::size_t i) {
        geo_vincenty_direct(starts[i], azimuths[i], distances[i], final_azimuths[i], ends[i]);
        return ends[i].latitude;
    });
}

std::size_t inverse(const geo_llh* from, const geo_llh* to, GeodesicInverse* out, std::size_t count) {
    return for_each(count,
                    [=](std::size_t i) { return (out[i] = geodesic_inverse(from[i], to[i])).distance; });
}

std::size_t bearings(const geo_nee* from, const geo_nee* to, double* out, std::size_t count) {
    return for_each(count, [=](std::size_t i) { return out[i] = geo_grid_bearing(from[i], to[i]); });
}
std::size_t bearings(const geo_llh* from, const geo_llh* to, double* out, std::size_t count) {
    return for_each(count, [=](std::size_t i) { return out[i] = geo_vincenty_bearing(from[i], to[i]); });
}

std::size_t distances(const geo_nee* from, const geo_nee* to, double* out, std::size_t count) {
    return for_each(count, [=](std::size_t i) { return out[i] = geo_horz_dist(from[i], to[i]); });
}
std::size_t distances(const geo_llh* from, const geo_llh* to, double* out, std::size_t count) {
    return for_each(count, [=](std::size_t i) { return out[i] = geo_vincenty_distance(from[i], to[i]); });
}

}  // namespace basalt
