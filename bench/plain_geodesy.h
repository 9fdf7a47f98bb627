// The conversions and geodesics step by step, with one call of the C library for each sine, root and power.
#ifndef BASALT_BENCH_PLAIN_GEODESY_H
#define BASALT_BENCH_PLAIN_GEODESY_H

#include <cmath>

#include "basalt/geo.h"

namespace plain {

/// Passes made, refused or not, are added to `passes`.
inline int xyz2llh(const geo_vector& v, geo_llh& llh, double tolerance, int& passes) {
    const double e2 = 0.00669437999014;
    if (v.x == 0 && v.y == 0 && v.z == 0) {
        return 0;
    }
    const double p = std::sqrt(v.x * v.x + v.y * v.y);
    double phi = std::atan2(v.z, p * 0.99330562000986);
    double s = std::sin(phi);
    double previous = -100.0;
    if (tolerance < 10.0) {
        for (;;) {
            const double n = 6378137.0 / std::sqrt(1.0 - s * e2 * s);
            phi = std::atan2(n * e2 * s + v.z, p);
            s = std::sin(phi);
            ++passes;
            const double change = std::fabs(phi - previous);
            previous = phi;
            if (passes > 10) {
                return 0;
            }
            if (change <= tolerance) {
                break;
            }
        }
    }
    const double n = 6378137.0 / std::sqrt(1.0 - s * e2 * s);
    llh.latitude = phi;
    llh.height = std::fabs(phi) <= 1.3962634015954636 ? p / std::cos(phi) - n : v.z / s - n + n * e2;
    llh.longitude = std::atan2(v.y, v.x);
    return 1;
}

inline int llh2xyz(const geo_llh& g, geo_vector& v) {
    if (g.latitude == 0 && g.longitude == 0 && g.height == 0) {
        return 0;
    }
    const double s = std::sin(g.latitude);
    const double n = 6378137.0 / std::pow(1.0 - s * 0.00669437999014 * s, 0.5);
    const double h = g.height;
    v.x = std::cos(g.longitude) * ((n + h) * std::cos(g.latitude));
    v.y = std::sin(g.longitude) * ((n + h) * std::cos(g.latitude));
    v.z = s * (n * 0.9933056200098587 + h);
    return 1;
}

/// False when rounding decides how many passes it makes.
inline bool direct(geo_llh start, double azimuth, double s, double& final_azimuth, geo_llh& end) {
    bool is_clear = true;
    const double f = 0.0033528106647474805;
    const double sin_a1 = std::sin(azimuth);
    const double cos_a1 = std::cos(azimuth);
    const double tan_u = 0.9966471893352525 * std::tan(start.latitude);
    const double cos_u = 1.0 / std::sqrt(tan_u * tan_u + 1.0);
    const double sin_u = tan_u * cos_u;
    const double sigma1 = std::atan2(tan_u, cos_a1);
    const double sin_a = cos_u * sin_a1;
    const double cos2_a = 1.0 - sin_a * sin_a;
    const double u2 = cos2_a * 272331606681.9453 / 40408299984087.055;
    const double a = 1.0 + u2 * 6.103515625e-05 * (4096.0 + u2 * (-768.0 + u2 * (320.0 - 175.0 * u2)));
    const double b = u2 * 0.0009765625 * (256.0 + u2 * (-128.0 + u2 * (74.0 - 47.0 * u2)));
    double sigma = s / (6356752.3142 * a);
    double cos_2m = std::cos(2.0 * sigma1 + sigma);
    double sin_s = std::sin(sigma);
    double cos_s = std::cos(sigma);
    double previous = 2.0 * 3.141592653589793;
    for (int pass = 0; std::fabs(sigma - previous) > 1e-12 && pass < 100; ++pass) {
        cos_2m = std::cos(2.0 * sigma1 + sigma);
        sin_s = std::sin(sigma);
        cos_s = std::cos(sigma);
        const double change =
            b * sin_s *
            (cos_2m + b / 4.0 *
                          (cos_s * (2.0 * cos_2m * cos_2m - 1.0) -
                           b / 6.0 * cos_2m * (4.0 * sin_s * sin_s - 3.0) * (4.0 * cos_2m * cos_2m - 3.0)));
        previous = sigma;
        sigma = s / (6356752.3142 * a) + change;
        is_clear =
            is_clear && std::fabs(std::fabs(sigma - previous) - 1e-12) > 1e-14 * (1.0 + std::fabs(sigma));
    }
    const double t = sin_u * sin_s - cos_u * cos_s * cos_a1;
    final_azimuth = std::atan2(sin_a, -t);
    end = start;
    end.latitude = std::atan2(sin_u * cos_s + cos_u * sin_s * cos_a1,
                              0.9966471893352525 * std::sqrt(sin_a * sin_a + t * t));
    const double lambda = std::atan2(sin_s * sin_a1, cos_u * cos_s - sin_u * sin_s * cos_a1);
    const double k = 0.00020955066654671753 * cos2_a * (4.0 + f * (4.0 - 3.0 * cos2_a));
    end.longitude =
        start.longitude + lambda -
        (1.0 - k) * f * sin_a * (sigma + k * sin_s * (cos_2m + k * cos_s * (2.0 * cos_2m * cos_2m - 1.0)));
    return is_clear;
}

/// Cross-track by steps of at most a metre. `passes` holds the most it may make and then those it made; a
/// search that does not end gives NaN.
inline double crosstrack(geo_llh a, geo_llh b, geo_llh p, int& passes) {
    const int most = passes;
    const double bearing = geo_vincenty_bearing(a, b);
    double along =
        std::cos(geo_grid_divergence(bearing, geo_vincenty_bearing(a, p))) * geo_vincenty_distance(a, p);
    for (passes = 1; passes <= most; ++passes) {
        geo_llh foot = {};
        double azimuth = 0.0;
        direct(a, bearing, along, azimuth, foot);
        const double sight = geo_vincenty_bearing(foot, p);
        const double skew = geo_grid_divergence(azimuth, sight) - 1.5707963267948966;
        const double distance = geo_vincenty_distance(foot, p);
        if (!(std::fabs(skew) >= 4.848136811095359e-07)) {
            return geo_normalised_bearing(sight - azimuth) < 3.141592653589793 ? -distance : distance;
        }
        along = along - std::sin(skew);
    }
    return std::nan("");
}

}  // namespace plain

#endif
