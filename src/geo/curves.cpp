#include "basalt/geo/curves.h"

#include <cmath>

#include "src/geo/constants.h"

using basalt::is_null;
using namespace basalt::geo;

double geo_arc_angle_to_length(double angle, double radius) {
    return is_null(angle) || is_null(radius) ? GEO_NULL : angle * radius;
}

double geo_arc_length_to_angle(double length, double radius) {
    if (is_null(length) || is_null(radius) || std::abs(radius) < EQUALITY_TOLERANCE) {
        return GEO_NULL;
    }
    return length / radius;
}

double geo_arc_to_chord(double radius, double separation) {
    if (is_null(radius) || radius == GEO_INFINITY || is_null(separation)) {
        return GEO_NULL;
    }
    if (separation >= radius) {
        return 2.0 * radius;
    }
    const double square = 2.0 * radius * separation - separation * separation;
    return square >= 0.0 ? std::sqrt(square) : square;
}

double geo_spiral_deflection(double length, double spiralConstant) {
    return length < 0.0 ? 0.0 : length * length / spiralConstant;
}

namespace {

/// A series of term / divisor, where each term is the one before times q over the next two factors of a
/// factorial: even factorials for x, odd ones for y.
struct SpiralSeries {
    double sum;
    double term;
    double factorial;
    double divisor;

    /// Adds terms until one is below the tolerance; false if none of the first nine is.
    bool settle(double q, double tolerance) {
        constexpr double DIVISOR_LIMIT = 41.0;
        for (double sign = -1.0; divisor < DIVISOR_LIMIT; sign = -sign) {
            term = term * q / ((factorial - 1.0) * factorial);
            const double quotient = term / divisor;
            sum += sign * quotient;
            if (std::abs(quotient) < tolerance) {
                return true;
            }
            divisor += 4.0;
            factorial += 2.0;
        }
        return false;
    }
};

}  // namespace

void geo_spiral_deltas(double length, double spiralConstant, double tolerance, double& x, double& y) {
    const double cube = length * length * length;
    const double q = cube * length / (spiralConstant * spiralConstant);
    const double s = cube / spiralConstant;
    SpiralSeries along = {length, length, 2.0, 5.0};
    SpiralSeries across = {s / 3.0, s, 3.0, 7.0};
    const bool settled = along.settle(q, tolerance) && across.settle(q, tolerance);
    x = settled ? along.sum : GEO_NULL;
    y = settled ? across.sum : GEO_NULL;
}
