// Ellipsoid conversions, the direct geodesic and cross-track distances beside the plain forms, GeographicLib
// and PROJ. Before a row is timed, its results for all places are compared with the library's.
#include <benchmark/benchmark.h>

#include <cmath>
#include <vector>

#include "basalt/geo.h"
#include "bench/geodesy_peers.h"
#include "bench/geodesy_places.h"
#include "bench/plain_geodesy.h"

namespace {

using namespace bench;

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
    while (state.KeepRunningBatch(COUNT)) {
        call();
        benchmark::ClobberMemory();
    }
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

void inverse_basalt(benchmark::State& state) {
    run_inverse(state, inverse);
}

void inverse_arrays(benchmark::State& state) {
    const std::vector<geo_llh> to = ends(metres(state));
    std::vector<basalt::GeodesicInverse> out(COUNT);
    run_arrays(state, [&] { basalt::inverse(places().geodetic.data(), to.data(), out.data(), COUNT); });
}

// Cross-track: points some 600 m beside a line of 60 km.

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
BENCHMARK(inverse_arrays)->Name("inverse/arrays")->Apply(distances);
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
