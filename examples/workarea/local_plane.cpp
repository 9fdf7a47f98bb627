#include "local_plane.h"

namespace {

constexpr double SEMI_MAJOR_AXIS = 6378137.0;  // WGS84, metres

geo_llh on_ellipsoid(double longitude, double latitude) {
    // The library refuses the all-zero record. This height vanishes in the rounding of a coordinate.
    constexpr double NO_HEIGHT = 1e-10;
    return {_degtorad(latitude), _degtorad(longitude), latitude == 0 && longitude == 0 ? NO_HEIGHT : 0.0};
}

}  // namespace

LocalPlane::LocalPlane(double longitude, double latitude) : m_frame(on_ellipsoid(longitude, latitude)) {}

geo_nee LocalPlane::local(double longitude, double latitude) const {
    return m_frame.to_local(on_ellipsoid(longitude, latitude));
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
