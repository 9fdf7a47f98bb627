#include "basalt/geo/observations.h"

#include <cmath>

#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/elementary/elementary.h"

using namespace basalt::geo;

namespace {

template <typename... Values>
bool any_null(Values... values) {
    return (basalt::is_null(values) || ...);
}

}  // namespace

geo_hvd& geo_normalise_obs(geo_hvd& obs) {
    if (any_null(obs.vertical) || obs.vertical <= PI) {
        return obs;
    }
    obs.vertical = TWO_PI - obs.vertical;
    if (!any_null(obs.horizontal)) {
        obs.horizontal = geo_normalised_bearing(obs.horizontal + PI);
    }
    return obs;
}

void geo_reduce_obs(const geo_hvd& obs, const geo_nee& station, double heightOffset, geo_nee& out,
                    double scaleFactor) {
    if (any_null(obs.horizontal, obs.vertical, obs.distance)) {
        out = {GEO_NULL, GEO_NULL, GEO_NULL};
        return;
    }
    const auto [vertical, horizontal] = elementary::sin_cos_two(obs.vertical, obs.horizontal);
    const double run = vertical.sine * obs.distance * scaleFactor;
    const double rise = vertical.cosine * obs.distance;
    out = {horizontal.cosine * run + station.north, horizontal.sine * run + station.east,
           heightOffset + station.elevation + rise};
}

void geo_calc_obs(const geo_nee& from, double fromHeight, const geo_nee& to, double toHeight, geo_hvd& out,
                  double scaleFactor) {
    if (any_null(from.north, from.east, from.elevation, to.north, to.east, to.elevation, fromHeight)) {
        return;
    }
    const double north = to.north - from.north;
    const double east = to.east - from.east;
    const double rise = to.elevation + toHeight - from.elevation - fromHeight;
    const double run = std::sqrt(east * east + north * north) * scaleFactor;
    out.horizontal = geo_grid_bearing(from, to);
    out.vertical = geo_normalised_bearing(HALF_PI - elementary::atan2(rise, run));
    out.distance = std::sqrt(run * run + rise * rise);
}

namespace {

geo_nee followed(const geo_nee& start, double bearing, double distance, double elevation) {
    const auto [sine, cosine] = elementary::sin_cos(bearing);
    return {start.north + cosine * distance, start.east + sine * distance, elevation};
}

}  // namespace

void geo_grid_follow(const geo_nee& start, double bearing, double distance, double slopeAngle, geo_nee& out) {
    const bool vertical = slopeAngle == HALF_PI || slopeAngle == -HALF_PI;
    const double elevation =
        vertical ? start.elevation : start.elevation + elementary::tan(slopeAngle) * distance;
    out = followed(start, bearing, distance, elevation);
}

void geo_grid_follow2(const geo_nee& start, double bearing, double distance, double grade, geo_nee& out) {
    const double elevation = grade == 0.0 ? start.elevation : start.elevation + distance * grade;
    out = followed(start, bearing, distance, elevation);
}

void geo_grid_follow3(const geo_nee& start, double bearing, double distance, double heightChange,
                      geo_nee& out) {
    out = followed(start, bearing, distance, start.elevation + heightChange);
}
