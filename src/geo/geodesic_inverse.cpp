#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

#include "basalt/geo/geodesic.h"
#include "src/geo/constants.h"
#include "src/geo/elementary/elementary.h"
#include "src/geo/geodesic_series.h"

namespace basalt {

using namespace geo;

namespace {

/// The search ends with longitudes that agree to this, or no longer get closer below NOISE; radians.
constexpr double SETTLED = 1e-15;
constexpr double NOISE = 1e-13;
constexpr int MOST_PASSES = 60;
/// Shorter lines are those of the sphere that touches at their mean latitude, radians of arc: 100 m, where
/// the difference is 1e-10 m.
constexpr double SHORT_ARC = 1.6e-5;

/// The problem with signs and order changed so that start latitude <= 0, |end latitude| <= |start latitude|,
/// longitude in [0, pi].
struct Problem {
    Direction beta1, beta2;  ///< reduced latitudes
    double longitude;        ///< from start to end, radians
};

struct Solution {
    double distance;
    Direction azimuth1, azimuth2;
};

double square(double x) {
    return x * x;
}

double angle_of(const Direction& direction) {
    return elementary::atan2(direction.sine, direction.cosine);
}

Direction reduced_latitude(double latitude) {
    const elementary::SineCosine of = elementary::sin_cos(latitude);
    return Direction{AXIS_RATIO * of.sine, of.cosine}.normalised();
}

/// What the paper calls epsilon, by k^2 = e'^2 cos^2 alpha0.
double epsilon_of(double k2) {
    return k2 / (2.0 * (1.0 + std::sqrt(1.0 + k2)) + k2);
}

/// The geodesic that leaves the start with an azimuth, up to the end's latitude.
struct Trial {
    Direction azimuth2 = {}, sigma1 = {}, sigma2 = {};
    double sigma = 0.0;  ///< arc on the auxiliary sphere, radians
    double epsilon = 0.0;
    double longitude = 0.0;  ///< from the start to there, radians
    double slope = 0.0;      ///< its derivative by the azimuth

    Trial(const Problem& p, const Direction& azimuth1) {
        const Direction& b1 = p.beta1;
        const Direction& b2 = p.beta2;
        const double sin_alpha0 = azimuth1.sine * b1.cosine;
        const double cos2_alpha0 = azimuth1.cosine * azimuth1.cosine + square(azimuth1.sine * b1.sine);
        // Both: near the equator cosines are equal that sines distinguish, and near a pole sines.
        const bool same_size = b1.cosine == b2.cosine && std::abs(b1.sine) == std::abs(b2.sine);
        // Eq. 45, by whichever difference of squares loses less.
        const double difference = b1.cosine < -b1.sine ? (b2.cosine - b1.cosine) * (b2.cosine + b1.cosine)
                                                       : (b1.sine - b2.sine) * (b1.sine + b2.sine);
        azimuth2.sine = same_size ? azimuth1.sine : sin_alpha0 / b2.cosine;
        azimuth2.cosine = same_size ? std::abs(azimuth1.cosine)
                                    : std::sqrt(square(azimuth1.cosine * b1.cosine) + difference) / b2.cosine;
        const Direction s1 = {b1.sine, azimuth1.cosine * b1.cosine};
        const Direction s2 = {b2.sine, azimuth2.cosine * b2.cosine};
        sigma1 = s1.normalised();
        sigma2 = s2.normalised();
        const Direction arc = turn(sigma1, sigma2);
        const double omega =
            angle_of(turn({sin_alpha0 * s1.sine, s1.cosine}, {sin_alpha0 * s2.sine, s2.cosine}));
        sigma = angle_of(arc);
        const double k2 = SECOND_ECCENTRICITY2 * cos2_alpha0;
        epsilon = epsilon_of(k2);
        longitude =
            omega - FLATTENING * sin_alpha0 * longitude_series(epsilon).between(sigma1, sigma2, sigma);
        // Reduced length over b, eq. 38, with I1 - I2 to the second order: enough for a step of Newton's.
        const double twice1 = 2.0 * sigma1.sine * sigma1.cosine;
        const double twice2 = 2.0 * sigma2.sine * sigma2.cosine;
        const double j = epsilon * ((2.0 + epsilon) * sigma - (twice2 - twice1));
        const double length = std::sqrt(1.0 + k2 * sigma2.sine * sigma2.sine) * sigma1.cosine * sigma2.sine -
                              std::sqrt(1.0 + k2 * sigma1.sine * sigma1.sine) * sigma1.sine * sigma2.cosine -
                              sigma1.cosine * sigma2.cosine * j;
        slope = AXIS_RATIO * length / s2.cosine;  // eq. 46
    }
};

/// Azimuth of the start where the end is nearly its antipode: the astroid problem, eq. 53 to 57.
Direction antipodal_azimuth(const Problem& p) {
    const double scale = FLATTENING * PI * p.beta1.cosine;
    const double x = (p.longitude - PI) / scale;
    const double y =
        (p.beta1.sine * p.beta2.cosine + p.beta1.cosine * p.beta2.sine) / (scale * p.beta1.cosine);
    double kappa = std::max(-y, -x - 1.0);
    if (!(kappa > 0.0)) {
        return Direction{-x, -std::sqrt(std::max(0.0, 1.0 - x * x))}.normalised();
    }
    // x^2 / (1 + kappa)^2 + y^2 / kappa^2 falls and is convex, so Newton's steps from the left stay there.
    for (int pass = 0; pass < 8; ++pass) {
        const double u = x / (1.0 + kappa);
        const double v = y / kappa;
        kappa += (u * u + v * v - 1.0) / (2.0 * (u * u / (1.0 + kappa) + v * v / kappa));
    }
    return Direction{-x / (1.0 + kappa), y / kappa}.normalised();
}

Solution along_meridian(const Problem& p, const Direction& azimuth1) {
    const Direction sigma1 = {p.beta1.sine, azimuth1.cosine < 0.0 ? -p.beta1.cosine : p.beta1.cosine};
    const SineSeries<6> series = distance_series(epsilon_of(SECOND_ECCENTRICITY2));
    const double sigma = angle_of(turn(sigma1, p.beta2));
    return {POLAR_RADIUS * series.between(sigma1, p.beta2, sigma), azimuth1, {0.0, 1.0}};
}

Solution solve(const Problem& p) {
    const Direction& b1 = p.beta1;
    const Direction& b2 = p.beta2;
    if (b1.sine == 0.0 && b2.sine == 0.0 && p.longitude <= AXIS_RATIO * PI) {
        return {SEMI_MAJOR_AXIS * p.longitude, {1.0, 0.0}, {1.0, 0.0}};
    }
    // The sphere with the curvature at the mean latitude, eq. 48 to 51; 1 - cos(omega) without cancellation.
    const double mean = (b1.cosine + b2.cosine) / 2.0;
    const double scale = std::sqrt(1.0 - EXACT_ECCENTRICITY2 * mean * mean);
    const elementary::SineCosine omega = elementary::sin_cos(std::min(p.longitude / scale, PI));
    const double versine =
        omega.cosine > 0.0 ? omega.sine * omega.sine / (1.0 + omega.cosine) : 1.0 - omega.cosine;
    const double north = b1.cosine * b2.sine - b1.sine * b2.cosine;
    const Direction z1 = {b2.cosine * omega.sine, north + b1.sine * b2.cosine * versine};
    const Direction z2 = {b1.cosine * omega.sine, north - b1.cosine * b2.sine * versine};
    const Direction arc = {std::sqrt(z1.sine * z1.sine + z1.cosine * z1.cosine),
                           b1.sine * b2.sine + b1.cosine * b2.cosine * omega.cosine};
    if (arc.cosine > 0.0 && arc.sine < SHORT_ARC) {
        return {SEMI_MAJOR_AXIS * scale * angle_of(arc), z1, z2};
    }
    const bool is_opposite =
        arc.cosine < 0.0 && arc.sine < 6.0 * THIRD_FLATTENING * PI * b1.cosine * b1.cosine;
    Direction azimuth = is_opposite ? antipodal_azimuth(p) : z1.normalised();
    // The longitude grows with the azimuth, from 0 to at least pi. Azimuths are kept as directions: near the
    // equator a cosine of 1e-12 decides.
    Direction low = {0.0, 1.0};
    Direction high = {0.0, -1.0};
    double best = std::numeric_limits<double>::infinity();
    for (int pass = 1;; ++pass) {
        const Trial trial(p, azimuth);
        const double miss = trial.longitude - p.longitude;
        const double size = std::abs(miss);
        const double step = -miss / trial.slope;
        const elementary::SineCosine by = elementary::sin_cos(step);
        Direction next = Direction{azimuth.sine * by.cosine + azimuth.cosine * by.sine,
                                   azimuth.cosine * by.cosine - azimuth.sine * by.sine}
                             .normalised();
        const bool is_last = !(size > SETTLED) || (size < NOISE && size >= best) || pass == MOST_PASSES;
        if (is_last || (next.sine == azimuth.sine && next.cosine == azimuth.cosine)) {
            // What is missed of the longitude lengthens the line by its part along it.
            const double length =
                distance_series(trial.epsilon).between(trial.sigma1, trial.sigma2, trial.sigma);
            const double beyond = SEMI_MAJOR_AXIS * b2.cosine * trial.azimuth2.sine * miss;
            return {POLAR_RADIUS * length - beyond, azimuth, trial.azimuth2};
        }
        best = std::min(best, size);
        (miss > 0.0 ? high : low) = azimuth;
        if (!(std::abs(step) < 1.0 && turn(low, next).sine > 0.0 && turn(next, high).sine > 0.0)) {
            next = Direction{low.sine + high.sine, low.cosine + high.cosine}.normalised();
        }
        azimuth = next;
    }
}

/// Longitude from one place to another in [-pi, pi].
double longitude_between(double from, double to) {
    constexpr double TWO_PI_REST = 2.4492935982947064e-16;
    const double difference = to - from;
    const double turns = std::nearbyint(difference / TWO_PI);
    return std::clamp((difference - turns * TWO_PI) - turns * TWO_PI_REST, -PI, PI);
}

}  // namespace

GeodesicInverse geodesic_inverse(const geo_llh& from, const geo_llh& to) {
    double longitude = longitude_between(from.longitude, to.longitude);
    if (!(std::abs(from.latitude) <= HALF_PI && std::abs(to.latitude) <= HALF_PI) || std::isnan(longitude)) {
        constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();
        return {NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER};
    }
    if (from.latitude == to.latitude && longitude == 0.0) {
        return {0.0, 0.0, 0.0};
    }
    const bool is_swapped = std::abs(from.latitude) < std::abs(to.latitude);
    double latitude1 = is_swapped ? to.latitude : from.latitude;
    double latitude2 = is_swapped ? from.latitude : to.latitude;
    longitude = is_swapped ? -longitude : longitude;
    const double north_sign = latitude1 > 0.0 ? -1.0 : 1.0;
    const double east_sign = longitude < 0.0 ? -1.0 : 1.0;
    latitude1 *= north_sign;
    latitude2 *= north_sign;
    longitude *= east_sign;

    const Problem problem = {reduced_latitude(latitude1), reduced_latitude(latitude2), longitude};
    Solution solution = {};
    if (latitude1 == -HALF_PI) {
        const elementary::SineCosine of = elementary::sin_cos(longitude);
        solution = along_meridian(problem, {0.0, 1.0});
        solution.azimuth1 = {of.sine, of.cosine};
    } else if (longitude == 0.0 || longitude == PI) {
        solution = along_meridian(problem, {0.0, longitude == 0.0 ? 1.0 : -1.0});
    } else {
        solution = solve(problem);
    }
    if (is_swapped) {
        std::swap(solution.azimuth1, solution.azimuth2);
    }
    // Turned round and mirrored back; + 0.0 so that a northward line gives 0 and not -0.
    const double turned = is_swapped ? -1.0 : 1.0;
    const auto azimuth = [=](const Direction& of) {
        return elementary::atan2(turned * east_sign * of.sine + 0.0, turned * north_sign * of.cosine);
    };
    return {solution.distance, azimuth(solution.azimuth1), azimuth(solution.azimuth2)};
}

}  // namespace basalt
