#include "src/geo/cross_track.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "basalt/geo/geodesic.h"
#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/geodesic_line.h"

namespace basalt::geo {

namespace {

constexpr int MOST_FOOT_PASSES = 100;
/// Closer than this the point is on the line; metres.
constexpr double ON_THE_LINE = 1e-6;
/// What the coordinates of a foot resolve, metres.
constexpr double FINEST_STEP = 5e-9;
/// Closer than this to the point's antipode every direction leads to the point and none is square to the
/// line: from here on rounding alone would settle what is; metres.
constexpr double AT_THE_ANTIPODE = FINEST_STEP / RAY_TOLERANCE;
/// How far from where the search by steps would end the foot may be, metres: the distance changes by 0.4 % of
/// it, what ellipsoid and sphere differ by.
constexpr double FOOT_TOLERANCE = 5e-5;

double length_of(double x, double y) {
    return std::sqrt(x * x + y * y);
}

/// The point as it is seen from a place on the line, on the sphere: all without an angle.
struct Sight {
    double ahead;     ///< sine of the distance, times the cosine of the angle between line and sight
    double right;     ///< the same, times the sine of that angle
    double cosine;    ///< of the distance
    double distance;  ///< its sine, which is the length of (ahead, right)

    /// Cosine of the angle between line and sight: 0 at the foot, positive before it.
    double skew() const { return ahead / distance; }
};

class Target {
public:
    explicit Target(const geo_llh& p)
        : m_sine(std::sin(p.latitude)), m_cosine(std::cos(p.latitude)), m_longitude(p.longitude) {}

    Sight seen_from(const LineEnd& foot, double start_longitude) const {
        const double east = m_longitude - (start_longitude + foot.longitude_change);
        const double sin_east = std::sin(east);
        const double cos_east = std::cos(east);
        const double length = length_of(foot.latitude_sine, foot.latitude_cosine);
        const double sine = foot.latitude_sine / length;
        const double cosine = foot.latitude_cosine / length;
        // Components of the sight towards north and east at the foot.
        const double v = cosine * m_sine - sine * m_cosine * cos_east;
        const double u = sin_east * m_cosine;
        const double azimuth_length = length_of(foot.azimuth_sine, foot.azimuth_cosine);
        const double along_north = foot.azimuth_cosine / azimuth_length;
        const double along_east = foot.azimuth_sine / azimuth_length;
        return {u * along_east + v * along_north, u * along_north - v * along_east,
                sine * m_sine + cosine * m_cosine * cos_east, length_of(u, v)};
    }

private:
    double m_sine;
    double m_cosine;
    double m_longitude;
};

/// The skews a search may end with: within `width` of `aim`. A search by small steps ends as soon as the skew
/// is below the tolerance, on the side it came from. A long sight turns that into a foot some way short of
/// square, so this is where to end; a short one leaves the whole tolerance, and below 1 cm what rounding
/// resolves.
struct Goal {
    double aim;
    double width;

    Goal(double distance, double side)
        : width(std::max(std::min(RAY_TOLERANCE, FOOT_TOLERANCE / distance), FINEST_STEP / distance)) {
        aim = std::copysign(std::max(RAY_TOLERANCE - width, 0.0), side);
    }
};

}  // namespace

double cross_track(const geo_llh& a, const geo_llh& b, const geo_llh& p, int& passes) {
    const double bearing = geo_vincenty_bearing(a, b);
    double along =
        std::cos(geo_grid_divergence(bearing, geo_vincenty_bearing(a, p))) * geo_vincenty_distance(a, p);
    const GeodesicLine line(a.latitude, bearing);
    const Target target(p);
    LineEnd best_foot = line.at(along);
    Sight best = target.seen_from(best_foot, a.longitude);
    double best_miss = std::numeric_limits<double>::infinity();
    const double side = best.ahead;
    // Places between which the foot lies: the point is ahead of the first, behind the second.
    double low = -std::numeric_limits<double>::infinity();
    double high = std::numeric_limits<double>::infinity();
    double step = std::numeric_limits<double>::infinity();
    LineEnd foot = best_foot;
    Sight sight = best;
    for (passes = 1;; ++passes) {
        if (sight.distance * SPHERE_RADIUS < ON_THE_LINE && sight.cosine > 0.0) {
            return 0.0;
        }
        const Goal goal(sight.distance * SPHERE_RADIUS, side);
        const double miss = std::abs(sight.skew() - goal.aim);
        const bool is_opposite = sight.cosine < 0.0 && sight.distance * SPHERE_RADIUS < AT_THE_ANTIPODE;
        if (miss < best_miss && !is_opposite) {
            best_foot = foot;
            best = sight;
            best_miss = miss;
        }
        // Not "miss < width": NaN ends the search too.
        const bool is_square =
            !(miss >= goal.width) || (passes == 1 && std::abs(sight.skew()) < RAY_TOLERANCE);
        if ((is_square && !is_opposite) || passes == MOST_FOOT_PASSES) {
            break;
        }
        (sight.skew() > goal.aim ? low : high) = along;
        // Napier's rule for the legs of a right-angled triangle gives the foot on a great circle; a geodesic
        // of the ellipsoid leaves the next pass a fraction of the way. From the second step on that fraction
        // is known, and what all further steps would add up to is made in one: this saves the last pass.
        const double leg = SPHERE_RADIUS * (std::atan2(sight.ahead, sight.cosine) -
                                            std::atan2(goal.aim * sight.distance, std::abs(sight.cosine)));
        const double fraction = leg / step;
        step = std::abs(fraction) < 0.1 ? leg / (1.0 - fraction) : leg;
        along += step;
        if (!(along > low && along < high)) {
            along = low + (high - low) / 2.0;
        }
        // Not finite: the step was lost in rounding before the foot was enclosed.
        if (!(high - low > FINEST_STEP) || !std::isfinite(along)) {
            break;
        }
        foot = line.at(along);
        sight = target.seen_from(foot, a.longitude);
    }
    const geo_llh end = {std::atan2(best_foot.latitude_sine, best_foot.latitude_cosine),
                         a.longitude + best_foot.longitude_change, 0.0};
    const double distance = geo_vincenty_distance(end, p);
    return best.right >= 0.0 ? -distance : distance;
}

}  // namespace basalt::geo
