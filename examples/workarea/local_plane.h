// The one place where degrees become metres.
#ifndef WORKAREA_LOCAL_PLANE_H
#define WORKAREA_LOCAL_PLANE_H

#include <basalt/geo.h>

/// A plane of metres north and east of an origin, by a plain local scale: the lengths of a degree on the
/// WGS84 ellipsoid along the meridian and along the parallel of the origin.
///
/// Good to a few ppm along the origin's parallel. Away from it the scale east is off by about 0.157
/// tan(latitude) ppm for each metre north or south, with opposite signs on the two sides: at latitude 36 a
/// work area 2 km high is within 120 ppm at its edges, one 30 km high within 0.2 % (east_scale_error says how
/// much). With the origin at the work area's middle latitude most of this cancels in areas and volumes.
/// Lengths are those on the ellipsoid: 500 m above it the ground is 78 ppm longer.
///
/// Source of the radii of curvature: Torge, Geodesy, 2001, section 4.1.
class LocalPlane {
public:
    /// Origin in degrees.
    LocalPlane(double longitude, double latitude);

    /// Grid point of a place in degrees, elevation in metres taken over as it is.
    geo_nee to_grid(double longitude, double latitude, double elevation) const;

    /// Relative error of lengths east at a latitude in degrees: positive where the plane stretches.
    double east_scale_error(double latitude) const;

private:
    double m_longitude;
    double m_latitude;
    double m_metres_north;  // per degree
    double m_metres_east;
};

#endif
