#include "basalt/geo/variance.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>

#include "basalt/geo/ellipsoid.h"

namespace {

constexpr double POSITION_TOLERANCE = 5e-9;  // radians
constexpr int COMPONENTS = 6;

using Matrix = std::array<std::array<double, 3>, 3>;

/// Sines and cosines of a latitude and a longitude.
struct Direction {
    double sin_lat, cos_lat, sin_lon, cos_lon;

    explicit Direction(const geo_llh& at)
        : sin_lat(std::sin(at.latitude)),
          cos_lat(std::cos(at.latitude)),
          sin_lon(std::sin(at.longitude)),
          cos_lon(std::cos(at.longitude)) {}
};

/// left * right^T, each entry summed from 0 in the order of the columns.
Matrix times_transposed(const Matrix& left, const Matrix& right) {
    Matrix product = {};
    for (std::size_t i = 0; i < 3; ++i) {
        for (std::size_t j = 0; j < 3; ++j) {
            for (std::size_t k = 0; k < 3; ++k) {
                product[i][j] += left[i][k] * right[j][k];
            }
        }
    }
    return product;
}

void propagate(const Matrix& jacobian, const double* covariance, double* out) {
    const double* c = covariance;
    const Matrix q = {{{c[0], c[3], c[4]}, {c[3], c[1], c[5]}, {c[4], c[5], c[2]}}};
    // q is its own transpose.
    const Matrix result = times_transposed(jacobian, times_transposed(jacobian, q));
    const std::array<double, COMPONENTS> packed = {result[0][0], result[1][1], result[2][2],
                                                   result[0][1], result[0][2], result[1][2]};
    std::copy(packed.begin(), packed.end(), out);
}

/// Geodetic position; false, with out all #GEO_NULL, when there is none.
bool locate(const geo_vector& position, geo_llh& at, double* out) {
    if (_xyz2llh(&position, &at, POSITION_TOLERANCE) == 0) {
        std::fill_n(out, COMPONENTS, GEO_NULL);
        return false;
    }
    return true;
}

}  // namespace

int Varxyz2varllh(const geo_vector* position, const double* covariance, double* out) {
    geo_llh at = {};
    if (locate(*position, at, out)) {
        const Direction d(at);
        double meridian = 0.0;
        double prime_vertical = 0.0;
        _wgs84curvature(at.latitude, meridian, prime_vertical);
        const double m = meridian + at.height;
        const double p = (prime_vertical + at.height) * d.cos_lat;
        propagate({{{-d.sin_lat * d.cos_lon / m, -d.sin_lat * d.sin_lon / m, d.cos_lat / m},
                    {-d.sin_lon / p, d.cos_lon / p, 0.0},
                    {d.cos_lat * d.cos_lon, d.cos_lat * d.sin_lon, d.sin_lat}}},
                  covariance, out);
    }
    return 1;
}

int Varxyz2varneu(const geo_vector* position, const double* covariance, double* out) {
    geo_llh at = {};
    if (locate(*position, at, out)) {
        const Direction d(at);
        propagate({{{-d.sin_lat * d.cos_lon, -d.sin_lat * d.sin_lon, d.cos_lat},
                    {-d.sin_lon, d.cos_lon, 0.0},
                    {d.cos_lat * d.cos_lon, d.cos_lat * d.sin_lon, d.sin_lat}}},
                  covariance, out);
    }
    return 1;
}
