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
    /// A grid point and its geodetic position. InputError for the position that the library does not take.
    Earth(const geo_nee& anchor, const geo_llh& position, double scale);

    EarthPoint locate(const geo_nee& point, const Covariance& covariance) const;

private:
    geo_vector axis(const geo_nee& unit) const;

    geo_nee m_anchor;
    double m_scale;
    basalt::LocalFrame m_frame;
};

#endif
