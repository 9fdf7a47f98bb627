#include "src/geo/geodesic_inverse.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "basalt/geo/geodesic.h"

namespace basalt {

using namespace geo;

namespace {

Solution<double> along_meridian(const Problem<double>& p, const Direction<double>& azimuth1) {
    const Direction<double> sigma1 = {p.beta1.sine, azimuth1.cosine < 0.0 ? -p.beta1.cosine : p.beta1.cosine};
    const double sigma = angle_of(turn(sigma1, p.beta2));
    return {POLAR_RADIUS * distance_series(epsilon_of(SECOND_ECCENTRICITY2)).between(sigma1, p.beta2, sigma),
            azimuth1,
            {0.0, 1.0}};
}

Solution<double> solve_any(const Problem<double>& p, double start_latitude) {
    if (start_latitude == -HALF_PI) {
        const elementary::SineCosine of = elementary::sin_cos(p.longitude);
        Solution<double> solution = along_meridian(p, {0.0, 1.0});
        solution.azimuth1 = {of.sine, of.cosine};
        return solution;
    }
    if (p.longitude == 0.0 || p.longitude == PI) {
        return along_meridian(p, {0.0, p.longitude == 0.0 ? 1.0 : -1.0});
    }
    if (p.beta1.sine == 0.0 && p.beta2.sine == 0.0 && p.longitude <= AXIS_RATIO * PI) {
        return {SEMI_MAJOR_AXIS * p.longitude, {1.0, 0.0}, {1.0, 0.0}};
    }
    bool is_wanted = true;
    return solve(p, is_wanted);
}

}  // namespace

Direction<double> geo::antipodal_azimuth(const Problem<double>& p) {
    const double scale = FLATTENING * PI * p.beta1.cosine;
    const double x = (p.longitude - PI) / scale;
    const double y =
        (p.beta1.sine * p.beta2.cosine + p.beta1.cosine * p.beta2.sine) / (scale * p.beta1.cosine);
    double kappa = std::max(-y, -x - 1.0);
    if (!(kappa > 0.0)) {
        return Direction<double>{-x, -std::sqrt(std::max(0.0, 1.0 - x * x))}.normalised();
    }
    // x^2 / (1 + kappa)^2 + y^2 / kappa^2 falls and is convex, so Newton's steps from the left stay there.
    for (int pass = 0; pass < 8; ++pass) {
        const double u = x / (1.0 + kappa);
        const double v = y / kappa;
        kappa += (u * u + v * v - 1.0) / (2.0 * (u * u / (1.0 + kappa) + v * v / kappa));
    }
    return Direction<double>{-x / (1.0 + kappa), y / kappa}.normalised();
}

GeodesicInverse geodesic_inverse(const geo_llh& from, const geo_llh& to) {
    const double difference = to.longitude - from.longitude;
    const double longitude = less_turns(difference, std::nearbyint(difference / TWO_PI));
    if (!(std::abs(from.latitude) <= HALF_PI && std::abs(to.latitude) <= HALF_PI) || std::isnan(longitude)) {
        constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();
        return {NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER};
    }
    if (from.latitude == to.latitude && longitude == 0.0) {
        return {0.0, 0.0, 0.0};
    }
    const Arranged<double> pair(from.latitude, to.latitude, longitude);
    const Line<double> line = pair.line(solve_any(pair.problem, pair.start_latitude));
    return {line.distance, line.azimuth_from, line.azimuth_to};
}

}  // namespace basalt
