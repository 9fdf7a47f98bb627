#include "basalt/geo/variance.h"

#include <algorithm>
#include <cmath>

#include "basalt/geo/ellipsoid.h"

namespace {

/// Radians within which the latitude has to settle.
constexpr double POSITION_TOLERANCE = 5e-9;

struct Matrix {
    double at[3][3];
};

struct Direction {
    double sin_latitude;
    double cos_latitude;
    double sin_longitude;
    double cos_longitude;

    explicit Direction(const geo_llh& p)
        : sin_latitude(std::sin(p.latitude)),
          cos_latitude(std::cos(p.latitude)),
          sin_longitude(std::sin(p.longitude)),
          cos_longitude(std::cos(p.longitude)) {}
};

Matrix local_frame(const geo_llh& p) {
    const Direction d(p);
    return {{{-d.sin_latitude * d.cos_longitude, -d.sin_latitude * d.sin_longitude, d.cos_latitude},
             {-d.sin_longitude, d.cos_longitude, 0.0},
             {d.cos_latitude * d.cos_longitude, d.cos_latitude * d.sin_longitude, d.sin_latitude}}};
}

Matrix geodetic_derivatives(const geo_llh& p) {
    Matrix j = local_frame(p);
    double m = 0.0;
    double n = 0.0;
    _wgs84curvature(p.latitude, m, n);
    const double along_parallel = (n + p.height) * std::cos(p.latitude);
    for (double& value : j.at[0]) {
        value /= m + p.height;
    }
    j.at[1][0] /= along_parallel;
    j.at[1][1] /= along_parallel;
    return j;
}

/// J Q J^T, each element summed in the order of the columns from 0.
void propagate(const Matrix& j, const double* q, double* out) {
    const Matrix full = {{{q[0], q[3], q[4]}, {q[3], q[1], q[5]}, {q[4], q[5], q[2]}}};
    Matrix t = {};
    for (int row = 0; row < 3; ++row) {
        for (int column = 0; column < 3; ++column) {
            for (int k = 0; k < 3; ++k) {
                t.at[row][column] += j.at[row][k] * full.at[k][column];
            }
        }
    }
    const auto element = [&](int row, int column) {
        double sum = 0.0;
        for (int k = 0; k < 3; ++k) {
            sum += j.at[row][k] * t.at[column][k];
        }
        return sum;
    };
    out[0] = element(0, 0);
    out[1] = element(1, 1);
    out[2] = element(2, 2);
    out[3] = element(0, 1);
    out[4] = element(0, 2);
    out[5] = element(1, 2);
}

int propagate_at(const geo_vector* position, Matrix (*jacobian)(const geo_llh&), const double* covariance,
                 double* out) {
    geo_llh llh = {};
    if (_xyz2llh(position, &llh, POSITION_TOLERANCE) == 0) {
        std::fill_n(out, 6, GEO_NULL);
        return 1;
    }
    propagate(jacobian(llh), covariance, out);
    return 1;
}

}  // namespace

int Varxyz2varllh(const geo_vector* position, const double* covariance, double* out) {
    return propagate_at(position, geodetic_derivatives, covariance, out);
}

int Varxyz2varneu(const geo_vector* position, const double* covariance, double* out) {
    return propagate_at(position, local_frame, covariance, out);
}
