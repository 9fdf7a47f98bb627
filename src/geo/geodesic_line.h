/// @file
/// A geodesic prepared for any number of distances along it.
#ifndef BASALT_SRC_GEO_GEODESIC_LINE_H
#define BASALT_SRC_GEO_GEODESIC_LINE_H

namespace basalt::geo {

/// End of a line as sines and cosines, so that callers form only the angles they use.
struct LineEnd {
    double azimuth_sine;  ///< with azimuth_cosine the direction of the forward azimuth, not of length 1
    double azimuth_cosine;
    double latitude_sine;  ///< likewise for the latitude
    double latitude_cosine;
    double longitude_change;  ///< radians
};

/// A geodesic by its start and azimuth: the part of Vincenty's direct series that does not depend on the
/// distance.
class GeodesicLine {
public:
    GeodesicLine(double latitude, double azimuth);
    /// The end after a distance in metres.
    LineEnd at(double distance) const;

private:
    double m_sin_azimuth, m_cos_azimuth;
    double m_tan_u, m_sin_u, m_cos_u;
    double m_sin_alpha, m_cos2_alpha;
    double m_metres_per_radian, m_b;
    double m_sin_2sigma1, m_cos_2sigma1;
};

}  // namespace basalt::geo

#endif
