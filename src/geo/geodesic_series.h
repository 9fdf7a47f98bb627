/// @file
/// Karney's series for geodesics on the WGS84 ellipsoid, to the sixth order in epsilon. The numbers of
/// equations are those of C. Karney, "Algorithms for geodesics", Journal of Geodesy 87, 2013.
#ifndef BASALT_SRC_GEO_GEODESIC_SERIES_H
#define BASALT_SRC_GEO_GEODESIC_SERIES_H

#include "src/geo/elementary/four.h"
#include "src/geo/ellipsoid_constants.h"

namespace basalt::geo {

/// Computed to the last place, unlike the rounded literals of the conversions.
inline constexpr double AXIS_RATIO = 1.0 - FLATTENING;  // b / a
inline constexpr double POLAR_RADIUS = SEMI_MAJOR_AXIS * AXIS_RATIO;
inline constexpr double EXACT_ECCENTRICITY2 = FLATTENING * (2.0 - FLATTENING);
inline constexpr double SECOND_ECCENTRICITY2 = EXACT_ECCENTRICITY2 / (AXIS_RATIO * AXIS_RATIO);
inline constexpr double THIRD_FLATTENING = FLATTENING / (2.0 - FLATTENING);

/// An angle by its sine and cosine, or four.
template <typename Lane>
struct Direction {
    Lane sine, cosine;

    BASALT_INLINE Direction normalised() const {
        const Lane length = elementary::root(sine * sine + cosine * cosine);
        return {sine / length, cosine / length};
    }
};

/// Angle from one direction to another, as a direction. Its sine is not negative.
template <typename Lane>
BASALT_INLINE Direction<Lane> turn(const Direction<Lane>& from, const Direction<Lane>& to) {
    const Lane sine = from.cosine * to.sine - from.sine * to.cosine;
    return {sine > 0.0 ? sine : Lane{}, from.cosine * to.cosine + from.sine * to.sine};
}

/// (1 + excess) (angle + sum over l of coefficients[l - 1] sin(2 l angle)).
template <typename Lane, int N>
struct SineSeries {
    Lane excess;  ///< small, so that the angle itself is not rounded by it
    Lane coefficients[N];

    /// The sum at an angle, by Clenshaw's recurrence.
    BASALT_INLINE Lane sum(const Direction<Lane>& angle) const {
        const Lane twice_cosine = 2.0 * (angle.cosine - angle.sine) * (angle.cosine + angle.sine);
        Lane next = {};
        Lane last = {};
        for (int l = N; l-- > 0;) {
            const Lane here = coefficients[l] + twice_cosine * next - last;
            last = next;
            next = here;
        }
        return 2.0 * angle.sine * angle.cosine * next;
    }
    /// Difference of the series at two angles that are `arc` apart.
    BASALT_INLINE Lane between(const Direction<Lane>& from, const Direction<Lane>& to,
                               const Lane& arc) const {
        return arc + (excess * arc + (1.0 + excess) * (sum(to) - sum(from)));
    }
};

/// I1, the distance over the polar radius; eq. 17, 18.
template <typename Lane>
BASALT_INLINE SineSeries<Lane, 6> distance_series(const Lane& e) {
    const Lane e2 = e * e;
    return {(e + e2 * (1.0 / 4 + e2 * (1.0 / 64 + e2 / 256))) / (1.0 - e),
            {e * (-1.0 / 2 + e2 * (3.0 / 16 - e2 / 32)), e2 * (-1.0 / 16 + e2 * (1.0 / 32 - e2 * 9.0 / 2048)),
             e * e2 * (-1.0 / 48 + e2 * 3.0 / 256), e2 * e2 * (-5.0 / 512 + e2 * 3.0 / 512),
             e * e2 * e2 * (-7.0 / 1280), e2 * e2 * e2 * (-7.0 / 2048)}};
}

/// I3, the longitude less the one on the sphere, over -f sin(alpha0); eq. 24, 25.
template <typename Lane>
BASALT_INLINE SineSeries<Lane, 5> longitude_series(const Lane& e) {
    constexpr double n = THIRD_FLATTENING;
    constexpr double n2 = n * n;
    const Lane e2 = e * e;
    const Lane e3 = e2 * e;
    return {-e * ((1.0 / 2 - n / 2) +
                  e * ((1.0 / 4 + n / 8 - n2 * 3 / 8) +
                       e * ((1.0 / 16 + n * 3 / 16 + n2 / 16) + e * ((3.0 / 64 + n / 32) + e * 3.0 / 128)))),
            {e * ((1.0 / 4 - n / 4) +
                  e * ((1.0 / 8 - n2 / 8) +
                       e * ((3.0 / 64 + n * 3 / 64 - n2 / 64) + e * ((5.0 / 128 + n / 64) + e * 3.0 / 128)))),
             e2 * ((1.0 / 16 - n * 3 / 32 + n2 / 32) +
                   e * ((3.0 / 64 - n / 32 - n2 * 3 / 64) + e * ((3.0 / 128 + n / 128) + e * 5.0 / 256))),
             e3 * ((5.0 / 192 - n * 3 / 64 + n2 * 5 / 192) + e * ((3.0 / 128 - n * 5 / 192) + e * 7.0 / 512)),
             e3 * e * ((7.0 / 512 - n * 7 / 256) + e * 7.0 / 512), e3 * e2 * 21.0 / 2560}};
}

}  // namespace basalt::geo

#endif
