/// @file
/// The local frame of an origin, formed once for many points. Common rules (units, bad input): basalt/geo.h.
#ifndef BASALT_GEO_LOCAL_FRAME_H
#define BASALT_GEO_LOCAL_FRAME_H

#include <cstddef>

#include "basalt/export.h"
#include "basalt/geo/records.h"

namespace basalt {

/// North, east and elevation in the tangent plane of an origin, as _xyz2nez() gives them, to the bit; and
/// back. Metres and radians.
///
/// Bad input: a frame that is not valid() and a point that is refused give three #GEO_NULL: the all-zero
/// geodetic point, as _llh2xyz(), and a Cartesian one that _xyz2llh() refuses.
///
/// Accuracy: Cartesian there and back within 1e-9 m up to 100 km from the origin; geodetic within that of
/// _xyz2llh(), 2.2e-5 m.
///
/// Threads: const calls may run on any number of threads at once.
class LocalFrame {
public:
    /// @param origin geodetic point
    BASALT_API explicit LocalFrame(const geo_llh& origin);

    /// Whether the origin is a place: not the all-zero point, NaN, infinite, or near the earth's centre.
    bool valid() const { return m_is_valid; }

    /// Local point of a geodetic one.
    BASALT_API geo_nee to_local(const geo_llh& point) const;
    /// Local point of a Cartesian one.
    BASALT_API geo_nee to_local(const geo_vector& point) const;
    /// Geodetic point of a local one.
    BASALT_API geo_llh to_geodetic(const geo_nee& point) const;
    /// Cartesian point of a local one.
    BASALT_API geo_vector to_cartesian(const geo_nee& point) const;

    /// @name Arrays
    /// As the call for each point.
    /// @return how many points were refused
    /// @{

    /// As for one point.
    BASALT_API std::size_t to_local(const geo_llh* in, geo_nee* out, std::size_t count) const;
    /// As for one point.
    BASALT_API std::size_t to_local(const geo_vector* in, geo_nee* out, std::size_t count) const;
    /// As for one point.
    BASALT_API std::size_t to_geodetic(const geo_nee* in, geo_llh* out, std::size_t count) const;
    /// As for one point.
    BASALT_API std::size_t to_cartesian(const geo_nee* in, geo_vector* out, std::size_t count) const;
    /// @}

private:
    geo_vector m_origin = {GEO_NULL, GEO_NULL, GEO_NULL};
    geo_vector m_north = {}, m_east = {}, m_up = {};
    bool m_is_valid = false;
};

}  // namespace basalt

#endif
