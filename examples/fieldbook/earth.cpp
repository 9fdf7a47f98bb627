#include "earth.h"

#include <cmath>

#include "input_error.h"

namespace {

/// Of a variance; rounding can leave one that is 0 a little below.
double root(double variance) {
    return variance > 0.0 ? std::sqrt(variance) : 0.0;
}

}  // namespace

Earth::Earth(const geo_nee& anchor, const geo_llh& position, double scale)
    : m_anchor(anchor), m_scale(scale), m_frame(position) {
    if (!m_frame.valid()) {
        throw InputError("--wgs84: latitude, longitude and height may not be 0 all three");
    }
}

EarthPoint Earth::locate(const geo_nee& point, const Covariance& covariance) const {
    EarthPoint result = {};
    result.xyz =
        m_frame.to_cartesian({(point.north - m_anchor.north) / m_scale,
                              (point.east - m_anchor.east) / m_scale, point.elevation - m_anchor.elevation});
    constexpr double TOLERANCE = 5e-10;
    if (_xyz2llh(&result.xyz, &result.llh, TOLERANCE) == 0) {
        throw InputError("--wgs84: a point is too far from the anchor to have a latitude");
    }

    // R Q R^T, where the columns of R are the grid's axes in Cartesian coordinates.
    const double local[3][3] = {{covariance.nn, covariance.ne, covariance.nu},
                                {covariance.ne, covariance.ee, covariance.eu},
                                {covariance.nu, covariance.eu, covariance.uu}};
    const geo_vector axes[3] = {axis({1.0, 0.0, 0.0}), axis({0.0, 1.0, 0.0}), axis({0.0, 0.0, 1.0})};
    double cartesian[6] = {};
    for (int i = 0; i < 3; ++i) {
        for (int j = 0; j < 3; ++j) {
            const geo_vector& a = axes[i];
            const geo_vector& b = axes[j];
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

/// A unit vector of the grid, with the nine digits that are left of a difference.
geo_vector Earth::axis(const geo_nee& unit) const {
    const geo_vector origin = m_frame.to_cartesian(geo_nee{});
    const geo_vector end = m_frame.to_cartesian(unit);
    return {end.x - origin.x, end.y - origin.y, end.z - origin.z};
}
