/// @file
/// The inverse geodesic of one pair of places or four, by Karney's method: the equations are those of
/// geodesic_series.h's paper.
#ifndef BASALT_SRC_GEO_GEODESIC_INVERSE_H
#define BASALT_SRC_GEO_GEODESIC_INVERSE_H

#include <limits>
#include <type_traits>

#include "src/geo/constants.h"
#include "src/geo/geodesic_series.h"

namespace basalt::geo {

/// The search ends with longitudes that agree to this, or no longer get closer below NOISE; radians.
inline constexpr double SETTLED = 1e-15;
inline constexpr double NOISE = 1e-13;
inline constexpr int MOST_SEARCH_PASSES = 60;
/// Shorter lines are those of the sphere that touches at their mean latitude, radians of arc: 100 m, where
/// the difference is 1e-10 m.
inline constexpr double SHORT_ARC = 1.6e-5;

/// The problem with signs and order changed so that start latitude <= 0, |end latitude| <= |start latitude|,
/// longitude in [0, pi].
template <typename Lane>
struct Problem {
    Direction<Lane> beta1, beta2;  ///< reduced latitudes
    Lane longitude;                ///< from start to end, radians
};

template <typename Lane>
struct Solution {
    Lane distance;
    Direction<Lane> azimuth1, azimuth2;
};

template <typename Lane>
BASALT_INLINE Lane square(const Lane& x) {
    return x * x;
}

template <typename Lane>
BASALT_INLINE Lane angle_of(const Direction<Lane>& direction) {
    return elementary::atan2(direction.sine, direction.cosine);
}

template <typename Mask, typename Lane>
BASALT_INLINE Direction<Lane> choose(const Mask& mask, const Direction<Lane>& a, const Direction<Lane>& b) {
    return {mask ? a.sine : b.sine, mask ? a.cosine : b.cosine};
}

template <typename Lane>
BASALT_INLINE Direction<Lane> reduced_latitude(const Lane& latitude) {
    const auto of = elementary::sin_cos(latitude);
    return Direction<Lane>{AXIS_RATIO * of.sine, of.cosine}.normalised();
}

/// What the paper calls epsilon, by k^2 = e'^2 cos^2 alpha0.
template <typename Lane>
BASALT_INLINE Lane epsilon_of(const Lane& k2) {
    return k2 / (2.0 * (1.0 + elementary::root(1.0 + k2)) + k2);
}

/// The line on the sphere with the curvature at the mean latitude, eq. 48 to 51.
template <typename Lane>
struct SphereLine {
    Direction<Lane> azimuth1, azimuth2;  ///< not of length 1
    Direction<Lane> arc;
    Lane scale;  ///< radius in semi-major axes

    BASALT_INLINE explicit SphereLine(const Problem<Lane>& p) {
        using namespace elementary;
        const Direction<Lane>& b1 = p.beta1;
        const Direction<Lane>& b2 = p.beta2;
        const Lane mean = (b1.cosine + b2.cosine) / 2.0;
        scale = root(1.0 - EXACT_ECCENTRICITY2 * mean * mean);
        const auto omega = sin_cos(smaller<Lane>(p.longitude / scale, all_of<Lane>(PI)));
        // 1 - cos(omega) without cancellation.
        const Lane versine =
            omega.cosine > 0.0 ? omega.sine * omega.sine / (1.0 + omega.cosine) : 1.0 - omega.cosine;
        const Lane north = b1.cosine * b2.sine - b1.sine * b2.cosine;
        azimuth1 = {b2.cosine * omega.sine, north + b1.sine * b2.cosine * versine};
        azimuth2 = {b1.cosine * omega.sine, north - b1.cosine * b2.sine * versine};
        arc = {root(azimuth1.sine * azimuth1.sine + azimuth1.cosine * azimuth1.cosine),
               b1.sine * b2.sine + b1.cosine * b2.cosine * omega.cosine};
    }
};

/// The geodesic that leaves the start with an azimuth, up to the end's latitude.
template <typename Lane>
struct Trial {
    Direction<Lane> azimuth2, sigma1, sigma2;
    Lane sigma;  ///< arc on the auxiliary sphere, radians
    Lane epsilon;
    Lane longitude;  ///< from the start to there, radians
    Lane slope;      ///< its derivative by the azimuth

    BASALT_INLINE Trial(const Problem<Lane>& p, const Direction<Lane>& azimuth1) {
        using elementary::root;
        const Direction<Lane>& b1 = p.beta1;
        const Direction<Lane>& b2 = p.beta2;
        const Lane sin_alpha0 = azimuth1.sine * b1.cosine;
        const Lane cos2_alpha0 = azimuth1.cosine * azimuth1.cosine + square(azimuth1.sine * b1.sine);
        // Near the equator only the sines differ, near a pole only the cosines.
        const auto same_size =
            (b1.cosine == b2.cosine) & (elementary::size_of(b1.sine) == elementary::size_of(b2.sine));
        // Eq. 45, by whichever difference of squares loses less.
        const Lane difference = b1.cosine < -b1.sine ? (b2.cosine - b1.cosine) * (b2.cosine + b1.cosine)
                                                     : (b1.sine - b2.sine) * (b1.sine + b2.sine);
        azimuth2.sine = same_size ? azimuth1.sine : sin_alpha0 / b2.cosine;
        azimuth2.cosine = same_size ? elementary::size_of(azimuth1.cosine)
                                    : root(square(azimuth1.cosine * b1.cosine) + difference) / b2.cosine;
        const Direction<Lane> s1 = {b1.sine, azimuth1.cosine * b1.cosine};
        const Direction<Lane> s2 = {b2.sine, azimuth2.cosine * b2.cosine};
        sigma1 = s1.normalised();
        sigma2 = s2.normalised();
        const Lane omega =
            angle_of(turn<Lane>({sin_alpha0 * s1.sine, s1.cosine}, {sin_alpha0 * s2.sine, s2.cosine}));
        sigma = angle_of(turn(sigma1, sigma2));
        const Lane k2 = SECOND_ECCENTRICITY2 * cos2_alpha0;
        epsilon = epsilon_of(k2);
        longitude =
            omega - FLATTENING * sin_alpha0 * longitude_series(epsilon).between(sigma1, sigma2, sigma);
        // Reduced length over b, eq. 38, with I1 - I2 to the second order: enough for a step of Newton's.
        const Lane twice1 = 2.0 * sigma1.sine * sigma1.cosine;
        const Lane twice2 = 2.0 * sigma2.sine * sigma2.cosine;
        const Lane j = epsilon * ((2.0 + epsilon) * sigma - (twice2 - twice1));
        const Lane length = root(1.0 + k2 * sigma2.sine * sigma2.sine) * sigma1.cosine * sigma2.sine -
                            root(1.0 + k2 * sigma1.sine * sigma1.sine) * sigma1.sine * sigma2.cosine -
                            sigma1.cosine * sigma2.cosine * j;
        slope = AXIS_RATIO * length / s2.cosine;  // eq. 46
    }
};

/// Azimuth of the start where the end is nearly its antipode: the astroid problem, eq. 53 to 57.
Direction<double> antipodal_azimuth(const Problem<double>& p);

/// The line between places neither of which is a pole, nor both on a meridian or the equator.
/// @param[in,out] is_wanted lanes to solve; of four, those of nearly opposite places are cleared
template <typename Lane, typename Mask>
BASALT_INLINE Solution<Lane> solve(const Problem<Lane>& p, Mask& is_wanted) {
    using namespace elementary;
    constexpr bool IS_SINGLE = std::is_same_v<Lane, double>;
    const SphereLine<Lane> sphere(p);
    const Direction<Lane>& arc = sphere.arc;
    const auto is_short = (arc.cosine > 0.0) & (arc.sine < SHORT_ARC);
    const auto is_opposite =
        (arc.cosine < 0.0) & (arc.sine < 6.0 * THIRD_FLATTENING * PI * p.beta1.cosine * p.beta1.cosine);
    if constexpr (!IS_SINGLE) {
        is_wanted &= ~is_opposite;
    }
    auto is_active = is_wanted & negated(is_short);
    Lane short_distance = {};
    if (is_any(is_short)) {
        short_distance = SEMI_MAJOR_AXIS * sphere.scale * angle_of(arc);
        if (!is_any(is_active)) {
            return {short_distance, sphere.azimuth1, sphere.azimuth2};
        }
    }
    Direction<Lane> azimuth = sphere.azimuth1.normalised();
    if constexpr (IS_SINGLE) {
        azimuth = is_opposite ? antipodal_azimuth(p) : azimuth;
    }
    // The longitude grows with the azimuth, from 0 to at least pi. Azimuths are kept as directions: near the
    // equator a cosine of 1e-12 decides. A lane that has settled keeps its azimuth.
    Direction<Lane> low = {Lane{}, all_of<Lane>(1.0)};
    Direction<Lane> high = {Lane{}, all_of<Lane>(-1.0)};
    Lane best = all_of<Lane>(std::numeric_limits<double>::infinity());
    for (int pass = 1;; ++pass) {
        const Trial<Lane> trial(p, azimuth);
        const Lane miss = trial.longitude - p.longitude;
        const Lane size = size_of(miss);
        is_active &= (size > SETTLED) & negated((size < NOISE) & (size >= best));
        Direction<Lane> next = azimuth;
        Lane step = {};
        if (is_any(is_active)) {
            step = is_active ? -miss / trial.slope : all_of<Lane>(TINY);
            const auto by = sin_cos(step);
            next = Direction<Lane>{azimuth.sine * by.cosine + azimuth.cosine * by.sine,
                                   azimuth.cosine * by.cosine - azimuth.sine * by.sine}
                       .normalised();
            is_active &= (next.sine != azimuth.sine) | (next.cosine != azimuth.cosine);
        }
        if (!is_any(is_active) || pass == MOST_SEARCH_PASSES) {
            // The line ends beyond the end's longitude by `miss`; its part along the line is subtracted.
            const Lane length =
                distance_series(trial.epsilon).between(trial.sigma1, trial.sigma2, trial.sigma);
            const Lane beyond = SEMI_MAJOR_AXIS * p.beta2.cosine * trial.azimuth2.sine * miss;
            return {is_short ? short_distance : POLAR_RADIUS * length - beyond,
                    choose(is_short, sphere.azimuth1, azimuth),
                    choose(is_short, sphere.azimuth2, trial.azimuth2)};
        }
        best = smaller(size, best);
        const auto is_beyond = miss > 0.0;
        high = choose(is_beyond, azimuth, high);
        low = choose(is_beyond, low, azimuth);
        const Lane above = turn(low, next).sine;
        const Lane below = turn(next, high).sine;
        const auto is_outside = negated((size_of(step) < 1.0) & (above > 0.0) & (below > 0.0));
        if (is_any(is_outside)) {
            next = choose(is_outside,
                          Direction<Lane>{low.sine + high.sine, low.cosine + high.cosine}.normalised(), next);
        }
        azimuth = choose(is_active, next, azimuth);
    }
}

template <typename Lane>
struct Line {
    Lane distance, azimuth_from, azimuth_to;
};

/// A problem with signs and order as they are solved, and the way back.
template <typename Lane>
struct Arranged {
    elementary::Mask<Lane> is_swapped;
    Lane north_sign, east_sign, start_latitude;
    Problem<Lane> problem;

    /// @param longitude from one place to the other, in [-pi, pi]
    BASALT_INLINE Arranged(const Lane& from, const Lane& to, const Lane& longitude) {
        const Lane one = elementary::all_of<Lane>(1.0);
        is_swapped = elementary::size_of(from) < elementary::size_of(to);
        const Lane east = is_swapped ? -longitude : longitude;
        start_latitude = is_swapped ? to : from;
        north_sign = start_latitude > 0.0 ? -one : one;
        east_sign = east < 0.0 ? -one : one;
        start_latitude *= north_sign;
        problem = {reduced_latitude<Lane>(start_latitude),
                   reduced_latitude<Lane>((is_swapped ? from : to) * north_sign), east * east_sign};
    }

    BASALT_INLINE Line<Lane> line(const Solution<Lane>& solution) const {
        const Lane north = is_swapped ? -north_sign : north_sign;
        const Lane east = is_swapped ? -east_sign : east_sign;
        const Direction<Lane> first = choose(is_swapped, solution.azimuth2, solution.azimuth1);
        const Direction<Lane> last = choose(is_swapped, solution.azimuth1, solution.azimuth2);
        // + 0.0 so that a northward line gives 0 and not -0.
        return {solution.distance, elementary::atan2(east * first.sine + 0.0, north * first.cosine),
                elementary::atan2(east * last.sine + 0.0, north * last.cosine)};
    }
};

/// Longitude from one place to another in [-pi, pi], of a difference and the whole turns that it is nearest
/// to.
template <typename Lane>
BASALT_INLINE Lane less_turns(const Lane& difference, const Lane& turns) {
    constexpr double TWO_PI_REST = 2.4492935982947064e-16;
    const Lane pi = elementary::all_of<Lane>(PI);
    const Lane longitude = (difference - turns * TWO_PI) - turns * TWO_PI_REST;
    return longitude < -pi ? -pi : (pi < longitude ? pi : longitude);
}

}  // namespace basalt::geo

#endif
