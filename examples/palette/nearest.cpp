#include "nearest.h"

#include <algorithm>
#include <array>
#include <cstdlib>

Matched match(const Canvas& picture, const ColorPalette& palette) {
    Matched matched = {Canvas(picture.width(), picture.height(), 0),
                       std::int64_t{picture.width()} * picture.height(), 0, 0.0, 0};
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
                const int difference = std::abs(static_cast<int>(wanted >> shift & 0xFF) -
                                                static_cast<int>(given >> shift & 0xFF));
                sum += difference;
                matched.largest_difference = std::max(matched.largest_difference, difference);
            }
        }
    }
    matched.colours_used = static_cast<int>(std::count(used.begin(), used.end(), true));
    matched.mean_difference = static_cast<double>(sum) / (3.0 * static_cast<double>(matched.pixels));
    return matched;
}
