#include "basalt/geo/variance.h"

#include <algorithm>
#include <array>
#include <cstddef>

#include "basalt/geo/ellipsoid.h"
#include "src/geo/elementary/elementary.h"
#include "src/geo/frame_axes.h"

using namespace basalt::geo;

namespace {

constexpr double POSITION_TOLERANCE = 5e-9;  // radians

using Matrix = std::array<geo_vector, 3>;  // by rows

/// Sum of products from 0, in the order of the columns.
double product(const geo_vector& a, const geo_vector& b) {
    return 0.0 + a.x * b.x + a.y * b.y + a.z * b.z;
}

geo_vector over(const geo_vector& row, double divisor) {
    return {row.x / divisor, row.y / divisor, row.z / divisor};
}

FrameAxes frame_at(const geo_llh& at) {
    const auto [latitude, longitude] = elementary::sin_cos_two(at.latitude, at.longitude);
    return {latitude.sine, latitude.cosine, longitude.sine, longitude.cosine};
}

Matrix north_east_up(const geo_llh& at) {
    const FrameAxes frame = frame_at(at);
    return {frame.north, frame.east, frame.up};
}

/// Latitude and longitude change by 1 over the radii of their circles per metre.
Matrix latitude_longitude_height(const geo_llh& at) {
    double meridian = 0.0;
    double prime_vertical = 0.0;
    _wgs84curvature(at.latitude, meridian, prime_vertical);
    const FrameAxes frame = frame_at(at);
    geo_vector longitude = over(frame.east, (prime_vertical + at.height) * elementary::cos(at.latitude));
    longitude.z = 0.0;  // on the axis too, where 0 / 0 gave NaN
    return {over(frame.north, meridian + at.height), longitude, frame.up};
}

/// J Q J^T at a position; six #GEO_NULL when it cannot be converted.
void propagate(const geo_vector& position, Matrix (*jacobian)(const geo_llh&), const double* covariance,
               double* out) {
    geo_llh at = {};
    if (_xyz2llh(&position, &at, POSITION_TOLERANCE) == 0) {
        std::fill_n(out, 6, GEO_NULL);
        return;
    }
    const Matrix j = jacobian(at);
    const double* c = covariance;
    const Matrix q = {{{c[0], c[3], c[4]}, {c[3], c[1], c[5]}, {c[4], c[5], c[2]}}};
    Matrix t = {};
    for (std::size_t row = 0; row < 3; ++row) {
        t[row] = {product(j[row], q[0]), product(j[row], q[1]), product(j[row], q[2])};
    }
    constexpr std::array<std::array<std::size_t, 2>, 6> PLACES = {
        {{0, 0}, {1, 1}, {2, 2}, {0, 1}, {0, 2}, {1, 2}}};
    for (std::size_t i = 0; i < 6; ++i) {
        out[i] = product(j[PLACES[i][0]], t[PLACES[i][1]]);
    }
}

}  // namespace

int Varxyz2varllh(const geo_vector* position, const double* covariance, double* out) {
    propagate(*position, latitude_longitude_height, covariance, out);
    return 1;
}

int Varxyz2varneu(const geo_vector* position, const double* covariance, double* out) {
    propagate(*position, north_east_up, covariance, out);
    return 1;
}
