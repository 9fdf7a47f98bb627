// Regions made of a bitmap's pixels, beside pixman. Regions are compared before anything is timed.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <vector>

#include "basalt/graphics.h"
#include "basalt/platform.h"

#ifdef BENCH_HAS_PIXMAN
#include <pixman.h>
#endif

namespace {

using Pixels = std::vector<std::uint32_t>;

constexpr std::uint32_t KEY = 0x00808080;
constexpr int SIDE = 2000;

Pixels blobs() {
    Pixels pixels(static_cast<std::size_t>(SIDE) * SIDE);
    for (int y = 0; y < SIDE; ++y) {
        for (int x = 0; x < SIDE; ++x) {
            const int dx = x % 200 - 100;
            const int dy = y % 200 - 100;
            pixels[static_cast<std::size_t>(y * SIDE + x)] = dx * dx + dy * dy < 6400 ? 0x00FFFFFF : KEY;
        }
    }
    return pixels;
}

Pixels checkerboard() {
    Pixels pixels(static_cast<std::size_t>(SIDE) * SIDE);
    for (int i = 0; i < SIDE * SIDE; ++i) {
        pixels[static_cast<std::size_t>(i)] = (i / SIDE + i) % 2 == 0 ? 0x00FFFFFF : KEY;
    }
    return pixels;
}

void region_basalt(benchmark::State& state, Pixels (*picture)()) {
    CBitmap bitmap;
    bitmap.CreateBitmap(SIDE, SIDE, 1, 32, picture().data());
    for ([[maybe_unused]] auto _ : state) {
        CRgn region;
        vex_util::mfc::RegionFromBitmap(region, bitmap, KEY);
        benchmark::ClobberMemory();
    }
}

#ifdef BENCH_HAS_PIXMAN

/// The rows' runs, sorted as they come, and the region made of them at once.
void region_pixman(benchmark::State& state, Pixels (*picture)()) {
    const Pixels pixels = picture();
    CBitmap bitmap;
    bitmap.CreateBitmap(SIDE, SIDE, 1, 32, pixels.data());
    CRgn expected;
    vex_util::mfc::RegionFromBitmap(expected, bitmap, KEY);
    pixman_region32_t region;
    const auto make = [&] {
        std::vector<pixman_box32_t> boxes;
        for (int y = 0; y < SIDE; ++y) {
            const std::uint32_t* const row = &pixels[static_cast<std::size_t>(y) * SIDE];
            for (int x = 0; x < SIDE;) {
                if (row[x] == KEY) {
                    ++x;
                    continue;
                }
                const int start = x;
                while (x < SIDE && row[x] != KEY) {
                    ++x;
                }
                boxes.push_back({start, y, x, y + 1});
            }
        }
        pixman_region32_init_rects(&region, boxes.data(), static_cast<int>(boxes.size()));
    };
    make();
    for (int i = 0; i < SIDE * SIDE; i += 37) {
        const int x = i % SIDE;
        const int y = i / SIDE;
        if (expected.PtInRegion(x, y) != pixman_region32_contains_point(&region, x, y, nullptr)) {
            state.SkipWithError("regions differ");
            return;
        }
    }
    pixman_region32_fini(&region);
    for ([[maybe_unused]] auto _ : state) {
        make();
        pixman_region32_fini(&region);
    }
}

#endif

BENCHMARK_CAPTURE(region_basalt, blobs, blobs)->Name("region_of_blobs/basalt");
#ifdef BENCH_HAS_PIXMAN
BENCHMARK_CAPTURE(region_pixman, blobs, blobs)->Name("region_of_blobs/pixman_from_sorted_rectangles");
#endif
BENCHMARK_CAPTURE(region_basalt, checkerboard, checkerboard)->Name("region_of_a_checkerboard/basalt");
#ifdef BENCH_HAS_PIXMAN
BENCHMARK_CAPTURE(region_pixman, checkerboard, checkerboard)
    ->Name("region_of_a_checkerboard/pixman_from_sorted_rectangles");
#endif

}  // namespace

BENCHMARK_MAIN();
