// Ellipsoid conversions, the direct geodesic and cross-track distances beside the plain forms, GeographicLib
// and PROJ. Before a row is timed, its results for all places are compared with the library's.
#include <benchmark/benchmark.h>

#include <array>
#include <cmath>
#include <numbers>
#include <vector>

#include "basalt/geo.h"
#include "bench/plain_geodesy.h"
#include "tests/geo/plain_forms.h"

#ifdef BENCH_HAS_GEOGRAPHICLIB
#include <GeographicLib/Geocentric.hpp>
#include <GeographicLib/Geodesic.hpp>
#include <GeographicLib/GeodesicLine.hpp>
#endif
#ifdef BENCH_HAS_PROJ
#include <geodesic.h>
#include <proj.h>
#endif

namespace {

constexpr double PI = std::numbers::pi;
constexpr double DEGREE = PI / 180.0;
constexpr double TOLERANCE = 5e-10;
constexpr std::size_t COUNT = 1024;

using Triple = std::array<double, 3>;

/// Places on the globe, up to 9 km high, in both coordinates; and an azimuth for each.
struct Places {
    std::vector<geo_llh> geodetic;
    std::vector<geo_vector> cartesian;
    std::vector<double> azimuth;

    Places() {
        plain::Random random(42);
        for (std::size_t i = 0; i < COUNT; ++i) {
            geodetic.push_back({random.real(-1.5, 1.5), random.real(-PI, PI), random.real(-400, 9000)});
            geo_vector xyz = {};
            plain::llh2xyz(geodetic.back(), xyz);
            cartesian.push_back(xyz);
            azimuth.push_back(random.real(-PI, PI));
        }
    }
};

/// Times `call` over all places, one a turn; its results must be within `near` of `expected`'s.
template <typename Call, typename Expected>
void run(benchmark::State& state, const Triple& near, const Call& call, const Expected& expected) {
    for (std::size_t i = 0; i < COUNT; ++i) {
        const Triple got = call(i);
        const Triple want = expected(i);
        for (std::size_t k = 0; k < got.size(); ++k) {
            if (!(std::abs(std::remainder(got[k] - want[k], k == 1 && near[k] < 1e-5 ? 2 * PI : 1e30)) <=
                  near[k])) {
                state.SkipWithError("results differ");
                return;
            }
        }
    }
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        Triple result = call(at);
        benchmark::DoNotOptimize(result);
        at = (at + 1) % COUNT;
    }
}

const Places& places() {
    static const Places all;
    return all;
}

/// Times what a formula cannot do without, over all places.
template <typename Call>
void run_functions(benchmark::State& state, const Call& call) {
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(call(places().geodetic[at], places().azimuth[at]));
        at = (at + 1) % COUNT;
    }
}

// Geodetic to Cartesian and back.

constexpr Triple METRES = {1e-7, 1e-4, 1e-7};
constexpr Triple LATITUDE_LONGITUDE_HEIGHT = {1e-11, 1e-11, 2e-5};

Triple to_cartesian(std::size_t i) {
    geo_vector v = {};
    _llh2xyz(&places().geodetic[i], &v);
    return {v.x, v.y, v.z};
}

Triple to_geodetic(std::size_t i) {
    geo_llh g = {};
    _xyz2llh(&places().cartesian[i], &g, TOLERANCE);
    return {g.latitude, g.longitude, g.height};
}

void to_cartesian_basalt(benchmark::State& state) {
    run(state, METRES, to_cartesian, to_cartesian);
}

void to_cartesian_plain(benchmark::State& state) {
    const auto call = [](std::size_t i) {
        geo_vector v = {};
        plain::llh2xyz(places().geodetic[i], v);
        return Triple{v.x, v.y, v.z};
    };
    run(state, METRES, call, to_cartesian);
}

void to_cartesian_functions(benchmark::State& state) {
    run_functions(state, [](const geo_llh& g, double) {
        return std::sin(g.latitude) + std::cos(g.latitude) + std::sin(g.longitude) + std::cos(g.longitude) +
               std::sqrt(g.latitude * g.latitude);
    });
}

// The roots of the distance from the axis, of two passes (a place near the ellipsoid takes two or three) that
// need each other's results, and of the height.
void to_geodetic_functions(benchmark::State& state) {
    run_functions(state, [](const geo_llh& g, double azimuth) {
        const double p = std::sqrt(g.latitude * g.latitude + g.longitude * g.longitude);
        double q = g.latitude;
        for (int pass = 0; pass < 2; ++pass) {
            q = g.latitude + 0.01 * q / std::sqrt(p * p + q * q);
        }
        const double length = std::sqrt(p * p + q * q);
        const double height = length - 2.0 / (std::sqrt(p * p + 0.99 * q * q) / length);
        return std::atan2(q, p) + std::atan2(g.longitude, azimuth) + height;
    });
}

void to_geodetic_basalt(benchmark::State& state) {
    run(state, LATITUDE_LONGITUDE_HEIGHT, to_geodetic, to_geodetic);
}

void to_geodetic_plain(benchmark::State& state) {
    const auto call = [](std::size_t i) {
        geo_llh g = {};
        int passes = 0;
        plain::xyz2llh(places().cartesian[i], g, TOLERANCE, passes);
        return Triple{g.latitude, g.longitude, g.height};
    };
    run(state, LATITUDE_LONGITUDE_HEIGHT, call, to_geodetic);
}

// The direct geodesic.

// The series is good to a tenth of a millimetre over a half turn.
constexpr Triple LATITUDE_LONGITUDE_AZIMUTH = {5e-10, 5e-9, 5e-8};

Triple direct(std::size_t i, double distance) {
    geo_llh end = {};
    double azimuth = 0;
    geo_vincenty_direct(places().geodetic[i], places().azimuth[i], distance, azimuth, end);
    return {end.latitude, end.longitude, azimuth};
}

double metres(const benchmark::State& state) {
    return 1000.0 * static_cast<double>(state.range(0));
}

template <typename Call>
void run_direct(benchmark::State& state, const Call& call) {
    const double distance = metres(state);
    run(
        state, LATITUDE_LONGITUDE_AZIMUTH, [&](std::size_t i) { return call(i, distance); },
        [&](std::size_t i) { return direct(i, distance); });
}

void direct_basalt(benchmark::State& state) {
    run_direct(state, direct);
}

/// Sines and cosines of latitude, azimuth and arc; the end's latitude, longitude and azimuth.
void direct_functions(benchmark::State& state) {
    run_functions(state, [](const geo_llh& g, double azimuth) {
        const double arc = g.height * 1e-4;
        return std::sin(g.latitude) + std::cos(g.latitude) + std::sin(azimuth) + std::cos(azimuth) +
               std::sin(arc) + std::cos(arc) + std::atan2(g.latitude, azimuth) +
               std::atan2(g.longitude, azimuth) + std::atan2(azimuth, g.longitude);
    });
}

void direct_plain(benchmark::State& state) {
    run_direct(state, [](std::size_t i, double distance) {
        geo_llh end = {};
        double azimuth = 0;
        plain::direct(places().geodetic[i], places().azimuth[i], distance, azimuth, end);
        return Triple{end.latitude, end.longitude, azimuth};
    });
}

// Whole arrays; the time is that of one place.

template <typename Call>
void run_arrays(benchmark::State& state, const Call& call) {
    for ([[maybe_unused]] auto _ : state) {
        call();
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(COUNT));
}

void to_cartesian_arrays(benchmark::State& state) {
    std::vector<geo_vector> out(COUNT);
    run_arrays(state, [&] { basalt::to_cartesian(places().geodetic.data(), out.data(), COUNT); });
}

void to_geodetic_arrays(benchmark::State& state) {
    std::vector<geo_llh> out(COUNT);
    run_arrays(state, [&] { basalt::to_geodetic(places().cartesian.data(), out.data(), COUNT, TOLERANCE); });
}

void direct_arrays(benchmark::State& state) {
    const std::vector<double> distances(COUNT, metres(state));
    std::vector<geo_llh> ends(COUNT);
    std::vector<double> azimuths(COUNT);
    run_arrays(state, [&] {
        basalt::direct(places().geodetic.data(), places().azimuth.data(), distances.data(), ends.data(),
                       azimuths.data(), COUNT);
    });
}

// The local frame of the first place.

void to_local_basalt(benchmark::State& state) {
    const basalt::LocalFrame frame(places().geodetic[0]);
    const auto call = [&](std::size_t i) {
        const geo_nee local = frame.to_local(places().cartesian[i]);
        return Triple{local.north, local.east, local.elevation};
    };
    run(state, {1e-300, 1, 1e-300}, call, call);
}

void to_local_single_call(benchmark::State& state) {
    const auto call = [](std::size_t i) {
        geo_nee local = {};
        _xyz2nez(&places().cartesian[0], &places().cartesian[i], &local);
        return Triple{local.north, local.east, local.elevation};
    };
    run(state, {1e-300, 1, 1e-300}, call, call);
}

void to_local_arrays(benchmark::State& state) {
    const basalt::LocalFrame frame(places().geodetic[0]);
    std::vector<geo_nee> out(COUNT);
    run_arrays(state, [&] { frame.to_local(places().cartesian.data(), out.data(), COUNT); });
}

// The inverse geodesic, over the ends of direct lines.

constexpr Triple DISTANCE_AZIMUTHS = {5e-8, 1e-6, 1e-6};

const std::vector<geo_llh>& ends(double distance) {
    static std::vector<geo_llh> all;
    all.clear();
    for (std::size_t i = 0; i < COUNT; ++i) {
        const Triple end = direct(i, distance);
        all.push_back({end[0], end[1], 0});
    }
    return all;
}

Triple inverse(const geo_llh& from, const geo_llh& to) {
    const basalt::GeodesicInverse line = basalt::geodesic_inverse(from, to);
    return {line.distance, line.azimuth_from, line.azimuth_to};
}

template <typename Call>
void run_inverse(benchmark::State& state, const Call& call) {
    const std::vector<geo_llh> to = ends(metres(state));
    run(
        state, DISTANCE_AZIMUTHS, [&](std::size_t i) { return call(places().geodetic[i], to[i]); },
        [&](std::size_t i) { return inverse(places().geodetic[i], to[i]); });
}

void inverse_basalt(benchmark::State& state) {
    run_inverse(state, inverse);
}

// Cross-track: points some 600 m beside a line of 60 km.

struct Lines {
    std::vector<geo_llh> a, b, p;

    Lines() {
        plain::Random random(7);
        for (std::size_t i = 0; i < COUNT; ++i) {
            const geo_llh start = {random.real(-1.2, 1.2), random.real(-2.9, 2.9), 0};
            double azimuth = random.real(-PI, PI);
            geo_llh end = {};
            geo_llh foot = {};
            geo_vincenty_direct(start, azimuth, 60e3, azimuth, end);
            geo_vincenty_direct(start, geo_vincenty_bearing(start, end), random.real(5e3, 55e3), azimuth,
                                foot);
            geo_llh point = {};
            geo_vincenty_direct(foot, azimuth + (i % 2 == 0 ? PI / 2 : -PI / 2), 600, azimuth, point);
            a.push_back(start);
            b.push_back(end);
            p.push_back(point);
        }
    }
};

const Lines& lines() {
    static const Lines all;
    return all;
}

constexpr Triple CROSS_TRACK = {1e-6, 1, 1};

Triple crosstrack(std::size_t i) {
    return {geo_vincenty_crosstrack(lines().a[i], lines().b[i], lines().p[i]), 0, 0};
}

void crosstrack_basalt(benchmark::State& state) {
    run(state, CROSS_TRACK, crosstrack, crosstrack);
}

/// By steps of a metre; too slow to be compared over all lines.
void crosstrack_steps(benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) {
        int passes = 100'000;
        benchmark::DoNotOptimize(plain::crosstrack(lines().a[0], lines().b[0], lines().p[0], passes));
    }
}

#ifdef BENCH_HAS_GEOGRAPHICLIB

void to_cartesian_geographiclib(benchmark::State& state) {
    const GeographicLib::Geocentric& earth = GeographicLib::Geocentric::WGS84();
    const auto call = [&](std::size_t i) {
        const geo_llh& g = places().geodetic[i];
        Triple v = {};
        earth.Forward(g.latitude / DEGREE, g.longitude / DEGREE, g.height, v[0], v[1], v[2]);
        return v;
    };
    run(state, METRES, call, to_cartesian);
}

void to_geodetic_geographiclib(benchmark::State& state) {
    const GeographicLib::Geocentric& earth = GeographicLib::Geocentric::WGS84();
    const auto call = [&](std::size_t i) {
        const geo_vector& v = places().cartesian[i];
        Triple g = {};
        earth.Reverse(v.x, v.y, v.z, g[0], g[1], g[2]);
        return Triple{g[0] * DEGREE, g[1] * DEGREE, g[2]};
    };
    run(state, LATITUDE_LONGITUDE_HEIGHT, call, to_geodetic);
}

void direct_geographiclib(benchmark::State& state) {
    const GeographicLib::Geodesic& earth = GeographicLib::Geodesic::WGS84();
    run_direct(state, [&](std::size_t i, double distance) {
        const geo_llh& g = places().geodetic[i];
        Triple end = {};
        earth.Direct(g.latitude / DEGREE, g.longitude / DEGREE, places().azimuth[i] / DEGREE, distance,
                     end[0], end[1], end[2]);
        return Triple{end[0] * DEGREE, end[1] * DEGREE, end[2] * DEGREE};
    });
}

void inverse_geographiclib(benchmark::State& state) {
    const GeographicLib::Geodesic& earth = GeographicLib::Geodesic::WGS84();
    run_inverse(state, [&](const geo_llh& from, const geo_llh& to) {
        Triple line = {};
        earth.Inverse(from.latitude / DEGREE, from.longitude / DEGREE, to.latitude / DEGREE,
                      to.longitude / DEGREE, line[0], line[1], line[2]);
        return Triple{line[0], line[1] * DEGREE, line[2] * DEGREE};
    });
}

/// The same search for the foot, by Napier's rule from pass to pass, on GeographicLib's line.
void crosstrack_geographiclib(benchmark::State& state) {
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

void to_cartesian_proj(benchmark::State& state) {
    const Cart cart;
    const auto call = [&](std::size_t i) {
        const geo_llh& g = places().geodetic[i];
        return cart.convert(PJ_FWD, g.longitude, g.latitude, g.height);
    };
    run(state, METRES, call, to_cartesian);
}

void to_geodetic_proj(benchmark::State& state) {
    const Cart cart;
    const auto call = [&](std::size_t i) {
        const geo_vector& v = places().cartesian[i];
        const Triple g = cart.convert(PJ_INV, v.x, v.y, v.z);
        return Triple{g[1], g[0], g[2]};
    };
    run(state, LATITUDE_LONGITUDE_HEIGHT, call, to_geodetic);
}

void direct_proj(benchmark::State& state) {
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

void inverse_proj(benchmark::State& state) {
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

void distances(benchmark::internal::Benchmark* row) {
    row->Arg(100)->Arg(10000);  // kilometres
}

BENCHMARK(to_cartesian_basalt)->Name("to_cartesian/basalt");
BENCHMARK(to_cartesian_plain)->Name("to_cartesian/plain");
BENCHMARK(to_cartesian_functions)->Name("to_cartesian/limit_two_sines_and_cosines");
BENCHMARK(to_geodetic_functions)->Name("to_geodetic/limit_two_arctangents_five_roots");
BENCHMARK(to_geodetic_basalt)->Name("to_geodetic/basalt");
BENCHMARK(to_geodetic_plain)->Name("to_geodetic/plain");
BENCHMARK(direct_basalt)->Name("direct/basalt")->Apply(distances);
BENCHMARK(direct_functions)->Name("direct/limit_three_sines_and_cosines_three_arctangents")->Apply(distances);
BENCHMARK(direct_plain)->Name("direct/plain")->Apply(distances);
BENCHMARK(to_cartesian_arrays)->Name("to_cartesian/arrays");
BENCHMARK(to_geodetic_arrays)->Name("to_geodetic/arrays");
BENCHMARK(direct_arrays)->Name("direct/arrays")->Apply(distances);
BENCHMARK(to_local_basalt)->Name("to_local/basalt");
BENCHMARK(to_local_arrays)->Name("to_local/arrays");
BENCHMARK(to_local_single_call)->Name("to_local/single_call");
BENCHMARK(inverse_basalt)->Name("inverse/basalt")->Apply(distances);
BENCHMARK(crosstrack_basalt)->Name("crosstrack/basalt");
BENCHMARK(crosstrack_steps)->Name("crosstrack/metre_steps");
#ifdef BENCH_HAS_GEOGRAPHICLIB
BENCHMARK(to_cartesian_geographiclib)->Name("to_cartesian/geographiclib");
BENCHMARK(to_geodetic_geographiclib)->Name("to_geodetic/geographiclib");
BENCHMARK(direct_geographiclib)->Name("direct/geographiclib")->Apply(distances);
BENCHMARK(inverse_geographiclib)->Name("inverse/geographiclib")->Apply(distances);
BENCHMARK(crosstrack_geographiclib)->Name("crosstrack/geographiclib");
#endif
#ifdef BENCH_HAS_PROJ
BENCHMARK(to_cartesian_proj)->Name("to_cartesian/proj");
BENCHMARK(to_geodetic_proj)->Name("to_geodetic/proj");
BENCHMARK(direct_proj)->Name("direct/proj")->Apply(distances);
BENCHMARK(inverse_proj)->Name("inverse/proj")->Apply(distances);
#endif

}  // namespace

BENCHMARK_MAIN();
