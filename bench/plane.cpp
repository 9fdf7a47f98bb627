// Point in polygon, with and without a tolerance band, beside the plain loop, Boost.Geometry and GEOS. Before
// a row is timed, its results for all points are compared with the library's.
#include <benchmark/benchmark.h>

#include <cmath>
#include <numbers>
#include <vector>

#include "basalt/geo.h"
#include "bench/limits.h"
#include "tests/geo/plain_forms.h"

#if __has_include(<boost/geometry.hpp>)
#define HAS_BOOST_GEOMETRY 1
#include <boost/geometry.hpp>
#include <boost/geometry/geometries/point_xy.hpp>
#include <boost/geometry/geometries/ring.hpp>
#endif
#ifdef BENCH_HAS_GEOS
#include <geos_c.h>
#endif

namespace {

constexpr double TOLERANCE = 0.05;
constexpr int POINTS = 1024;

/// A parcel: a closed outline with wavy sides around a survey grid's usual coordinates, and points all about
/// it.
struct Scene {
    std::vector<geo_nee> polygon;
    std::vector<geo_nee> points;

    explicit Scene(int n) {
        plain::Random random(42);
        for (int i = 0; i < n; ++i) {
            const double angle = 2.0 * std::numbers::pi * i / n;
            const double r = 400.0 + 80.0 * std::sin(5.0 * angle) + random.real(-100.0, 100.0) / n;
            polygon.push_back({5.8e6 + r * std::cos(angle), 3.5e5 - r * std::sin(angle), 0.0});
        }
        for (int i = 0; i < POINTS; ++i) {
            points.push_back({5.8e6 + random.real(-500.0, 500.0), 3.5e5 + random.real(-500.0, 500.0), 0.0});
        }
    }

    int size() const { return static_cast<int>(polygon.size()); }
};

/// Times `call` over the scene's points, one a turn; `expected` is the library's own result.
template <typename Call, typename Expected>
void run(benchmark::State& state, const Scene& scene, const Call& call, const Expected& expected) {
    for (const geo_nee& point : scene.points) {
        if (call(point) != expected(point)) {
            state.SkipWithError("results differ");
            return;
        }
    }
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(call(scene.points[at]));
        at = (at + 1) % POINTS;
    }
}

int size_of(const benchmark::State& state) {
    return static_cast<int>(state.range(0));
}

auto in_poly(const Scene& scene) {
    return [&scene](const geo_nee& p) { return geo_point_in_poly(scene.size(), scene.polygon.data(), &p); };
}

auto in_band(const Scene& scene) {
    return [&scene](const geo_nee& p) {
        return geo_point_in_poly_2(scene.size(), scene.polygon.data(), &p, TOLERANCE);
    };
}

void in_polygon_basalt(benchmark::State& state) {
    const Scene scene(size_of(state));
    run(state, scene, in_poly(scene), in_poly(scene));
}

void in_polygon_prepared(benchmark::State& state) {
    const Scene scene(size_of(state));
    const basalt::PreparedPolygon prepared(scene.polygon);
    run(
        state, scene, [&](const geo_nee& p) { return prepared.contains(p) ? 1 : 0; }, in_poly(scene));
}

void preparing(benchmark::State& state) {
    const Scene scene(size_of(state));
    for ([[maybe_unused]] auto _ : state) {
        const basalt::PreparedPolygon prepared(scene.polygon);
        benchmark::DoNotOptimize(&prepared);
    }
}

void in_polygon_plain_loop(benchmark::State& state) {
    const Scene scene(size_of(state));
    run(
        state, scene,
        [&](const geo_nee& p) { return plain::point_in_poly(scene.size(), scene.polygon.data(), p); },
        in_poly(scene));
}

void in_band_basalt(benchmark::State& state) {
    const Scene scene(size_of(state));
    run(state, scene, in_band(scene), in_band(scene));
}

void in_band_prepared(benchmark::State& state) {
    const Scene scene(size_of(state));
    const basalt::PreparedPolygon prepared(scene.polygon);
    run(
        state, scene, [&](const geo_nee& p) { return prepared.contains(p, TOLERANCE) ? 1 : 0; },
        in_band(scene));
}

void in_band_plain_loop(benchmark::State& state) {
    const Scene scene(size_of(state));
    run(
        state, scene,
        [&](const geo_nee& p) {
            return plain::point_in_poly_2(scene.size(), scene.polygon.data(), p, TOLERANCE);
        },
        in_band(scene));
}

#ifdef HAS_BOOST_GEOMETRY

using BoostPoint = boost::geometry::model::d2::point_xy<double>;
using BoostRing = boost::geometry::model::ring<BoostPoint, true, false>;

BoostRing boost_ring(const Scene& scene) {
    BoostRing ring;
    for (const geo_nee& v : scene.polygon) {
        ring.emplace_back(v.east, v.north);
    }
    boost::geometry::correct(ring);
    return ring;
}

void in_polygon_boost(benchmark::State& state) {
    const Scene scene(size_of(state));
    const BoostRing ring = boost_ring(scene);
    run(
        state, scene,
        [&](const geo_nee& p) {
            return static_cast<int>(boost::geometry::within(BoostPoint(p.east, p.north), ring));
        },
        in_poly(scene));
}

void in_band_boost(benchmark::State& state) {
    const Scene scene(size_of(state));
    const BoostRing ring = boost_ring(scene);
    run(
        state, scene,
        [&](const geo_nee& p) {
            return static_cast<int>(boost::geometry::distance(BoostPoint(p.east, p.north), ring) <=
                                    TOLERANCE);
        },
        in_band(scene));
}

#endif

#ifdef BENCH_HAS_GEOS

void in_polygon_geos_prepared(benchmark::State& state) {
    const Scene scene(size_of(state));
    const GEOSContextHandle_t context = GEOS_init_r();
    const auto length = static_cast<unsigned>(scene.size());
    GEOSCoordSequence* outline = GEOSCoordSeq_create_r(context, length + 1, 2);
    for (unsigned i = 0; i <= length; ++i) {
        const geo_nee& v = scene.polygon[i % length];
        GEOSCoordSeq_setXY_r(context, outline, i, v.east, v.north);
    }
    GEOSGeometry* ring = GEOSGeom_createLinearRing_r(context, outline);
    GEOSGeometry* polygon = GEOSGeom_createPolygon_r(context, ring, nullptr, 0);
    const GEOSPreparedGeometry* prepared = GEOSPrepare_r(context, polygon);
    // Points are made ahead: only the test is timed.
    std::vector<GEOSGeometry*> points;
    for (const geo_nee& p : scene.points) {
        points.push_back(GEOSGeom_createPointFromXY_r(context, p.east, p.north));
    }
    run(
        state, scene,
        [&](const geo_nee& p) {
            const GEOSGeometry* point = points[static_cast<std::size_t>(&p - scene.points.data())];
            return static_cast<int>(GEOSPreparedContains_r(context, prepared, point));
        },
        in_poly(scene));
    for (GEOSGeometry* point : points) {
        GEOSGeom_destroy_r(context, point);
    }
    GEOSPreparedGeom_destroy_r(context, prepared);
    GEOSGeom_destroy_r(context, polygon);
    GEOS_finish_r(context);
}

#endif

void reading_the_points(benchmark::State& state) {
    bench::reading(state, static_cast<std::size_t>(size_of(state)) * sizeof(geo_nee));
}

void polygon_sizes(benchmark::internal::Benchmark* row) {
    row->Arg(10)->Arg(100)->Arg(1000)->Arg(10000)->Arg(100000);
}
void band_sizes(benchmark::internal::Benchmark* row) {
    row->Arg(100)->Arg(1000);
}

BENCHMARK(in_polygon_basalt)->Name("in_polygon/basalt")->Apply(polygon_sizes);
BENCHMARK(in_polygon_prepared)->Name("in_polygon/prepared")->Apply(polygon_sizes);
BENCHMARK(preparing)->Name("in_polygon/preparing")->Apply(polygon_sizes);
BENCHMARK(in_polygon_plain_loop)->Name("in_polygon/plain_loop")->Apply(polygon_sizes);
BENCHMARK(reading_the_points)->Name("in_polygon/limit_reading_the_points")->Apply(polygon_sizes);
#ifdef HAS_BOOST_GEOMETRY
BENCHMARK(in_polygon_boost)->Name("in_polygon/boost")->Apply(polygon_sizes);
#endif
#ifdef BENCH_HAS_GEOS
BENCHMARK(in_polygon_geos_prepared)->Name("in_polygon/geos_prepared")->Apply(polygon_sizes);
#endif
BENCHMARK(in_band_basalt)->Name("in_band/basalt")->Apply(band_sizes);
BENCHMARK(in_band_prepared)->Name("in_band/prepared")->Apply(band_sizes);
BENCHMARK(in_band_plain_loop)->Name("in_band/plain_loop")->Apply(band_sizes);
#ifdef HAS_BOOST_GEOMETRY
BENCHMARK(in_band_boost)->Name("in_band/boost")->Apply(band_sizes);
#endif

}  // namespace

BENCHMARK_MAIN();
