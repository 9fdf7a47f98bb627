// Observations both ways and spiral coordinates, beside the formulas written out plainly. Before a row is
// timed, its results for all inputs are compared with the library's.
#include <benchmark/benchmark.h>

#include <cmath>
#include <vector>

#include "basalt/geo.h"
#include "bench/out_of_sight.h"
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
void plain_reduce(const geo_hvd& obs, const geo_nee& station, double height, geo_nee& out, double scale) {
    if (obs.horizontal == GEO_NULL || obs.vertical == GEO_NULL || obs.distance == GEO_NULL) {
        out = {GEO_NULL, GEO_NULL, GEO_NULL};
        return;
    }
    const double hd = std::sin(obs.vertical) * obs.distance * scale;
    const double dz = std::cos(obs.vertical) * obs.distance;
    out.north = std::cos(obs.horizontal) * hd + station.north;
    out.east = std::sin(obs.horizontal) * hd + station.east;
    out.elevation = height + station.elevation + dz;
}

void plain_calculate(const geo_nee& from, double from_height, const geo_nee& to, double to_height,
                     geo_hvd& out, double scale) {
    if (from.north == GEO_NULL || from.east == GEO_NULL || from.elevation == GEO_NULL ||
        to.north == GEO_NULL || to.east == GEO_NULL || to.elevation == GEO_NULL) {
        return;
    }
    const double north = to.north - from.north;
    const double east = to.east - from.east;
    const double dz = to.elevation + to_height - from.elevation - from_height;
    const double hd = std::sqrt(east * east + north * north) * scale;
    out.horizontal = geo_normalised_bearing(std::atan2(east, north));
    out.vertical = geo_normalised_bearing(1.5707963267948966 - std::atan2(dz, hd));
    out.distance = std::sqrt(hd * hd + dz * dz);
}

void plain_deltas(double l, double k, double tolerance, double& x, double& y) {
    const double q = l * l * l * l / (k * k);
    x = l;
    double t = l;
    double sign = -1.0;
    double m = 2.0;
    double divisor = 5.0;
    while (true) {
        t = t * q / ((m - 1.0) * m);
        x = x + sign * t / divisor;
        sign = -sign;
        if (std::fabs(t / divisor) < tolerance) {
            break;
        }
        divisor = divisor + 4.0;
        m = m + 2.0;
        if (divisor >= 41.0) {
            x = y = 2e-308;
            return;
        }
    }
    double s = l * l * l / k;
    y = s / 3.0;
    sign = -1.0;
    m = 3.0;
    divisor = 7.0;
    while (true) {
        s = s * q / ((m - 1.0) * m);
        y = y + sign * s / divisor;
        sign = -sign;
        if (std::fabs(s / divisor) < tolerance) {
            return;
        }
        divisor = divisor + 4.0;
        m = m + 2.0;
        if (divisor >= 41.0) {
            x = y = 2e-308;
            return;
        }
    }
}

/// Equal but for the last places: the plain forms use the C library's sine, cosine and arctangent.
bool same(double a, double b) {
    return std::fabs(a - b) <= 1e-14 * std::fabs(a);
}
bool same(const geo_nee& a, const geo_nee& b) {
    return same(a.north, b.north) && same(a.east, b.east) && same(a.elevation, b.elevation);
}
bool same(const geo_hvd& a, const geo_hvd& b) {
    return same(a.horizontal, b.horizontal) && same(a.vertical, b.vertical) && same(a.distance, b.distance);
}
bool same(const geo_vector& a, const geo_vector& b) {
    return same(a.x, b.x) && same(a.y, b.y);
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

auto reduce(decltype(geo_reduce_obs)* function, const Scene& scene) {
    return [function = bench::out_of_sight(function), &scene](const geo_hvd& obs) {
        geo_nee out;
        function(obs, scene.station, HEIGHT, out, SCALE);
        return out;
    };
}

auto calculate(decltype(geo_calc_obs)* function, const Scene& scene) {
    return [function = bench::out_of_sight(function), &scene](const geo_nee& point) {
        geo_hvd out = {};
        function(scene.station, HEIGHT, point, 0.0, out, SCALE);
        return out;
    };
}

auto deltas(decltype(geo_spiral_deltas)* function) {
    return [function = bench::out_of_sight(function)](const geo_vector& spiral) {
        geo_vector out = {};
        function(spiral.x, spiral.y, spiral.z, out.x, out.y);
        return out;
    };
}

void reduce_row(benchmark::State& state, decltype(geo_reduce_obs)* function) {
    const Scene scene;
    run(state, scene.observations, reduce(function, scene), reduce(geo_reduce_obs, scene));
}

void calculate_row(benchmark::State& state, decltype(geo_calc_obs)* function) {
    const Scene scene;
    run(state, scene.points, calculate(function, scene), calculate(geo_calc_obs, scene));
}

void spiral_row(benchmark::State& state, decltype(geo_spiral_deltas)* function) {
    run(state, Scene().spirals, deltas(function), deltas(geo_spiral_deltas));
}

BENCHMARK_CAPTURE(reduce_row, basalt, geo_reduce_obs)->Name("reduce_observation/basalt");
BENCHMARK_CAPTURE(reduce_row, plain, plain_reduce)->Name("reduce_observation/plain_form");
BENCHMARK_CAPTURE(calculate_row, basalt, geo_calc_obs)->Name("calculate_observation/basalt");
BENCHMARK_CAPTURE(calculate_row, plain, plain_calculate)->Name("calculate_observation/plain_form");
BENCHMARK_CAPTURE(spiral_row, basalt, geo_spiral_deltas)->Name("spiral_deltas/basalt");
BENCHMARK_CAPTURE(spiral_row, plain, plain_deltas)->Name("spiral_deltas/plain_form");

}  // namespace

BENCHMARK_MAIN();
