// Precision of points, from the precision of angles and distances.
#ifndef FIELDBOOK_PRECISION_H
#define FIELDBOOK_PRECISION_H

#include <basalt/geo.h>

#include <cstddef>
#include <vector>

#include "traverse.h"

/// Standard deviations of the instrument.
struct InstrumentPrecision {
    double angle;      ///< of a horizontal angle and of a zenith angle, radians
    double distance;   ///< metres
    double per_metre;  ///< of the distance, added to that
};

/// Symmetric covariance in the frame of the grid, square metres.
struct Covariance {
    double nn, ee, uu, ne, nu, eu;
};

/// Variances of traverse stations and of points measured from them, by the first-order law of propagation
/// from the first station on. Angles, zenith angles and distances are independent; control points count as
/// exact. The closing condition is not used, which would make every station but the last leg's better: these
/// are the uncertainties ahead of the adjustment.
class Precision {
public:
    Precision(const Traverse& traverse, const InstrumentPrecision& instrument);

    Covariance station(std::size_t setup) const;
    /// Of a point seen from a station.
    Covariance seen_from(std::size_t setup, const geo_hvd& observation, const geo_nee& point) const;

private:
    void add_sight(Covariance& sum, const geo_hvd& observation) const;
    void add_angle(Covariance& sum, const geo_nee& pivot, const geo_nee& point) const;

    const Traverse& m_traverse;
    InstrumentPrecision m_instrument;
};

#endif
