// Drawing beside cairo, pixman and plain loops. Before a row is timed, its picture is compared with the
// library's, where the two draw the same picture.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <numbers>
#include <random>
#include <vector>

#include "basalt/graphics.h"
#include "basalt/platform.h"
#include "bench/limits.h"

#ifdef BENCH_HAS_CAIRO
#include <cairo.h>
#endif
#ifdef BENCH_HAS_PIXMAN
#include <pixman.h>
#endif

namespace {

constexpr int WIDTH = 1920;
constexpr int HEIGHT = 1080;
constexpr std::uint32_t KEY = 0x00808080;

using Pixels = std::vector<std::uint32_t>;

/// A 32-bit surface with a context.
class Screen {
public:
    Screen(int width, int height, const std::uint32_t* pixels = nullptr) : m_width(width), m_height(height) {
        m_dc.CreateCompatibleDC(nullptr);
        m_bitmap.CreateBitmap(width, height, 1, 32, pixels);
        m_replaced = m_dc.SelectObject(&m_bitmap);
    }
    ~Screen() { m_dc.SelectObject(m_replaced); }
    Screen(const Screen&) = delete;
    Screen& operator=(const Screen&) = delete;

    operator HDC() const { return m_dc; }
    CBitmap& bitmap() { return m_bitmap; }
    Pixels pixels() const {
        Pixels result(static_cast<std::size_t>(m_width) * static_cast<std::size_t>(m_height));
        BITMAPINFO info = {{40, m_width, -m_height, 1, 32, BI_RGB, 0, 0, 0, 0, 0}, {}};
        GetDIBits(m_dc, m_bitmap, 0, static_cast<UINT>(m_height), result.data(), &info, DIB_RGB_COLORS);
        return result;
    }

private:
    int m_width;
    int m_height;
    CDC m_dc;
    CBitmap m_bitmap;
    CBitmap* m_replaced = nullptr;
};

/// Times `draw`, after one call whose picture has to be within `slack` levels of the one expected.
template <typename Draw>
void run(benchmark::State& state, const Pixels& drawn, const Pixels& expected, int slack, const Draw& draw) {
    draw();
    for (std::size_t i = 0; i < drawn.size(); ++i) {
        for (const int shift : {0, 8, 16}) {
            const auto level = [shift](std::uint32_t word) { return static_cast<int>(word >> shift & 0xFF); };
            if (std::abs(level(drawn[i]) - level(expected[i])) > slack) {
                state.SkipWithError("pictures differ");
                return;
            }
        }
    }
    for ([[maybe_unused]] auto _ : state) {
        draw();
        benchmark::ClobberMemory();
    }
}

template <typename Draw>
void run_own(benchmark::State& state, const Draw& draw) {
    draw();
    for ([[maybe_unused]] auto _ : state) {
        draw();
        benchmark::ClobberMemory();
    }
}

void picture_copied(benchmark::State& state) {
    bench::copying(state, std::size_t{WIDTH} * HEIGHT * 4);
}

void picture_set(benchmark::State& state) {
    bench::setting(state, std::size_t{WIDTH} * HEIGHT * 4);
}

// Gradients.

void draw_gradient(HDC dc, DWORD mode) {
    const TRIVERTEX corners[2] = {{0, 0, 0xFF00, 0x4000, 0, 0}, {WIDTH, HEIGHT, 0x7F00, 0x2000, 0xFF00, 0}};
    const GRADIENT_RECT mesh = {0, 1};
    GradientFill(dc, corners, 2, &mesh, 1, mode);
}

void gradient_basalt(benchmark::State& state, DWORD mode) {
    const Screen screen(WIDTH, HEIGHT);
    run_own(state, [&] { draw_gradient(screen, mode); });
}

void gradient_copied_row(benchmark::State& state) {
    const Screen screen(WIDTH, HEIGHT);
    draw_gradient(screen, GRADIENT_FILL_RECT_H);
    const Pixels expected = screen.pixels();
    Pixels drawn = expected;
    run(state, drawn, expected, 0, [&] {
        for (int y = 1; y < HEIGHT; ++y) {
            std::memcpy(&drawn[static_cast<std::size_t>(y) * WIDTH], drawn.data(), WIDTH * 4);
        }
    });
}

#ifdef BENCH_HAS_CAIRO

void gradient_cairo(benchmark::State& state, DWORD mode) {
    const Screen screen(WIDTH, HEIGHT);
    draw_gradient(screen, mode);
    Pixels drawn(static_cast<std::size_t>(WIDTH) * HEIGHT);
    cairo_surface_t* const surface = cairo_image_surface_create_for_data(
        reinterpret_cast<unsigned char*>(drawn.data()), CAIRO_FORMAT_RGB24, WIDTH, HEIGHT, WIDTH * 4);
    cairo_t* const context = cairo_create(surface);
    const bool across = mode == GRADIENT_FILL_RECT_H;
    cairo_pattern_t* const pattern =
        cairo_pattern_create_linear(0, 0, across ? WIDTH : 0, across ? 0 : HEIGHT);
    cairo_pattern_add_color_stop_rgb(pattern, 0, 1, 64 / 255.0, 0);
    cairo_pattern_add_color_stop_rgb(pattern, 1, 127 / 255.0, 32 / 255.0, 1);
    cairo_set_source(context, pattern);
    // It samples at the pixel's middle and rounds, which makes a level of difference.
    run(state, drawn, screen.pixels(), 1, [&] {
        cairo_paint(context);
        cairo_surface_flush(surface);
    });
    cairo_pattern_destroy(pattern);
    cairo_destroy(context);
    cairo_surface_destroy(surface);
}

#endif

BENCHMARK_CAPTURE(gradient_basalt, across, GRADIENT_FILL_RECT_H)->Name("gradient_horizontal/basalt");
#ifdef BENCH_HAS_CAIRO
BENCHMARK_CAPTURE(gradient_cairo, across, GRADIENT_FILL_RECT_H)->Name("gradient_horizontal/cairo");
#endif
BENCHMARK(gradient_copied_row)->Name("gradient_horizontal/limit_copying_a_row_down");
BENCHMARK_CAPTURE(gradient_basalt, down, GRADIENT_FILL_RECT_V)->Name("gradient_vertical/basalt");
BENCHMARK(picture_set)->Name("gradient_vertical/limit_memset");
#ifdef BENCH_HAS_CAIRO
BENCHMARK_CAPTURE(gradient_cairo, down, GRADIENT_FILL_RECT_V)->Name("gradient_vertical/cairo");
#endif

// Copies that leave a colour out.

/// Runs of the key and of other colours, of 1 to twice `mean` pixels.
Pixels runs_of(int mean) {
    std::mt19937 random(2);
    Pixels pixels(static_cast<std::size_t>(WIDTH) * HEIGHT);
    bool is_key = false;
    for (std::size_t i = 0; i < pixels.size();) {
        const std::size_t length = 1 + random() % static_cast<unsigned>(2 * mean);
        for (std::size_t end = std::min(i + length, pixels.size()); i < end; ++i) {
            pixels[i] = is_key ? KEY : static_cast<std::uint32_t>(random()) & 0x00FFFFFF;
        }
        is_key = !is_key;
    }
    return pixels;
}

void transparent_basalt(benchmark::State& state, int mean) {
    const Screen source(WIDTH, HEIGHT, runs_of(mean).data());
    const Screen screen(WIDTH, HEIGHT);
    run_own(state, [&] { TransparentBlt(screen, 0, 0, WIDTH, HEIGHT, source, 0, 0, WIDTH, HEIGHT, KEY); });
}

void transparent_plain_loop(benchmark::State& state, int mean) {
    const Pixels from = runs_of(mean);
    const Screen source(WIDTH, HEIGHT, from.data());
    const Screen screen(WIDTH, HEIGHT);
    TransparentBlt(screen, 0, 0, WIDTH, HEIGHT, source, 0, 0, WIDTH, HEIGHT, KEY);
    Pixels drawn(from.size());
    run(state, drawn, screen.pixels(), 0, [&] {
        for (std::size_t i = 0; i < from.size(); ++i) {
            if ((from[i] & 0xFFFFFF) != KEY) {
                drawn[i] = from[i];
            }
        }
    });
}

BENCHMARK_CAPTURE(transparent_basalt, short_runs, 4)->Name("transparent_copy_of_short_runs/basalt");
BENCHMARK_CAPTURE(transparent_plain_loop, short_runs, 4)->Name("transparent_copy_of_short_runs/plain_loop");
BENCHMARK(picture_copied)->Name("transparent_copy_of_short_runs/limit_memcpy");
BENCHMARK_CAPTURE(transparent_basalt, long_runs, 200)->Name("transparent_copy_of_long_runs/basalt");
BENCHMARK_CAPTURE(transparent_plain_loop, long_runs, 200)->Name("transparent_copy_of_long_runs/plain_loop");
BENCHMARK(picture_copied)->Name("transparent_copy_of_long_runs/limit_memcpy");

// Rotation.

Pixels noise() {
    std::mt19937 random(3);
    Pixels pixels(static_cast<std::size_t>(WIDTH) * HEIGHT);
    for (std::uint32_t& pixel : pixels) {
        pixel = static_cast<std::uint32_t>(random()) & 0x00FFFFFF;
    }
    return pixels;
}

XFORM turn(double degrees) {
    const double a = degrees * std::numbers::pi / 180;
    const double x = WIDTH / 2;
    const double y = HEIGHT / 2;
    const double c = std::cos(a);
    const double s = std::sin(a);
    return {static_cast<float>(c),
            static_cast<float>(s),
            static_cast<float>(-s),
            static_cast<float>(c),
            static_cast<float>(x - x * c + y * s),
            static_cast<float>(y - x * s - y * c)};
}

void rotation_basalt(benchmark::State& state) {
    const Screen source(WIDTH, HEIGHT, noise().data());
    const Screen screen(WIDTH, HEIGHT);
    const XFORM transform = turn(static_cast<double>(state.range(0)));
    SetGraphicsMode(screen, GM_ADVANCED);
    SetWorldTransform(screen, &transform);
    run_own(state, [&] { BitBlt(screen, 0, 0, WIDTH, HEIGHT, source, 0, 0, SRCCOPY); });
}

#ifdef BENCH_HAS_PIXMAN

void rotation_pixman(benchmark::State& state) {
    Pixels from = noise();
    Pixels to(from.size());
    pixman_image_t* const source =
        pixman_image_create_bits(PIXMAN_x8r8g8b8, WIDTH, HEIGHT, from.data(), WIDTH * 4);
    pixman_image_t* const screen =
        pixman_image_create_bits(PIXMAN_x8r8g8b8, WIDTH, HEIGHT, to.data(), WIDTH * 4);
    const XFORM t = turn(static_cast<double>(state.range(0)));
    pixman_f_transform f = {{{double{t.eM11}, double{t.eM21}, double{t.eDx}},
                             {double{t.eM12}, double{t.eM22}, double{t.eDy}},
                             {0, 0, 1}}};
    pixman_f_transform inverse;
    pixman_f_transform_invert(&inverse, &f);
    pixman_transform_t fixed;
    pixman_transform_from_pixman_f_transform(&fixed, &inverse);
    pixman_image_set_transform(source, &fixed);
    pixman_image_set_filter(source, PIXMAN_FILTER_NEAREST, nullptr, 0);
    const auto draw = [&] {
        pixman_image_composite32(PIXMAN_OP_OVER, source, nullptr, screen, 0, 0, 0, 0, 0, 0, WIDTH, HEIGHT);
    };
    // Its positions have 16 fractional bits: near the far edge, some pixels are their neighbours.
    const Screen own_source(WIDTH, HEIGHT, noise().data());
    const Screen own(WIDTH, HEIGHT);
    SetGraphicsMode(own, GM_ADVANCED);
    SetWorldTransform(own, &t);
    BitBlt(own, 0, 0, WIDTH, HEIGHT, own_source, 0, 0, SRCCOPY);
    draw();
    const Pixels expected = own.pixels();
    std::size_t different = 0;
    for (std::size_t i = 0; i < to.size(); ++i) {
        different += ((to[i] ^ expected[i]) & 0xFFFFFF) != 0;
    }
    if (different > to.size() / 50) {
        state.SkipWithError("pictures differ");
    } else {
        for ([[maybe_unused]] auto _ : state) {
            draw();
            benchmark::ClobberMemory();
        }
    }
    pixman_image_unref(source);
    pixman_image_unref(screen);
}

#endif

BENCHMARK(rotation_basalt)->Name("rotation/basalt")->ArgName("degrees")->Arg(5)->Arg(30)->Arg(90);
BENCHMARK(picture_copied)->Name("rotation/limit_memcpy")->ArgName("degrees")->Arg(5)->Arg(30)->Arg(90);
#ifdef BENCH_HAS_PIXMAN
BENCHMARK(rotation_pixman)->Name("rotation/pixman")->ArgName("degrees")->Arg(5)->Arg(30)->Arg(90);
#endif

}  // namespace

BENCHMARK_MAIN();
