// The grid's position on the earth.
#ifndef FIELDBOOK_EARTH_H
#define FIELDBOOK_EARTH_H

#include <basalt/geo.h>

#include "precision.h"

/// A point on the earth with its standard deviations.
struct EarthPoint {
    geo_vector xyz;
    geo_llh llh;
    geo_nee sigma_neu;  ///< metres: north, east, up
    geo_llh sigma_llh;  ///< radians and metres
};

/// Takes the grid for the plane that touches the WGS84 ellipsoid's parallel surface at an anchor, grid north
/// for true north there, and elevation differences for distances from that plane.
class Earth {
public:
    /// A grid point and its geodetic position. InputError when the position has no Cartesian counterpart in
    /// the library.
    Earth(const geo_nee& anchor, const geo_llh& position, double scale);

    EarthPoint locate(const geo_nee& point, const Covariance& covariance) const;

private:
    geo_nee m_anchor;
    double m_scale;
    geo_vector m_origin;
    geo_vector m_axes[3];  // of north, east and up, earth-centred
};

#endif
