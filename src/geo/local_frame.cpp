#include "basalt/geo/local_frame.h"

#include "basalt/geo/ellipsoid.h"
#include "src/geo/frame_axes.h"

namespace basalt {

using geo::along;

namespace {

constexpr geo_nee NO_POINT = {GEO_NULL, GEO_NULL, GEO_NULL};
constexpr geo_llh NO_PLACE = {GEO_NULL, GEO_NULL, GEO_NULL};
constexpr geo_vector NO_VECTOR = {GEO_NULL, GEO_NULL, GEO_NULL};

bool is_refused(const geo_nee& point) {
    return is_null(point.north);
}
bool is_refused(const geo_llh& place) {
    return is_null(place.latitude);
}
bool is_refused(const geo_vector& vector) {
    return is_null(vector.x);
}

template <class In, class Out, class Convert>
std::size_t convert_all(const In* in, Out* out, std::size_t count, const Convert& convert) {
    std::size_t refused = 0;
    for (std::size_t i = 0; i < count; ++i) {
        out[i] = convert(in[i]);
        refused += is_refused(out[i]) ? 1 : 0;
    }
    return refused;
}

}  // namespace

LocalFrame::LocalFrame(const geo_llh& origin) {
    geo_vector xyz = {};
    if (_llh2xyz(&origin, &xyz) == 1) {
        if (const auto axes = geo::axes_at(xyz)) {
            m_origin = xyz;
            m_north = axes->north;
            m_east = axes->east;
            m_up = axes->up;
            m_is_valid = true;
        }
    }
}

geo_nee LocalFrame::to_local(const geo_vector& point) const {
    if (!m_is_valid) {
        return NO_POINT;
    }
    const geo_vector d = {point.x - m_origin.x, point.y - m_origin.y, point.z - m_origin.z};
    return {along(m_north, d), along(m_east, d), along(m_up, d)};
}

geo_nee LocalFrame::to_local(const geo_llh& point) const {
    geo_vector xyz = {};
    return _llh2xyz(&point, &xyz) == 1 ? to_local(xyz) : NO_POINT;
}

geo_vector LocalFrame::to_cartesian(const geo_nee& point) const {
    if (!m_is_valid) {
        return NO_VECTOR;
    }
    const double n = point.north;
    const double e = point.east;
    const double u = point.elevation;
    return {m_origin.x + (m_north.x * n + m_east.x * e + m_up.x * u),
            m_origin.y + (m_north.y * n + m_east.y * e + m_up.y * u),
            m_origin.z + (m_north.z * n + m_east.z * e + m_up.z * u)};
}

geo_llh LocalFrame::to_geodetic(const geo_nee& point) const {
    const geo_vector xyz = to_cartesian(point);
    geo_llh llh = NO_PLACE;
    if (m_is_valid) {
        _xyz2llh(&xyz, &llh, geo::LOCAL_FRAME_TOLERANCE);
    }
    return llh;
}

std::size_t LocalFrame::to_local(const geo_llh* in, geo_nee* out, std::size_t count) const {
    return convert_all(in, out, count, [this](const geo_llh& point) { return to_local(point); });
}
std::size_t LocalFrame::to_local(const geo_vector* in, geo_nee* out, std::size_t count) const {
    return convert_all(in, out, count, [this](const geo_vector& point) { return to_local(point); });
}
std::size_t LocalFrame::to_geodetic(const geo_nee* in, geo_llh* out, std::size_t count) const {
    return convert_all(in, out, count, [this](const geo_nee& point) { return to_geodetic(point); });
}
std::size_t LocalFrame::to_cartesian(const geo_nee* in, geo_vector* out, std::size_t count) const {
    return convert_all(in, out, count, [this](const geo_nee& point) { return to_cartesian(point); });
}

}  // namespace basalt
