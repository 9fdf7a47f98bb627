#include "src/geo/cross_track.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "basalt/geo/geodesic.h"
#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/elementary/elementary.h"
#include "src/geo/geodesic_line.h"

namespace basalt::geo {

namespace {

constexpr int MOST_FOOT_PASSES = 100;
/// Closer than this the point is on the line; metres.
constexpr double ON_THE_LINE = 1e-6;
/// Resolution of a foot's coordinates, metres.
constexpr double FINEST_STEP = 5e-9;
/// Closer than this to the point's antipode, metres, rounding alone decides what is square to the line.
constexpr double AT_THE_ANTIPODE = FINEST_STEP / RAY_TOLERANCE;
/// Tolerance of the foot along the line, metres. The result changes by 0.4 % of it.
constexpr double FOOT_TOLERANCE = 5e-5;

double length_of(double x, double y) {
    return std::sqrt(x * x + y * y);
}

/// Direction of the point from a place on the line, on the sphere.
struct Sight {
    double ahead;     ///< sine of the distance times the cosine of the angle between line and sight
    double right;     ///< sine of the distance times the sine of that angle
    double cosine;    ///< cosine of the distance
    double distance;  ///< sine of the distance, the length of (ahead, right)

    /// Cosine of the angle between line and sight: 0 at the foot, positive before it.
    double skew() const { return ahead / distance; }
};

class Target {
public:
    explicit Target(const geo_llh& p)
        : m_latitude(elementary::sin_cos(p.latitude)), m_longitude(p.longitude) {}

    Sight seen_from(const LineEnd& foot, double start_longitude) const {
        const double east = m_longitude - (start_longitude + foot.longitude_change);
        const auto [sin_east, cos_east] = elementary::sin_cos(east);
        const double length = length_of(foot.latitude_sine, foot.latitude_cosine);
        const double sine = foot.latitude_sine / length;
        const double cosine = foot.latitude_cosine / length;
        // Components of the sight towards north and east at the foot.
        const double v = cosine * m_latitude.sine - sine * m_latitude.cosine * cos_east;
        const double u = sin_east * m_latitude.cosine;
        const double azimuth_length = length_of(foot.azimuth_sine, foot.azimuth_cosine);
        const double along_north = foot.azimuth_cosine / azimuth_length;
        const double along_east = foot.azimuth_sine / azimuth_length;
        return {u * along_east + v * along_north, u * along_north - v * along_east,
                sine * m_latitude.sine + cosine * m_latitude.cosine * cos_east, length_of(u, v)};
    }

private:
    elementary::SineCosine m_latitude;
    double m_longitude;
};

/// Skews that end the search: within `width` of `aim`. A search by steps of a metre ends once the skew is
/// below the tolerance, on the side it came from; for a long sight that is a foot some way short of square.
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
    double along = elementary::cos(geo_grid_divergence(bearing, geo_vincenty_bearing(a, p))) *
                   geo_vincenty_distance(a, p);
    const GeodesicLine line(a.latitude, bearing);
    const Target target(p);
    LineEnd best_foot = line.at(along);
    Sight best = target.seen_from(best_foot, a.longitude);
    double best_miss = std::numeric_limits<double>::infinity();
    const double side = best.ahead;
    // Bounds of the foot: the point is ahead of the first and behind the second.
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
        // Napier's rule gives the foot on a great circle; on the ellipsoid each step leaves a fraction of the
        // way. From the second step on that fraction is known, and the sum of all further steps is taken.
        const double leg =
            SPHERE_RADIUS * (elementary::atan2(sight.ahead, sight.cosine) -
                             elementary::atan2(goal.aim * sight.distance, std::abs(sight.cosine)));
        const double fraction = leg / step;
        step = std::abs(fraction) < 0.1 ? leg / (1.0 - fraction) : leg;
        along += step;
        if (!(along > low && along < high)) {
            along = low + (high - low) / 2.0;
        }
        // Not finite when the step was lost to rounding before the foot had two bounds.
        if (!(high - low > FINEST_STEP) || !std::isfinite(along)) {
            break;
        }
        foot = line.at(along);
        sight = target.seen_from(foot, a.longitude);
    }
    const geo_llh end = {elementary::atan2(best_foot.latitude_sine, best_foot.latitude_cosine),
                         a.longitude + best_foot.longitude_change, 0.0};
    const double distance = geo_vincenty_distance(end, p);
    return best.right >= 0.0 ? -distance : distance;
}

}  // namespace basalt::geo

double geo_vincenty_crosstrack(geo_llh a, geo_llh b, geo_llh p) {
    int passes = 0;
    return basalt::geo::cross_track(a, b, p, passes);
}
