#include "basalt/geo/geodesic.h"

#include "src/geo/constants.h"
#include "src/geo/directions.h"
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
    return sphere_distance(elementary::sin((b.latitude - a.latitude) / 2.0),
                           elementary::sin((b.longitude - a.longitude) / 2.0), elementary::cos(a.latitude),
                           elementary::cos(b.latitude));
}

double geo_vincenty_bearing(geo_llh from, geo_llh to) {
    const auto [start, end] = elementary::sin_cos_two(from.latitude, to.latitude);
    return sphere_bearing<double>(start, end, elementary::sin_cos(to.longitude - from.longitude));
}
