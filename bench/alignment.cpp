// Observations both ways and spiral coordinates, beside the formulas written out plainly. Before a row is
// timed, its results for all inputs are compared to the bit.
#include <benchmark/benchmark.h>

#include <bit>
#include <cmath>
#include <cstdint>
#include <vector>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

constexpr std::size_t INPUTS = 1024;
constexpr double HEIGHT = 1.55;
constexpr double SCALE = 0.9996;

struct Scene {
    geo_nee station = {5.8e6, 3.5e5, 120.0};
    std::vector<geo_hvd> observations;
    std::vector<geo_nee> points;
    std::vector<geo_vector> spirals;  ///< length, K, tolerance

    Scene() {
        plain::Random random(17);
        for (std::size_t i = 0; i < INPUTS; ++i) {
            observations.push_back({random.real(0.0, 6.28), random.real(1.3, 1.8), random.real(5.0, 800.0)});
            points.push_back({station.north + random.real(-500.0, 500.0),
                              station.east + random.real(-500.0, 500.0), random.real(80.0, 160.0)});
            spirals.push_back({random.real(1.0, 80.0), 2.0 * 80.0 * random.real(150.0, 800.0), 1e-9});
        }
    }
};

/// The formulas with every step spelled out.
geo_nee plain_reduce(const geo_hvd& obs, const geo_nee& station) {
    geo_nee out = {GEO_NULL, GEO_NULL, GEO_NULL};
    if (obs.horizontal == GEO_NULL || obs.vertical == GEO_NULL || obs.distance == GEO_NULL) {
        return out;
    }
    const double hd = std::sin(obs.vertical) * obs.distance * SCALE;
    const double dz = std::cos(obs.vertical) * obs.distance;
    out.north = std::cos(obs.horizontal) * hd + station.north;
    out.east = std::sin(obs.horizontal) * hd + station.east;
    out.elevation = HEIGHT + station.elevation + dz;
    return out;
}

geo_hvd plain_calculate(const geo_nee& from, const geo_nee& to) {
    if (from.north == GEO_NULL || from.east == GEO_NULL || from.elevation == GEO_NULL ||
        to.north == GEO_NULL || to.east == GEO_NULL || to.elevation == GEO_NULL) {
        return {};
    }
    const double north = to.north - from.north;
    const double east = to.east - from.east;
    const double dz = to.elevation + 0.0 - from.elevation - HEIGHT;
    const double hd = std::sqrt(east * east + north * north) * SCALE;
    return {geo_normalised_bearing(std::atan2(east, north)),
            geo_normalised_bearing(1.5707963267948966 - std::atan2(dz, hd)), std::sqrt(hd * hd + dz * dz)};
}

bool same_bits(double a, double b) {
    return std::bit_cast<std::uint64_t>(a) == std::bit_cast<std::uint64_t>(b);
}
bool same(const geo_nee& a, const geo_nee& b) {
    return same_bits(a.north, b.north) && same_bits(a.east, b.east) && same_bits(a.elevation, b.elevation);
}
bool same(const geo_hvd& a, const geo_hvd& b) {
    return same_bits(a.horizontal, b.horizontal) && same_bits(a.vertical, b.vertical) &&
           same_bits(a.distance, b.distance);
}
bool same(const geo_vector& a, const geo_vector& b) {
    return same_bits(a.x, b.x) && same_bits(a.y, b.y);
}

/// Times `work` over the inputs, one a turn; `expected` is the library's own result.
template <typename Input, typename Work, typename Expected>
void run(benchmark::State& state, const std::vector<Input>& inputs, const Work& work,
         const Expected& expected) {
    for (const Input& input : inputs) {
        if (!same(work(input), expected(input))) {
            state.SkipWithError("results differ");
            return;
        }
    }
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(work(inputs[at]));
        at = (at + 1) % INPUTS;
    }
}

auto reduce(const Scene& scene) {
    return [&scene](const geo_hvd& obs) {
        geo_nee out;
        geo_reduce_obs(obs, scene.station, HEIGHT, out, SCALE);
        return out;
    };
}

auto calculate(const Scene& scene) {
    return [&scene](const geo_nee& point) {
        geo_hvd out = {};
        geo_calc_obs(scene.station, HEIGHT, point, 0.0, out, SCALE);
        return out;
    };
}

geo_vector deltas(const geo_vector& spiral) {
    geo_vector out = {};
    geo_spiral_deltas(spiral.x, spiral.y, spiral.z, out.x, out.y);
    return out;
}

geo_vector plain_deltas(const geo_vector& spiral) {
    geo_vector out = {};
    plain::spiral_deltas(spiral.x, spiral.y, spiral.z, out.x, out.y);
    return out;
}

void reduce_basalt(benchmark::State& state) {
    const Scene scene;
    run(state, scene.observations, reduce(scene), reduce(scene));
}
void reduce_plain(benchmark::State& state) {
    const Scene scene;
    run(
        state, scene.observations, [&](const geo_hvd& obs) { return plain_reduce(obs, scene.station); },
        reduce(scene));
}
void calculate_basalt(benchmark::State& state) {
    const Scene scene;
    run(state, scene.points, calculate(scene), calculate(scene));
}
void calculate_plain(benchmark::State& state) {
    const Scene scene;
    run(
        state, scene.points, [&](const geo_nee& point) { return plain_calculate(scene.station, point); },
        calculate(scene));
}
void spiral_basalt(benchmark::State& state) {
    run(state, Scene().spirals, deltas, deltas);
}
void spiral_plain(benchmark::State& state) {
    run(state, Scene().spirals, plain_deltas, deltas);
}

BENCHMARK(reduce_basalt)->Name("reduce_observation/basalt");
BENCHMARK(reduce_plain)->Name("reduce_observation/plain_form");
BENCHMARK(calculate_basalt)->Name("calculate_observation/basalt");
BENCHMARK(calculate_plain)->Name("calculate_observation/plain_form");
BENCHMARK(spiral_basalt)->Name("spiral_deltas/basalt");
BENCHMARK(spiral_plain)->Name("spiral_deltas/plain_form");

}  // namespace

BENCHMARK_MAIN();
