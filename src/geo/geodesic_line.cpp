#include "src/geo/geodesic_line.h"

#include <cmath>

#include "src/geo/constants.h"
#include "src/geo/elementary/elementary.h"
#include "src/geo/ellipsoid_constants.h"

namespace basalt::geo {

GeodesicLine::GeodesicLine(double latitude, double azimuth) {
    const auto [at, towards] = elementary::sin_cos_two(latitude, azimuth);
    m_sin_azimuth = towards.sine;
    m_cos_azimuth = towards.cosine;
    m_tan_u = ONE_LESS_FLATTENING * (at.sine / at.cosine);
    m_cos_u = 1.0 / std::sqrt(m_tan_u * m_tan_u + 1.0);
    m_sin_u = m_tan_u * m_cos_u;
    m_sin_alpha = m_cos_u * m_sin_azimuth;
    m_cos2_alpha = 1.0 - m_sin_alpha * m_sin_alpha;
    const double u2 = m_cos2_alpha * AXES_DIFFERENCE2 / SEMI_MINOR_AXIS2;
    const double a = 1.0 + u2 * 6.103515625e-05 * (4096.0 + u2 * (-768.0 + u2 * (320.0 - 175.0 * u2)));
    m_b = u2 * 0.0009765625 * (256.0 + u2 * (-128.0 + u2 * (74.0 - 47.0 * u2)));
    m_metres_per_radian = SEMI_MINOR_AXIS * a;
    // sigma1 is the direction of (cos azimuth, tan u); its double angle needs no arctangent. The length is
    // above 0: no double has a cosine of 0.
    const double length2 = m_tan_u * m_tan_u + m_cos_azimuth * m_cos_azimuth;
    m_sin_2sigma1 = 2.0 * m_tan_u * m_cos_azimuth / length2;
    m_cos_2sigma1 = (m_cos_azimuth - m_tan_u) * (m_cos_azimuth + m_tan_u) / length2;
}

LineEnd GeodesicLine::at(double distance) const {
    const double first = distance / m_metres_per_radian;
    const auto [first_sine, first_cosine] = elementary::sin_cos(first);
    double sigma = first;
    double beyond = 0.0;
    double sine = first_sine;
    double cosine = first_cosine;
    double c = m_cos_2sigma1 * cosine - m_sin_2sigma1 * sine;  // cosine of 2 sigma_m
    double change = std::abs(first - TWO_PI);
    for (int pass = 0; change > SETTLED_ARC && pass < MOST_ARC_PASSES; ++pass) {
        if (pass > 0) {
            // The passes move the arc by less than 0.002 rad, so a short series turns the first sine and
            // cosine to the last place.
            const double d2 = beyond * beyond;
            const double turn = beyond - beyond * d2 * (1.0 / 6.0 - d2 / 120.0);
            const double versine = d2 * (0.5 - d2 * (1.0 / 24.0 - d2 / 720.0));
            sine = first_sine + (first_cosine * turn - first_sine * versine);
            cosine = first_cosine - (first_sine * turn + first_cosine * versine);
            c = m_cos_2sigma1 * cosine - m_sin_2sigma1 * sine;
        }
        beyond = m_b * sine *
                 (c + m_b / 4.0 *
                          (cosine * (2.0 * c * c - 1.0) -
                           m_b / 6.0 * c * (4.0 * sine * sine - 3.0) * (4.0 * c * c - 3.0)));
        const double previous = sigma;
        sigma = first + beyond;
        change = std::abs(sigma - previous);
    }
    const double t = m_sin_u * sine - m_cos_u * cosine * m_cos_azimuth;
    const double lambda =
        elementary::atan2(sine * m_sin_azimuth, m_cos_u * cosine - m_sin_u * sine * m_cos_azimuth);
    const double k = FLATTENING_16TH * m_cos2_alpha * (4.0 + FLATTENING * (4.0 - 3.0 * m_cos2_alpha));
    return {m_sin_alpha, -t, m_sin_u * cosine + m_cos_u * sine * m_cos_azimuth,
            ONE_LESS_FLATTENING * std::sqrt(m_sin_alpha * m_sin_alpha + t * t),
            lambda - (1.0 - k) * FLATTENING * m_sin_alpha *
                         (sigma + k * sine * (c + k * cosine * (2.0 * c * c - 1.0)))};
}

}  // namespace basalt::geo
