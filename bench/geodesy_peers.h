// The calls of GeographicLib and PROJ that bench_geodesy times.
#ifndef BASALT_BENCH_GEODESY_PEERS_H
#define BASALT_BENCH_GEODESY_PEERS_H

#include "bench/geodesy_places.h"

#ifdef BENCH_HAS_GEOGRAPHICLIB
#include <GeographicLib/Geocentric.hpp>
#include <GeographicLib/Geodesic.hpp>
#include <GeographicLib/GeodesicLine.hpp>
#endif
#ifdef BENCH_HAS_PROJ
#include <geodesic.h>
#include <proj.h>
#endif

namespace bench {

#ifdef BENCH_HAS_GEOGRAPHICLIB

inline void to_cartesian_geographiclib(benchmark::State& state) {
    const GeographicLib::Geocentric& earth = GeographicLib::Geocentric::WGS84();
    const auto call = [&](std::size_t i) {
        const geo_llh& g = places().geodetic[i];
        Triple v = {};
        earth.Forward(g.latitude / DEGREE, g.longitude / DEGREE, g.height, v[0], v[1], v[2]);
        return v;
    };
    run(state, METRES, call, to_cartesian);
}

inline void to_geodetic_geographiclib(benchmark::State& state) {
    const GeographicLib::Geocentric& earth = GeographicLib::Geocentric::WGS84();
    const auto call = [&](std::size_t i) {
        const geo_vector& v = places().cartesian[i];
        Triple g = {};
        earth.Reverse(v.x, v.y, v.z, g[0], g[1], g[2]);
        return Triple{g[0] * DEGREE, g[1] * DEGREE, g[2]};
    };
    run(state, LATITUDE_LONGITUDE_HEIGHT, call, to_geodetic);
}

inline void direct_geographiclib(benchmark::State& state) {
    const GeographicLib::Geodesic& earth = GeographicLib::Geodesic::WGS84();
    run_direct(state, [&](std::size_t i, double distance) {
        const geo_llh& g = places().geodetic[i];
        Triple end = {};
        earth.Direct(g.latitude / DEGREE, g.longitude / DEGREE, places().azimuth[i] / DEGREE, distance,
                     end[0], end[1], end[2]);
        return Triple{end[0] * DEGREE, end[1] * DEGREE, end[2] * DEGREE};
    });
}

inline void inverse_geographiclib(benchmark::State& state) {
    const GeographicLib::Geodesic& earth = GeographicLib::Geodesic::WGS84();
    run_inverse(state, [&](const geo_llh& from, const geo_llh& to) {
        Triple line = {};
        earth.Inverse(from.latitude / DEGREE, from.longitude / DEGREE, to.latitude / DEGREE,
                      to.longitude / DEGREE, line[0], line[1], line[2]);
        return Triple{line[0], line[1] * DEGREE, line[2] * DEGREE};
    });
}

/// The same search for the foot, by Napier's rule from pass to pass, on GeographicLib's line.
inline void crosstrack_geographiclib(benchmark::State& state) {
    const GeographicLib::Geodesic& earth = GeographicLib::Geodesic::WGS84();
    const auto call = [&](std::size_t i) {
        const geo_llh& a = lines().a[i];
        const geo_llh& p = lines().p[i];
        const double bearing = geo_vincenty_bearing(a, lines().b[i]);
        const GeographicLib::GeodesicLine line =
            earth.Line(a.latitude / DEGREE, a.longitude / DEGREE, bearing / DEGREE,
                       GeographicLib::Geodesic::LATITUDE | GeographicLib::Geodesic::LONGITUDE |
                           GeographicLib::Geodesic::AZIMUTH | GeographicLib::Geodesic::DISTANCE_IN);
        double along =
            std::cos(geo_grid_divergence(bearing, geo_vincenty_bearing(a, p))) * geo_vincenty_distance(a, p);
        for (int pass = 0; pass < 100; ++pass) {
            Triple at = {};
            line.Position(along, at[0], at[1], at[2]);
            const geo_llh foot = {at[0] * DEGREE, at[1] * DEGREE, 0};
            const double turn = geo_normalised_bearing(geo_vincenty_bearing(foot, p) - at[2] * DEGREE);
            const double distance = geo_vincenty_distance(foot, p);
            if (std::abs(std::cos(turn)) < 4.848136811095359e-07) {
                return Triple{turn < PI ? -distance : distance, 0, 0};
            }
            along += distance * std::cos(turn);
        }
        return Triple{};
    };
    // Without the tolerance's one side, see geo_vincenty_crosstrack().
    run(state, {4e-6, 1, 1}, call, crosstrack);
}

#endif

#ifdef BENCH_HAS_PROJ

/// PROJ's "cart" operation, which converts in place.
class Cart {
public:
    Cart()
        : m_context(proj_context_create()), m_operation(proj_create(m_context, "+proj=cart +ellps=WGS84")) {}
    ~Cart() {
        proj_destroy(m_operation);
        proj_context_destroy(m_context);
    }
    Cart(const Cart&) = delete;
    Cart& operator=(const Cart&) = delete;

    Triple convert(PJ_DIRECTION direction, double x, double y, double z) const {
        const PJ_COORD out = proj_trans(m_operation, direction, proj_coord(x, y, z, 0));
        return {out.v[0], out.v[1], out.v[2]};
    }

private:
    PJ_CONTEXT* m_context;
    PJ* m_operation;
};

inline void to_cartesian_proj(benchmark::State& state) {
    const Cart cart;
    const auto call = [&](std::size_t i) {
        const geo_llh& g = places().geodetic[i];
        return cart.convert(PJ_FWD, g.longitude, g.latitude, g.height);
    };
    run(state, METRES, call, to_cartesian);
}

inline void to_geodetic_proj(benchmark::State& state) {
    const Cart cart;
    const auto call = [&](std::size_t i) {
        const geo_vector& v = places().cartesian[i];
        const Triple g = cart.convert(PJ_INV, v.x, v.y, v.z);
        return Triple{g[1], g[0], g[2]};
    };
    run(state, LATITUDE_LONGITUDE_HEIGHT, call, to_geodetic);
}

inline void direct_proj(benchmark::State& state) {
    geod_geodesic earth;
    geod_init(&earth, 6378137.0, 1 / 298.257223563);
    run_direct(state, [&](std::size_t i, double distance) {
        const geo_llh& g = places().geodetic[i];
        Triple end = {};
        geod_direct(&earth, g.latitude / DEGREE, g.longitude / DEGREE, places().azimuth[i] / DEGREE, distance,
                    &end[0], &end[1], &end[2]);
        return Triple{end[0] * DEGREE, end[1] * DEGREE, end[2] * DEGREE};
    });
}

inline void inverse_proj(benchmark::State& state) {
    geod_geodesic earth;
    geod_init(&earth, 6378137.0, 1 / 298.257223563);
    run_inverse(state, [&](const geo_llh& from, const geo_llh& to) {
        Triple line = {};
        geod_inverse(&earth, from.latitude / DEGREE, from.longitude / DEGREE, to.latitude / DEGREE,
                     to.longitude / DEGREE, &line[0], &line[1], &line[2]);
        return Triple{line[0], line[1] * DEGREE, line[2] * DEGREE};
    });
}

#endif

}  // namespace bench

#endif
