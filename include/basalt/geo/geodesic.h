/// @file
/// Geodesics: direct problem, distance, bearing, cross-track distance. Common rules (units, bad input,
/// threads): basalt/geo.h.
///
/// Latitudes lie in [-pi/2, pi/2], longitudes in any range. Azimuths and bearings are radians clockwise from
/// north. Heights are carried through or ignored, never used.
#ifndef BASALT_GEO_GEODESIC_H
#define BASALT_GEO_GEODESIC_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// @name Geodesics
/// @{

/// Direct problem on the WGS84 ellipsoid: where a line ends.
/// @param start geodetic point
/// @param azimuth radians, any range; at a pole it is counted from the meridian of the start's longitude
/// @param distance along the geodesic, metres; negative runs backwards, 0 gives the start
/// @param[out] finalAzimuth forward azimuth at the end, radians in [-pi, pi], not normalised
/// @param[out] end the end; its longitude is not wrapped into any range, its height is the start's
///
/// Bad input: NaN or an infinity gives NaN in what depends on it; a longitude is only added to. The series
/// settles in 5 passes at most, mostly 3; distances beyond 1e10 m may not settle and use the hundredth pass.
///
/// Accuracy: 6.4e-6 m up to 100 km, on the shortest lines too; 6.5e-5 m at 10,000 km, 1.4e-4 m at 20,000 km.
///
/// Source: T. Vincenty, "Direct and inverse solutions of geodesics on the ellipsoid", Survey Review 176,
/// 1975.
BASALT_API void geo_vincenty_direct(geo_llh start, double azimuth, double distance, double& finalAzimuth,
                                    geo_llh& end);

/// Great-circle distance on a sphere of radius 6,371,000 m. Not the ellipsoid's: for that use
/// basalt::geodesic_inverse().
/// @return metres in [0, 20015087], the largest at the antipode; 0 for equal places and below 1e-155 m. A
/// latitude beyond a pole may give NaN.
///
/// Accuracy: within 0.56 % of the ellipsoid's distance, 6 m in a kilometre.
///
/// Source: R. Sinnott, "Virtues of the haversine", Sky and Telescope 68(2), 1984.
BASALT_API double geo_vincenty_distance(geo_llh a, geo_llh b);

/// Initial bearing of the great circle between two points on a sphere. For the ellipsoid's azimuth use
/// basalt::geodesic_inverse().
/// @return normalised bearing, radians in [0, 2 pi); 0 for equal points, undefined at the antipode
///
/// Accuracy: within 0.0034 / cos(latitude) radians of the ellipsoid's azimuth up to 10,000 km, 0.024 to
/// 19,000 km.
BASALT_API double geo_vincenty_bearing(geo_llh from, geo_llh to);

/// Distance of a point from the line that leaves a with the bearing of b.
/// @param a start of the line
/// @param b gives the direction. The bearing is the sphere's and the line an ellipsoid's geodesic, so it
/// misses b, on oblique lines by 0.3 m at 100 m and 2 km at 1000 km.
/// @param p the point
/// @return metres, positive left of the direction of travel, negative right: the sphere's distance to the
/// foot, the first place found where the bearing of p and the line are within 0.1 arc-second of square; 0 for
/// a point closer than 1e-6 m. With b equal to a the line runs north.
///
/// Bad input: NaN where a latitude or longitude is NaN or infinite. The search takes 3 or 4 passes on survey
/// lines, at most 11 in 300,000 draws over the globe; after 100 it ends with the best foot found.
///
/// Accuracy: within 1.9 % for a point a tenth of the line's length beside its middle, mostly within 0.8 %.
BASALT_API double geo_vincenty_crosstrack(geo_llh a, geo_llh b, geo_llh p);

/// @}

namespace basalt {

/// The shortest line between two places on the ellipsoid.
struct GeodesicInverse {
    double distance;      ///< metres, 0 to 20003931.459
    double azimuth_from;  ///< at the start, radians in [-pi, pi]
    double azimuth_to;    ///< of the same direction at the end, radians in [-pi, pi]
};

/// Inverse problem on the WGS84 ellipsoid: distance and azimuths of the shortest line, for every pair of
/// places.
/// @param from geodetic point; latitude in [-pi/2, pi/2], longitude in any range, height ignored
/// @param to geodetic point
/// @return distance and azimuths, all 0 for equal places. Of several shortest lines (between opposite places)
/// one is returned. At a pole the azimuth is counted from the meridian of the longitude given.
///
/// Bad input: three NaN for a latitude beyond a pole, NaN and an infinite longitude. At most 60 passes; 2 or
/// 3 on most lines.
///
/// Accuracy: 2e-8 m in distance, nearly opposite places included. The azimuths are those of a line that ends
/// as close to `to`.
///
/// Threads: thread-safe.
///
/// Source: C. Karney, "Algorithms for geodesics", Journal of Geodesy 87, 2013.
BASALT_API GeodesicInverse geodesic_inverse(const geo_llh& from, const geo_llh& to);

}  // namespace basalt

#endif
