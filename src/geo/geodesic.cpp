#include "basalt/geo/geodesic.h"

#include <cmath>

#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/geodesic_line.h"

using namespace basalt::geo;

void geo_vincenty_direct(geo_llh start, double azimuth, double distance, double& finalAzimuth, geo_llh& end) {
    const LineEnd at = GeodesicLine(start.latitude, azimuth).at(distance);
    finalAzimuth = std::atan2(at.azimuth_sine, at.azimuth_cosine);
    end.latitude = std::atan2(at.latitude_sine, at.latitude_cosine);
    end.longitude = start.longitude + at.longitude_change;
    end.height = start.height;
}

double geo_vincenty_distance(geo_llh a, geo_llh b) {
    const double north = std::sin((b.latitude - a.latitude) / 2.0);
    const double east = std::sin((b.longitude - a.longitude) / 2.0);
    double h = north * north + std::cos(a.latitude) * std::cos(b.latitude) * (east * east);
    // At the antipode h may round above 1, and the other root would be NaN.
    if (h > 1.0) {
        h = 1.0;
    }
    return 2.0 * std::atan2(std::sqrt(h), std::sqrt(1.0 - h)) * SPHERE_RADIUS;
}

double geo_vincenty_bearing(geo_llh from, geo_llh to) {
    const double change = to.longitude - from.longitude;
    const double cosine = std::cos(to.latitude);
    return geo_normalised_bearing(
        std::atan2(std::sin(change) * cosine, std::cos(from.latitude) * std::sin(to.latitude) -
                                                  std::sin(from.latitude) * cosine * std::cos(change)));
}
