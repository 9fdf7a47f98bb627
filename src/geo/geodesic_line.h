/// @file
/// A geodesic prepared for any number of distances along it.
#ifndef BASALT_SRC_GEO_GEODESIC_LINE_H
#define BASALT_SRC_GEO_GEODESIC_LINE_H

namespace basalt::geo {

/// Where a line stands after a distance, as directions whose angles nobody has asked for yet.
struct LineEnd {
    double azimuth_sine;  ///< with azimuth_cosine the direction of the forward azimuth, not of length 1
    double azimuth_cosine;
    double latitude_sine;  ///< likewise for the latitude
    double latitude_cosine;
    double longitude_change;  ///< radians
};

/// A geodesic by its start and azimuth: what Vincenty's direct series needs of them, formed once.
class GeodesicLine {
public:
    GeodesicLine(double latitude, double azimuth);
    /// Place at a distance in metres.
    LineEnd at(double distance) const;

private:
    struct Arc {
        double sigma, sine, cosine, cos_2m;
    };
    template <typename Directions>
    bool settle(double first, double closeness, const Directions& directions, Arc& arc) const;

    double m_sin_azimuth, m_cos_azimuth;
    double m_tan_u, m_sin_u, m_cos_u;
    double m_sin_alpha, m_cos2_alpha;
    double m_metres_per_radian, m_b;
    double m_sin_2sigma1, m_cos_2sigma1;
};

}  // namespace basalt::geo

#endif
