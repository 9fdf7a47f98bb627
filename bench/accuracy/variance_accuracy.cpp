#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <random>
#include <utility>

#include "basalt/geo/variance.h"
#include "bench/accuracy/accuracy.h"
#include "bench/accuracy/error_table.h"

namespace accuracy {

namespace {

using Vector = std::array<long double, 3>;
using Matrix = std::array<Vector, 3>;

Vector cartesian(const Vector& llh) {
    constexpr long double A = 6378137.0L;
    constexpr long double F = 1.0L / 298.257223563L;
    constexpr long double E2 = F * (2.0L - F);
    const long double sine = std::sin(llh[0]);
    const long double n = A / std::sqrt(1.0L - E2 * sine * sine);
    const long double from_axis = (n + llh[2]) * std::cos(llh[0]);
    return {from_axis * std::cos(llh[1]), from_axis * std::sin(llh[1]), (n * (1.0L - E2) + llh[2]) * sine};
}

/// Derivative of the Cartesian coordinates by one geodetic one: central differences of fourth order.
Vector derivative(const Vector& llh, std::size_t by, long double step) {
    Vector result = {};
    for (const auto& [offset, weight] : {std::pair{1, 8.0L}, {-1, -8.0L}, {2, -1.0L}, {-2, 1.0L}}) {
        Vector moved = llh;
        moved[by] += offset * step;
        const Vector there = cartesian(moved);
        for (std::size_t i = 0; i < 3; ++i) {
            result[i] += weight * there[i] / (12.0L * step);
        }
    }
    return result;
}

/// Rows that take a Cartesian difference to geodetic ones. The three derivatives are at right angles to each
/// other, so each row is its derivative over the square of its length; over the length alone it is the local
/// frame's.
Matrix jacobian(const Vector& llh, bool local) {
    Matrix rows = {derivative(llh, 0, 5e-4L), derivative(llh, 1, 5e-4L), derivative(llh, 2, 1.0L)};
    for (Vector& row : rows) {
        const long double length = std::hypot(row[0], row[1], row[2]);
        for (long double& value : row) {
            value /= local ? length : length * length;
        }
    }
    return rows;
}

Matrix propagated(const Matrix& j, const Matrix& q) {
    Matrix result = {};
    for (std::size_t a = 0; a < 3; ++a) {
        for (std::size_t b = 0; b < 3; ++b) {
            for (std::size_t k = 0; k < 3; ++k) {
                for (std::size_t l = 0; l < 3; ++l) {
                    result[a][b] += j[a][k] * q[k][l] * j[b][l];
                }
            }
        }
    }
    return result;
}

std::array<double, 6> six_of(const Matrix& m) {
    return {static_cast<double>(m[0][0]), static_cast<double>(m[1][1]), static_cast<double>(m[2][2]),
            static_cast<double>(m[0][1]), static_cast<double>(m[0][2]), static_cast<double>(m[1][2])};
}

/// The largest of six differences, each over the standard deviations of its two components.
long double largest_difference(const std::array<double, 6>& ours, const Matrix& reference) {
    constexpr std::array<std::array<std::size_t, 2>, 6> PLACES = {
        {{0, 0}, {1, 1}, {2, 2}, {0, 1}, {0, 2}, {1, 2}}};
    long double largest = 0.0L;
    for (std::size_t i = 0; i < 6; ++i) {
        const auto [a, b] = PLACES[i];
        const long double unit = std::sqrt(reference[a][a] * reference[b][b]);
        largest = std::max(largest, std::abs(ours[i] - reference[a][b]) / unit);
    }
    return largest;
}

/// A sum of squares, hence a covariance; metres squared about 1.
Matrix random_covariance(std::mt19937_64& engine) {
    Matrix root = {};
    for (Vector& row : root) {
        for (long double& value : row) {
            value = static_cast<long double>(engine() >> 11) * 0x1p-52L - 1.0L;
        }
    }
    constexpr Matrix UNIT = {{{1, 0, 0}, {0, 1, 0}, {0, 0, 1}}};
    Matrix q = propagated(root, UNIT);
    for (Vector& row : q) {
        for (long double& value : row) {
            value = static_cast<double>(value);
        }
    }
    return q;
}

}  // namespace

void measure_variance(const std::vector<ReferenceRow>& rows) {
    const std::vector<double> bounds = {0.0, 1e-8, 1e-6, 1e-4, 1e-2, 1.0, 10.0, 90.0};
    ErrorTable table(
        {"below 1e-8 degrees (1 mm)", "1e-8 to 1e-6 degrees (11 cm)", "1e-6 to 1e-4 degrees (11 m)",
         "1e-4 to 0.01 degrees (1.1 km)", "0.01 to 1 degrees", "1 to 10 degrees", "10 to 90 degrees"},
        bounds, {"latitude, longitude, height", "north, east, up"});
    std::mt19937_64 engine(20261124);
    for (const ReferenceRow& row : rows) {
        if (row[2] < -11e3L || std::abs(row[0]) == 90.0L) {
            continue;
        }
        const geo_vector xyz = {static_cast<double>(row[3]), static_cast<double>(row[4]),
                                static_cast<double>(row[5])};
        const Vector llh = {radians_of(row[0]), radians_of(row[1]), row[2]};
        const Matrix q = random_covariance(engine);
        const std::array<double, 6> in = six_of(q);
        std::array<double, 6> geodetic = {};
        std::array<double, 6> local = {};
        Varxyz2varllh(&xyz, in.data(), geodetic.data());
        Varxyz2varneu(&xyz, in.data(), local.data());
        table.add(static_cast<double>(90.0L - std::abs(row[0])),
                  {largest_difference(geodetic, propagated(jacobian(llh, false), q)),
                   largest_difference(local, propagated(jacobian(llh, true), q))});
    }
    std::printf("### Variance propagation, `Varxyz2varllh`, `Varxyz2varneu`\n");
    table.print("distance from the pole");
}

}  // namespace accuracy
