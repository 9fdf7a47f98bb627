#include "local_plane.h"

namespace {

constexpr double SEMI_MAJOR_AXIS = 6378137.0;  // WGS84, metres

geo_vector on_ellipsoid(double longitude, double latitude) {
    const geo_llh place = {_degtorad(latitude), _degtorad(longitude), 0.0};
    // The one place whose three numbers are all 0 is refused as a record never set.
    geo_vector xyz = {SEMI_MAJOR_AXIS, 0.0, 0.0};
    _llh2xyz(&place, &xyz);
    return xyz;
}

}  // namespace

LocalPlane::LocalPlane(double longitude, double latitude) : m_origin(on_ellipsoid(longitude, latitude)) {}

geo_nee LocalPlane::local(double longitude, double latitude) const {
    const geo_vector xyz = on_ellipsoid(longitude, latitude);
    geo_nee point = {};
    _xyz2nez(&m_origin, &xyz, &point);
    return point;
}

geo_nee LocalPlane::to_grid(double longitude, double latitude, double elevation) const {
    geo_nee point = local(longitude, latitude);
    point.elevation = elevation;
    return point;
}

double LocalPlane::shortening(double longitude, double latitude) const {
    // The plumb lines of place and origin meet at an angle; 1 less its cosine is the drop over the radius.
    return -local(longitude, latitude).elevation / SEMI_MAJOR_AXIS;
}
