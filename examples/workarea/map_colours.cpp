#include "map_colours.h"

#include <basalt/graphics.h>

#include <algorithm>
#include <cstddef>

#include "canvas.h"

namespace {

/// Number of a hue's pale colour in the palette's large range: ten entries a hue, 15 degrees apart, of which
/// every second is pale, from the brightest of five levels to the darkest.
unsigned char pale(int degrees, int level) {
    return static_cast<unsigned char>(ColorPalette::GetLargePaletteStartIndex() + degrees / 15 * 10 +
                                      2 * level + 1);
}

}  // namespace

std::vector<COLORREF> elevation_stops() {
    const ColorPalette palette;
    const auto grey = static_cast<unsigned char>(ColorPalette::GetThirdPaletteEndIndex());
    std::vector<COLORREF> stops;
    for (const unsigned char number : {pale(150, 2), pale(105, 1), pale(60, 0), pale(45, 1), pale(30, 2),
                                       grey, ColorPalette::GetWhiteColorIndex()}) {
        stops.push_back(mixed(palette[number], PAPER, 0.25));
    }
    return stops;
}

COLORREF between_stops(const std::vector<COLORREF>& stops, double part) {
    const double place = std::clamp(part, 0.0, 1.0) * static_cast<double>(stops.size() - 1);
    const std::size_t first = std::min(static_cast<std::size_t>(place), stops.size() - 2);
    return mixed(stops[first], stops[first + 1], place - static_cast<double>(first));
}

float darkening_at(double part) {
    // Channels go in a straight line from the whole to 1 / DARKENING.
    return static_cast<float>(1.0 / (1.0 - part + part / static_cast<double>(DARKENING)));
}

COLORREF darkened(COLORREF hue, double part) {
    return mixed(0, hue, 1.0 / static_cast<double>(darkening_at(std::clamp(part, 0.0, 1.0))));
}

COLORREF lit(COLORREF colour, double light) {
    constexpr double SHADOW = 0.35;  // what the sky gives where the sun does not reach
    constexpr double GLARE = 0.55;
    if (light < 1.0) {
        return mixed(0, colour, SHADOW + (1.0 - SHADOW) * light);
    }
    return mixed(colour, PAPER, std::min(1.0, GLARE * (light - 1.0)));
}
