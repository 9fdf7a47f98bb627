// The places and lines of bench_geodesy, the library's results for them, and the loops that time a call over
// them.
#ifndef BASALT_BENCH_GEODESY_PLACES_H
#define BASALT_BENCH_GEODESY_PLACES_H

#include <benchmark/benchmark.h>

#include <array>
#include <cmath>
#include <cstddef>
#include <numbers>
#include <vector>

#include "basalt/geo.h"
#include "bench/plain_geodesy.h"
#include "tests/geo/plain_forms.h"

namespace bench {

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

inline const Places& places() {
    static const Places all;
    return all;
}

constexpr Triple METRES = {1e-7, 1e-4, 1e-7};
constexpr Triple LATITUDE_LONGITUDE_HEIGHT = {1e-11, 1e-11, 2e-5};

inline Triple to_cartesian(std::size_t i) {
    geo_vector v = {};
    _llh2xyz(&places().geodetic[i], &v);
    return {v.x, v.y, v.z};
}

inline Triple to_geodetic(std::size_t i) {
    geo_llh g = {};
    _xyz2llh(&places().cartesian[i], &g, TOLERANCE);
    return {g.latitude, g.longitude, g.height};
}

// The series is good to a tenth of a millimetre over a half turn.
constexpr Triple LATITUDE_LONGITUDE_AZIMUTH = {5e-10, 5e-9, 5e-8};

inline Triple direct(std::size_t i, double distance) {
    geo_llh end = {};
    double azimuth = 0;
    geo_vincenty_direct(places().geodetic[i], places().azimuth[i], distance, azimuth, end);
    return {end.latitude, end.longitude, azimuth};
}

inline double metres(const benchmark::State& state) {
    return 1000.0 * static_cast<double>(state.range(0));
}

template <typename Call>
void run_direct(benchmark::State& state, const Call& call) {
    const double distance = metres(state);
    run(
        state, LATITUDE_LONGITUDE_AZIMUTH, [&](std::size_t i) { return call(i, distance); },
        [&](std::size_t i) { return direct(i, distance); });
}

constexpr Triple DISTANCE_AZIMUTHS = {5e-8, 1e-6, 1e-6};

inline std::vector<geo_llh> ends(double distance) {
    std::vector<geo_llh> all;
    for (std::size_t i = 0; i < COUNT; ++i) {
        const Triple end = direct(i, distance);
        all.push_back({end[0], end[1], 0});
    }
    return all;
}

inline Triple inverse(const geo_llh& from, const geo_llh& to) {
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

// Points some 600 m beside a line of 60 km.
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

inline const Lines& lines() {
    static const Lines all;
    return all;
}

constexpr Triple CROSS_TRACK = {1e-6, 1, 1};

inline Triple crosstrack(std::size_t i) {
    return {geo_vincenty_crosstrack(lines().a[i], lines().b[i], lines().p[i]), 0, 0};
}

inline void distances(benchmark::internal::Benchmark* row) {
    row->ArgName("km")->Arg(100)->Arg(10000);
}

}  // namespace bench

#endif
