// The nearest colour of the palette, beside a plain scan. Results are compared before anything is timed.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <cstdlib>
#include <random>
#include <vector>

#include "basalt/graphics/palette.h"

namespace {

std::vector<std::uint32_t> random_colours() {
    std::mt19937 random(1);
    std::vector<std::uint32_t> colours(1024);
    for (std::uint32_t& colour : colours) {
        colour = static_cast<std::uint32_t>(random()) & 0xFFFFFF;
    }
    return colours;
}

unsigned char scan(const std::uint32_t* colours, std::uint32_t wanted) {
    int best = 300;
    unsigned char candidate = 0;
    for (int i = 0; i < 256; ++i) {
        if (colours[i] == wanted) {
            return static_cast<unsigned char>(i);
        }
        int distance = 0;
        for (const int shift : {16, 8, 0}) {
            const int a = static_cast<int>(colours[i] >> shift & 0xFF);
            const int b = static_cast<int>(wanted >> shift & 0xFF);
            distance += std::abs((a - b) * 100 / 255);
        }
        if (distance < best) {
            best = distance;
            candidate = static_cast<unsigned char>(i);
        }
    }
    return candidate;
}

template <typename Find>
void nearest_colour(benchmark::State& state, const Find& find) {
    const ColorPalette palette;
    const std::vector<std::uint32_t> colours = random_colours();
    for (const std::uint32_t colour : colours) {
        if (find(colour) != palette.FindClosestColor(colour)) {
            state.SkipWithError("results differ");
            return;
        }
    }
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(find(colours[at]));
        at = (at + 1) % colours.size();
    }
}

void nearest_colour_basalt(benchmark::State& state) {
    const ColorPalette palette;
    nearest_colour(state, [&palette](std::uint32_t colour) { return palette.FindClosestColor(colour); });
}

void nearest_colour_scan(benchmark::State& state) {
    std::uint32_t colours[256];
    ColorPalette().ToMemory(colours);
    nearest_colour(state, [&colours](std::uint32_t colour) { return scan(colours, colour); });
}

BENCHMARK(nearest_colour_basalt)->Name("nearest_colour/basalt");
BENCHMARK(nearest_colour_scan)->Name("nearest_colour/plain_scan");

}  // namespace

BENCHMARK_MAIN();
