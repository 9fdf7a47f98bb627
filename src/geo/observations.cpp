#include "basalt/geo/observations.h"

#include <cmath>

#include "basalt/geo/plane.h"
#include "src/geo/directions.h"

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
    const auto [north, east, elevation] =
        reduced<double>(obs.horizontal, obs.vertical, obs.distance,
                        {station.north, station.east, station.elevation}, heightOffset, scaleFactor);
    out = {north, east, elevation};
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

template <Rise GIVEN>
void follow(const geo_nee& start, double bearing, double distance, double rise, geo_nee& out) {
    const auto [north, east, elevation] =
        followed<GIVEN, double>({start.north, start.east, start.elevation}, bearing, distance, rise);
    out = {north, east, elevation};
}

}  // namespace

void geo_grid_follow(const geo_nee& start, double bearing, double distance, double slopeAngle, geo_nee& out) {
    follow<Rise::ANGLE>(start, bearing, distance, slopeAngle, out);
}

void geo_grid_follow2(const geo_nee& start, double bearing, double distance, double grade, geo_nee& out) {
    follow<Rise::GRADE>(start, bearing, distance, grade, out);
}

void geo_grid_follow3(const geo_nee& start, double bearing, double distance, double heightChange,
                      geo_nee& out) {
    follow<Rise::METRES>(start, bearing, distance, heightChange, out);
}
