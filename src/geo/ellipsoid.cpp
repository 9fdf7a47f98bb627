#include "basalt/geo/ellipsoid.h"

#include <cmath>
#include <optional>

#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/ellipsoid_formulas.h"
#include "src/geo/frame_axes.h"

using namespace basalt::geo;

namespace {

/// a (1 - e^2), metres.
constexpr double MERIDIAN_NUMERATOR = 6335439.327292829;

/// From this tolerance on (radians) the first estimate of the latitude is kept.
constexpr double NO_ITERATION = 10.0;

geo_vector cartesian(const geo_llh& llh) {
    const Cartesian<double> of(llh.latitude, llh.longitude, llh.height);
    return {of.x, of.y, of.z};
}

/// Latitude and height by the textbook iteration; p is the distance from the axis.
bool convert_plainly(double p, double z, double tolerance, geo_llh& llh) {
    double latitude = elementary::atan2(z, p * FIRST_ESTIMATE_FACTOR);
    double sine = elementary::sin(latitude);
    if (tolerance < NO_ITERATION) {
        double previous = -100.0;
        double change = 0.0;
        int passes = 0;
        do {
            latitude = elementary::atan2(prime_vertical_radius(sine) * ECCENTRICITY2 * sine + z, p);
            sine = elementary::sin(latitude);
            change = std::abs(latitude - previous);
            previous = latitude;
            if (++passes > MOST_PASSES) {
                return false;
            }
        } while (!(change <= tolerance));
    }
    const double n = prime_vertical_radius(sine);
    llh.latitude = latitude;
    llh.height = std::abs(latitude) <= POLAR_LATITUDE ? p / elementary::cos(latitude) - n
                                                      : z / sine - n + n * ECCENTRICITY2;
    return true;
}

}  // namespace

std::optional<FrameAxes> basalt::geo::axes_at(const geo_vector& xyz) {
    const double p = std::sqrt(xyz.x * xyz.x + xyz.y * xyz.y);
    double q = 0.0;
    // Off the axis no angle is needed.
    if (p > 1.0 && settle_quickly(p, xyz.z, LOCAL_FRAME_TOLERANCE, q)) {
        const double length = std::sqrt(p * p + q * q);
        return FrameAxes(q / length, p / length, xyz.y / p, xyz.x / p);
    }
    geo_llh at = {};
    if (_xyz2llh(&xyz, &at, LOCAL_FRAME_TOLERANCE) == 0) {
        return std::nullopt;
    }
    const auto [latitude, longitude] = elementary::sin_cos_two(at.latitude, at.longitude);
    return FrameAxes(latitude.sine, latitude.cosine, longitude.sine, longitude.cosine);
}

void _wgs84curvature(double latitude, double& meridianRadius, double& primeVerticalRadius) {
    const double w = curvature_factor(elementary::sin(latitude));
    meridianRadius = MERIDIAN_NUMERATOR / (w * w * w);
    primeVerticalRadius = SEMI_MAJOR_AXIS / w;
}

int _xyz2llh(const geo_vector* xyz, geo_llh* llh, double tolerance) {
    if (xyz->x == 0.0 && xyz->y == 0.0 && xyz->z == 0.0) {
        return 0;
    }
    const double p = std::sqrt(xyz->x * xyz->x + xyz->y * xyz->y);
    geo_llh result = {};
    // First: it overlaps with the dependent roots and divisions of the latitude.
    result.longitude = elementary::atan2(xyz->y, xyz->x);
    if (!convert_quickly(p, xyz->z, tolerance, result.latitude, result.height) &&
        !convert_plainly(p, xyz->z, tolerance, result)) {
        return 0;
    }
    *llh = result;
    return 1;
}

int _llh2xyz(const geo_llh* llh, geo_vector* xyz) {
    if (llh->latitude == 0.0 && llh->longitude == 0.0 && llh->height == 0.0) {
        return 0;
    }
    *xyz = cartesian(*llh);
    return 1;
}

int _xyz2nez(const geo_vector* origin, const geo_vector* point, geo_nee* out) {
    const std::optional<FrameAxes> axes = axes_at(*origin);
    if (!axes) {
        return 1;
    }
    const geo_vector d = {point->x - origin->x, point->y - origin->y, point->z - origin->z};
    out->north = along(axes->north, d);
    out->east = along(axes->east, d);
    out->elevation = along(axes->up, d);
    return 1;
}

int llh_equal(const geo_llh& a, const geo_llh& b) {
    // Not by _llh2xyz(), which refuses the all-zero point.
    geo_vector va = cartesian(a);
    geo_vector vb = cartesian(b);
    return geo_vector_length(va, vb) < EQUALITY_TOLERANCE ? 1 : 0;
}
