#include "earth.h"

#include <cmath>

#include "angles.h"
#include "input_error.h"

namespace {

/// Of a variance; rounding can leave one that is 0 a little below.
double root(double variance) {
    return variance > 0.0 ? std::sqrt(variance) : 0.0;
}

}  // namespace

Earth::Earth(const geo_nee& anchor, const geo_llh& position, double scale)
    : m_anchor(anchor), m_scale(scale) {
    if (_llh2xyz(&position, &m_origin) == 0) {
        throw InputError("--wgs84: latitude, longitude and height may not be 0 all three");
    }
    const auto [sin_lat, cos_lat] = sine_cosine(position.latitude);
    const auto [sin_lon, cos_lon] = sine_cosine(position.longitude);
    m_axes[0] = {-sin_lat * cos_lon, -sin_lat * sin_lon, cos_lat};
    m_axes[1] = {-sin_lon, cos_lon, 0.0};
    m_axes[2] = {cos_lat * cos_lon, cos_lat * sin_lon, sin_lat};
}

EarthPoint Earth::locate(const geo_nee& point, const Covariance& covariance) const {
    EarthPoint result = {};
    result.xyz = m_origin;
    const double along[3] = {(point.north - m_anchor.north) / m_scale, (point.east - m_anchor.east) / m_scale,
                             point.elevation - m_anchor.elevation};
    for (int i = 0; i < 3; ++i) {
        result.xyz.x += along[i] * m_axes[i].x;
        result.xyz.y += along[i] * m_axes[i].y;
        result.xyz.z += along[i] * m_axes[i].z;
    }
    constexpr double TOLERANCE = 5e-10;
    if (_xyz2llh(&result.xyz, &result.llh, TOLERANCE) == 0) {
        throw InputError("--wgs84: a point is too far from the anchor to have a latitude");
    }

    const double local[3][3] = {{covariance.nn, covariance.ne, covariance.nu},
                                {covariance.ne, covariance.ee, covariance.eu},
                                {covariance.nu, covariance.eu, covariance.uu}};
    double cartesian[6] = {};
    for (int i = 0; i < 3; ++i) {
        for (int j = 0; j < 3; ++j) {
            const geo_vector& a = m_axes[i];
            const geo_vector& b = m_axes[j];
            const double products[6] = {a.x * b.x, a.y * b.y, a.z * b.z, a.x * b.y, a.x * b.z, a.y * b.z};
            for (int k = 0; k < 6; ++k) {
                cartesian[k] += local[i][j] * products[k];
            }
        }
    }
    double variance[6] = {};
    Varxyz2varneu(&result.xyz, cartesian, variance);
    result.sigma_neu = {root(variance[0]), root(variance[1]), root(variance[2])};
    Varxyz2varllh(&result.xyz, cartesian, variance);
    result.sigma_llh = {root(variance[0]), root(variance[1]), root(variance[2])};
    return result;
}
