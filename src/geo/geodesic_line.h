/// @file
/// A geodesic prepared for any number of distances along it, or four of them.
#ifndef BASALT_SRC_GEO_GEODESIC_LINE_H
#define BASALT_SRC_GEO_GEODESIC_LINE_H

#include "src/geo/constants.h"
#include "src/geo/elementary/four.h"
#include "src/geo/ellipsoid_constants.h"

namespace basalt::geo {

/// End of a line as sines and cosines, so that callers form only the angles they use.
template <typename Lane>
struct LineEnds {
    Lane azimuth_sine;  ///< with azimuth_cosine the direction of the forward azimuth, not of length 1
    Lane azimuth_cosine;
    Lane latitude_sine;  ///< likewise for the latitude
    Lane latitude_cosine;
    Lane longitude_change;  ///< radians
};

/// A geodesic by its start and azimuth: the part of Vincenty's direct series that does not depend on the
/// distance.
template <typename Lane>
class GeodesicLines {
public:
    BASALT_INLINE GeodesicLines(const Lane& latitude, const Lane& azimuth) {
        const auto [at, towards] = elementary::sin_cos_two(latitude, azimuth);
        m_sin_azimuth = towards.sine;
        m_cos_azimuth = towards.cosine;
        m_tan_u = ONE_LESS_FLATTENING * (at.sine / at.cosine);
        m_cos_u = 1.0 / elementary::root(m_tan_u * m_tan_u + 1.0);
        m_sin_u = m_tan_u * m_cos_u;
        m_sin_alpha = m_cos_u * m_sin_azimuth;
        m_cos2_alpha = 1.0 - m_sin_alpha * m_sin_alpha;
        const Lane u2 = m_cos2_alpha * AXES_DIFFERENCE2 / SEMI_MINOR_AXIS2;
        const Lane a = 1.0 + u2 * 6.103515625e-05 * (4096.0 + u2 * (-768.0 + u2 * (320.0 - 175.0 * u2)));
        m_b = u2 * 0.0009765625 * (256.0 + u2 * (-128.0 + u2 * (74.0 - 47.0 * u2)));
        m_metres_per_radian = SEMI_MINOR_AXIS * a;
        // sigma1 is the direction of (cos azimuth, tan u); its double angle needs no arctangent. The length
        // is above 0: no double has a cosine of 0.
        const Lane length2 = m_tan_u * m_tan_u + m_cos_azimuth * m_cos_azimuth;
        m_sin_2sigma1 = 2.0 * m_tan_u * m_cos_azimuth / length2;
        m_cos_2sigma1 = (m_cos_azimuth - m_tan_u) * (m_cos_azimuth + m_tan_u) / length2;
    }

    /// The end after a distance in metres.
    BASALT_INLINE LineEnds<Lane> at(const Lane& distance) const {
        const Lane first = distance / m_metres_per_radian;
        const auto of_first = elementary::sin_cos(first);
        Lane sigma = first;
        Lane beyond = {};
        Lane sine = of_first.sine;
        Lane cosine = of_first.cosine;
        Lane c = m_cos_2sigma1 * cosine - m_sin_2sigma1 * sine;  // cosine of 2 sigma_m
        auto is_active = elementary::size_of(first - TWO_PI) > SETTLED_ARC;
        for (int pass = 0; elementary::is_any(is_active) && pass < MOST_ARC_PASSES; ++pass) {
            if (pass > 0) {
                // The passes move the arc by less than 0.002 rad, so a short series turns the first sine and
                // cosine to the last place.
                const Lane d2 = beyond * beyond;
                const Lane turn = beyond - beyond * d2 * (1.0 / 6.0 - d2 / 120.0);
                const Lane versine = d2 * (0.5 - d2 * (1.0 / 24.0 - d2 / 720.0));
                const Lane turned_sine = of_first.sine + (of_first.cosine * turn - of_first.sine * versine);
                const Lane turned_cosine =
                    of_first.cosine - (of_first.sine * turn + of_first.cosine * versine);
                sine = is_active ? turned_sine : sine;
                cosine = is_active ? turned_cosine : cosine;
                c = m_cos_2sigma1 * cosine - m_sin_2sigma1 * sine;
            }
            const Lane next = m_b * sine *
                              (c + m_b / 4.0 *
                                       (cosine * (2.0 * c * c - 1.0) -
                                        m_b / 6.0 * c * (4.0 * sine * sine - 3.0) * (4.0 * c * c - 3.0)));
            beyond = is_active ? next : beyond;
            const Lane previous = sigma;
            sigma = is_active ? first + beyond : sigma;
            is_active &= elementary::size_of(sigma - previous) > SETTLED_ARC;
        }
        const Lane t = m_sin_u * sine - m_cos_u * cosine * m_cos_azimuth;
        const Lane lambda =
            elementary::atan2(sine * m_sin_azimuth, m_cos_u * cosine - m_sin_u * sine * m_cos_azimuth);
        const Lane k = FLATTENING_16TH * m_cos2_alpha * (4.0 + FLATTENING * (4.0 - 3.0 * m_cos2_alpha));
        return {m_sin_alpha, -t, m_sin_u * cosine + m_cos_u * sine * m_cos_azimuth,
                ONE_LESS_FLATTENING * elementary::root(m_sin_alpha * m_sin_alpha + t * t),
                lambda - (1.0 - k) * FLATTENING * m_sin_alpha *
                             (sigma + k * sine * (c + k * cosine * (2.0 * c * c - 1.0)))};
    }

private:
    Lane m_sin_azimuth, m_cos_azimuth;
    Lane m_tan_u, m_sin_u, m_cos_u;
    Lane m_sin_alpha, m_cos2_alpha;
    Lane m_metres_per_radian, m_b;
    Lane m_sin_2sigma1, m_cos_2sigma1;
};

using LineEnd = LineEnds<double>;
using GeodesicLine = GeodesicLines<double>;

}  // namespace basalt::geo

#endif
