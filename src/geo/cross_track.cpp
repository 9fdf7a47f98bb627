#include "src/geo/cross_track.h"

#include <cmath>
#include <limits>

#include "basalt/geo/geodesic.h"
#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/geodesic_line.h"

namespace basalt::geo {

namespace {

constexpr int MOST_PASSES = 100;
/// Closer than this the point is on the line; metres.
constexpr double ON_THE_LINE = 1e-6;
/// What the coordinates of a foot resolve, metres.
constexpr double FINEST_STEP = 1e-9;

/// The point as it is seen from a place on the line, on the sphere: all without an angle.
struct Sight {
    double ahead;     ///< sine of the distance, times the cosine of the angle between line and sight
    double right;     ///< the same, times the sine of that angle
    double cosine;    ///< of the distance
    double distance;  ///< its sine, which is the length of (ahead, right)

    /// How far from square: the sine of the angle that is left.
    double skew() const { return std::abs(ahead) / distance; }
};

class Target {
public:
    explicit Target(const geo_llh& p)
        : m_sine(std::sin(p.latitude)), m_cosine(std::cos(p.latitude)), m_longitude(p.longitude) {}

    Sight seen_from(const LineEnd& foot, double start_longitude) const {
        const double east = m_longitude - (start_longitude + foot.longitude_change);
        const double sin_east = std::sin(east);
        const double cos_east = std::cos(east);
        const double length = std::hypot(foot.latitude_sine, foot.latitude_cosine);
        const double sine = foot.latitude_sine / length;
        const double cosine = foot.latitude_cosine / length;
        // Components of the sight towards north and east at the foot.
        const double v = cosine * m_sine - sine * m_cosine * cos_east;
        const double u = sin_east * m_cosine;
        const double azimuth_length = std::hypot(foot.azimuth_sine, foot.azimuth_cosine);
        const double along_north = foot.azimuth_cosine / azimuth_length;
        const double along_east = foot.azimuth_sine / azimuth_length;
        return {u * along_east + v * along_north, u * along_north - v * along_east,
                sine * m_sine + cosine * m_cosine * cos_east, std::sqrt(u * u + v * v)};
    }

private:
    double m_sine;
    double m_cosine;
    double m_longitude;
};

}  // namespace

double cross_track(const geo_llh& a, const geo_llh& b, const geo_llh& p, int& passes) {
    const double bearing = geo_vincenty_bearing(a, b);
    double along =
        std::cos(geo_grid_divergence(bearing, geo_vincenty_bearing(a, p))) * geo_vincenty_distance(a, p);
    const GeodesicLine line(a.latitude, bearing);
    const Target target(p);
    LineEnd best_foot = {};
    Sight best = {};
    double best_skew = std::numeric_limits<double>::infinity();
    // The foot lies between the last place that has the point ahead and the first that has it behind.
    double low = -std::numeric_limits<double>::infinity();
    double high = std::numeric_limits<double>::infinity();
    for (passes = 1; passes <= MOST_PASSES; ++passes) {
        const LineEnd foot = line.at(along);
        const Sight sight = target.seen_from(foot, a.longitude);
        if (sight.distance * SPHERE_RADIUS < ON_THE_LINE && sight.cosine > 0.0) {
            return 0.0;
        }
        const double skew = sight.skew();
        // Not "skew < best_skew": NaN is taken too, and ends the search.
        if (!(skew >= best_skew)) {
            best_foot = foot;
            best = sight;
            best_skew = skew;
        }
        if (!(skew >= RAY_TOLERANCE)) {
            break;
        }
        (sight.ahead > 0.0 ? low : high) = along;
        // Napier's rule gives the foot of a great circle, whose miss is what ellipsoid and sphere differ by:
        // a hundredth or less is left after each pass.
        along += SPHERE_RADIUS * std::atan2(sight.ahead, sight.cosine);
        if (!(along > low && along < high)) {
            along = low + (high - low) / 2.0;
        }
        // Nothing is left to halve, or the step was lost in rounding before the foot was enclosed.
        if (!(high - low > FINEST_STEP) || !std::isfinite(along)) {
            break;
        }
    }
    const geo_llh foot = {std::atan2(best_foot.latitude_sine, best_foot.latitude_cosine),
                          a.longitude + best_foot.longitude_change, 0.0};
    const double distance = geo_vincenty_distance(foot, p);
    return best.right >= 0.0 ? -distance : distance;
}

}  // namespace basalt::geo
