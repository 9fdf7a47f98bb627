#include "basalt/geo/geodesic.h"

#include <cmath>

#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/elementary/elementary.h"
#include "src/geo/geodesic_line.h"

using namespace basalt::geo;

void geo_vincenty_direct(geo_llh start, double azimuth, double distance, double& finalAzimuth, geo_llh& end) {
    const LineEnd at = GeodesicLine(start.latitude, azimuth).at(distance);
    const auto [forward, latitude] =
        elementary::atan2_two(at.azimuth_sine, at.azimuth_cosine, at.latitude_sine, at.latitude_cosine);
    finalAzimuth = forward;
    end.latitude = latitude;
    end.longitude = start.longitude + at.longitude_change;
    end.height = start.height;
}

double geo_vincenty_distance(geo_llh a, geo_llh b) {
    const double north = elementary::sin((b.latitude - a.latitude) / 2.0);
    const double east = elementary::sin((b.longitude - a.longitude) / 2.0);
    double h = north * north + elementary::cos(a.latitude) * elementary::cos(b.latitude) * (east * east);
    // At the antipode h may round above 1, and the other root would be NaN.
    if (h > 1.0) {
        h = 1.0;
    }
    return 2.0 * elementary::atan2(std::sqrt(h), std::sqrt(1.0 - h)) * SPHERE_RADIUS;
}

double geo_vincenty_bearing(geo_llh from, geo_llh to) {
    const auto [start, end] = elementary::sin_cos_two(from.latitude, to.latitude);
    const elementary::SineCosine change = elementary::sin_cos(to.longitude - from.longitude);
    return geo_normalised_bearing(elementary::atan2(
        change.sine * end.cosine, start.cosine * end.sine - start.sine * end.cosine * change.cosine));
}
