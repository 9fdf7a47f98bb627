// The one place where degrees become metres.
#ifndef WORKAREA_LOCAL_PLANE_H
#define WORKAREA_LOCAL_PLANE_H

#include <basalt/geo.h>

/// A plane of metres north and east that touches the WGS84 ellipsoid at an origin, all other places dropped
/// on it along the origin's plumb line.
///
/// Lengths at the origin are true. Towards or away from it they come out short by about d^2 / 2 R^2 at a
/// distance d: 1 ppm at 9 km, 120 ppm at 100 km; lengths across that direction stay true to the second order.
/// Lengths are those on the ellipsoid: 500 m above it the ground is 78 ppm longer.
class LocalPlane {
public:
    /// Origin in degrees.
    LocalPlane(double longitude, double latitude);

    /// Grid point of a place in degrees. Its elevation is the place's own, in metres, not what is left above
    /// the plane: that falls away with the earth's curvature, 8 cm at 1 km, and heights are what earthwork
    /// counts.
    geo_nee to_grid(double longitude, double latitude, double elevation) const;

    /// How much too short lengths towards the origin are at a place in degrees: 0 at the origin.
    double shortening(double longitude, double latitude) const;

private:
    geo_nee local(double longitude, double latitude) const;

    basalt::LocalFrame m_frame;
};

#endif
