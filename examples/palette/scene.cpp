#include "scene.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>

namespace {

// Places in the scene: x from 0 (left) to 1, y from 0 (top) to 1.
constexpr double SUN_X = 0.68;
constexpr double SUN_Y = 0.40;
constexpr double HORIZON = 0.66;
constexpr int RIDGES = 4;

COLORREF sky(double x, double y) {
    const double down = std::clamp(y / HORIZON, 0.0, 1.0);
    const COLORREF air = mixed(RGB(30, 74, 172), RGB(255, 168, 92), down * down);
    const double from_sun = std::hypot((x - SUN_X) * 1.6, y - SUN_Y);
    const COLORREF glow = mixed(air, RGB(255, 214, 96), 0.85 * std::exp(-7.0 * from_sun));
    return from_sun < 0.035 ? RGB(255, 250, 228) : glow;
}

/// Top of a ridge, the farthest first.
double ridge(int number, double x) {
    const double n = number;
    return 0.46 + 0.11 * n - 0.055 * std::sin(5.1 * x + 1.9 * n) - 0.028 * std::sin(13.7 * x + 4.1 * n * n) -
           0.008 * std::sin(61.0 * x + 9.0 * n) - 0.004 * std::sin(149.0 * x + 2.0 * n);
}

/// Sky, and before it ridges with haze at the foot of each.
COLORREF scene_at(double x, double y) {
    COLORREF colour = sky(x, y);
    for (int number = 0; number < RIDGES; ++number) {
        const double below = y - ridge(number, x);
        if (below > 0.0) {
            const COLORREF ground = mixed(RGB(158, 98, 140), RGB(16, 62, 30), number / (RIDGES - 1.0));
            colour = mixed(ground, sky(x, HORIZON), std::min(0.45, 2.2 * below * (RIDGES - number) / RIDGES));
        }
    }
    return colour;
}

}  // namespace

Canvas make_scene(int width, int height) {
    Canvas canvas(width, height, 0);
    for (int row = 0; row < height; ++row) {
        for (int column = 0; column < width; ++column) {
            canvas.set(column, row, scene_at((column + 0.5) / width, (row + 0.5) / height));
        }
    }
    return canvas;
}

Matched match(const Canvas& picture, const ColorPalette& palette) {
    Matched matched = {Canvas(picture.width(), picture.height(), 0),
                       std::int64_t{picture.width()} * picture.height(), 0, 0.0};
    std::array<bool, 256> used = {};
    std::int64_t sum = 0;
    for (int y = 0; y < picture.height(); ++y) {
        for (int x = 0; x < picture.width(); ++x) {
            const COLORREF wanted = picture.get(x, y);
            const unsigned char number = palette.FindClosestColor(wanted);
            const COLORREF given = palette[number];
            used[number] = true;
            matched.picture.set(x, y, given);
            for (const int shift : {0, 8, 16}) {
                sum += std::abs(static_cast<int>(wanted >> shift & 0xFF) -
                                static_cast<int>(given >> shift & 0xFF));
            }
        }
    }
    matched.colours_used = static_cast<int>(std::count(used.begin(), used.end(), true));
    matched.mean_difference = static_cast<double>(sum) / (3.0 * static_cast<double>(matched.pixels));
    return matched;
}
