/// @file
/// The conversions between geodetic and Cartesian coordinates, for one place or four.
#ifndef BASALT_SRC_GEO_ELLIPSOID_FORMULAS_H
#define BASALT_SRC_GEO_ELLIPSOID_FORMULAS_H

#include "src/geo/elementary/four.h"
#include "src/geo/ellipsoid_constants.h"

namespace basalt::geo {

/// Square root of 1 - e^2 sin^2 of the latitude.
template <typename Lane>
BASALT_INLINE Lane curvature_factor(const Lane& sine) {
    return elementary::root(1.0 - sine * ECCENTRICITY2 * sine);
}

template <typename Lane>
BASALT_INLINE Lane prime_vertical_radius(const Lane& sine) {
    return SEMI_MAJOR_AXIS / curvature_factor(sine);
}

template <typename Lane>
struct Cartesian {
    Lane x, y, z;

    BASALT_INLINE Cartesian(const Lane& latitude, const Lane& longitude, const Lane& height) {
        const auto [lat, lon] = elementary::sin_cos_two(latitude, longitude);
        const Lane n = prime_vertical_radius(lat.sine);
        const Lane from_axis = (n + height) * lat.cosine;
        x = lon.cosine * from_axis;
        y = lon.sine * from_axis;
        z = lat.sine * (n * Z_FACTOR + height);
    }
};

/// The textbook passes without angles: the latitude is the direction of (p, q), p from the axis, and a pass
/// maps q to z + N e^2 sin = z + a e^2 q / sqrt(p^2 + (1 - e^2) q^2). Two latitudes differ by the angle of
/// tangent p (q - q') / (p^2 + q q'). False where the passes with angles might decide otherwise: a tolerance
/// or point out of range, or a change within rounding of the tolerance.
template <typename Lane>
BASALT_INLINE bool settle_quickly(const Lane& p, const Lane& z, double tolerance, Lane& q) {
    using elementary::is_any;
    const Lane p2 = p * p;
    const Lane distance2 = p2 + z * z;
    auto is_active = (distance2 > 1e12) & (distance2 < 1e300);
    if (!(tolerance >= 1e-12 && tolerance <= 0.01) || is_any(elementary::negated(is_active))) {
        return false;
    }
    const double margin = tolerance * 1e-4 + 1e-14;
    const Lane base = p * FIRST_ESTIMATE_FACTOR;
    // The first pass never settles.
    q = z + AXIS_PULL * z / elementary::root(base * base + FLAT * (z * z));
    for (int passes = 2; is_any(is_active); ++passes) {
        const Lane next = z + AXIS_PULL * q / elementary::root(p2 + FLAT * (q * q));
        const Lane change = elementary::size_of(next - q) * p;
        const Lane unit = p2 + next * q;
        const auto is_settled = change <= (tolerance - margin) * unit;
        const auto is_far = change > (tolerance + margin) * unit;
        if (passes > MOST_PASSES || is_any(is_active & elementary::negated(is_settled | is_far))) {
            return false;
        }
        q = is_active ? next : q;
        is_active &= is_far;
    }
    return true;
}

/// Latitude and height after settle_quickly(); false also within rounding of the latitude where the height's
/// formula changes.
template <typename Lane>
BASALT_INLINE bool convert_quickly(const Lane& p, const Lane& z, double tolerance, Lane& latitude,
                                   Lane& height) {
    Lane q = {};
    if (!settle_quickly(p, z, tolerance, q)) {
        return false;
    }
    latitude = elementary::atan2(q, p);
    const Lane length = elementary::root(p * p + q * q);  // p over the cosine
    // The divisor is 1 to the bit on the equator, so that heights there are exact.
    const Lane n = SEMI_MAJOR_AXIS / (elementary::root(p * p + FLAT * (q * q)) / length);
    const Lane beyond = elementary::size_of(latitude) - POLAR_LATITUDE;
    const auto is_polar = beyond > 0.0;
    const Lane sine = is_polar ? q / length : elementary::all_of<Lane>(1.0);
    height = is_polar ? z / sine - n + n * ECCENTRICITY2 : length - n;
    return !elementary::is_any(elementary::size_of(beyond) <= 1e-14);
}

}  // namespace basalt::geo

#endif
