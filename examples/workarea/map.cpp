#include "map.h"

#include <basalt/graphics.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <limits>

namespace {

/// Number of a hue's pale colour in the palette's large range: ten entries a hue, 15 degrees apart, of which
/// every second is pale, from the brightest of five levels to the darkest.
unsigned char pale(int degrees, int level) {
    return static_cast<unsigned char>(ColorPalette::GetLargePaletteStartIndex() + degrees / 15 * 10 +
                                      2 * level + 1);
}

/// Between two of the stops; `part` 0 is the first, 1 the last.
COLORREF between_stops(const std::vector<COLORREF>& stops, double part) {
    const double place = std::clamp(part, 0.0, 1.0) * static_cast<double>(stops.size() - 1);
    const std::size_t first = std::min(static_cast<std::size_t>(place), stops.size() - 2);
    return mixed(stops[first], stops[first + 1], place - static_cast<double>(first));
}

/// A hue a part of the way down to the largest depth.
COLORREF darkened(COLORREF hue, double part) {
    return mixed(0, hue, 1.0 / static_cast<double>(darkening_at(std::clamp(part, 0.0, 1.0))));
}

/// A colour under some light: 1 leaves it as it is.
COLORREF lit(COLORREF colour, double light) {
    constexpr double SHADOW = 0.35;  // what the sky gives where the sun does not reach
    constexpr double GLARE = 0.55;
    if (light < 1.0) {
        return mixed(0, colour, SHADOW + (1.0 - SHADOW) * light);
    }
    return mixed(colour, PAPER, std::min(1.0, GLARE * (light - 1.0)));
}

/// Place of a point of the local plane on the map.
CanvasPoint on_map(const Map& map, const geo_nee& point) {
    const GridFrame& frame = map.outcome.area.frame();
    const geo_nee corner = map.outcome.area.plane().to_grid(frame.west, frame.north(), 0.0);
    return {(point.east - corner.east) / map.metres_per_pixel,
            (corner.north - point.north) / map.metres_per_pixel};
}

struct Pixel {
    int x;
    int y;
    double cell_x;  ///< its centre's place in cells from the grid's south-west corner
    double cell_y;
    bool counts;  ///< inside the view and the boundary
};

/// Calls visit(Pixel) for every pixel of the map.
template <typename Visit>
void visit_pixels(const Map& map, Visit visit) {
    const Outcome& outcome = map.outcome;
    const GridFrame& frame = outcome.area.frame();
    const geo_nee corner = outcome.area.plane().to_grid(frame.west, frame.north(), 0.0);
    const basalt::PreparedPolygon boundary(outcome.boundary);
    for (int y = 0; y < map.height; ++y) {
        for (int x = 0; x < map.width; ++x) {
            const double cell_x = (x + 0.5) / map.width * frame.columns;
            const double cell_y = (map.height - y - 0.5) / map.height * frame.rows;
            const geo_nee point = {corner.north - (y + 0.5) * map.metres_per_pixel,
                                   corner.east + (x + 0.5) * map.metres_per_pixel, 0.0};
            const bool counts = outcome.view.contains(static_cast<int>(cell_x), static_cast<int>(cell_y)) &&
                                (outcome.boundary.empty() || boundary.contains(point));
            visit(Pixel{x, y, cell_x, cell_y, counts});
        }
    }
}

/// A closed line on a light ground, in dashes of about a length.
void draw_outline(Canvas& canvas, const std::vector<CanvasPoint>& corners, double dash) {
    for (std::size_t i = 0; i < corners.size(); ++i) {
        canvas.line(corners[i], corners[(i + 1) % corners.size()], 4.0, PAPER, 0.7);
    }
    for (std::size_t i = 0; i < corners.size(); ++i) {
        const CanvasPoint& from = corners[i];
        const CanvasPoint& to = corners[(i + 1) % corners.size()];
        const double length = std::hypot(to.x - from.x, to.y - from.y);
        const double pieces = 2.0 * std::floor(length / dash / 2.0) + 1.0;  // dashes and gaps by turns
        const auto at = [&](double piece) {
            return CanvasPoint{from.x + piece / pieces * (to.x - from.x),
                               from.y + piece / pieces * (to.y - from.y)};
        };
        for (double piece = 0.0; piece < pieces; piece += 2.0) {
            canvas.line(at(piece), at(piece + 1.0), 2.0, INK);
        }
    }
}

void draw_boundary(const Map& map, Canvas& canvas) {
    std::vector<CanvasPoint> points;
    for (const geo_nee& point : map.outcome.boundary) {
        points.push_back(on_map(map, point));
    }
    draw_outline(canvas, points, std::numeric_limits<double>::infinity());
}

void draw_view(const Map& map, Canvas& canvas) {
    const DegreeBox& view = *map.outcome.options.view;
    const auto corner = [&map](double longitude, double latitude) {
        const CanvasPoint point = on_map(map, map.outcome.area.plane().to_grid(longitude, latitude, 0.0));
        // A view may be the whole earth: what lies far outside the map needs no dashes.
        constexpr double BEYOND = 20.0;
        return CanvasPoint{std::clamp(point.x, -BEYOND, map.width + BEYOND),
                           std::clamp(point.y, -BEYOND, map.height + BEYOND)};
    };
    const CanvasPoint a = corner(view.west, view.north);
    const CanvasPoint c = corner(view.east, view.south);
    draw_outline(canvas, {a, {c.x, a.y}, c, {a.x, c.y}}, 9.0);
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

float darkening_at(double part) {
    constexpr double LARGEST = 2.6;
    // Channels go in a straight line from the whole to 1 / LARGEST.
    return static_cast<float>(1.0 / (1.0 - part + part / LARGEST));
}

Map lay_out_map(const Outcome& outcome, const Relief& relief, int longer_side) {
    const GridFrame& frame = outcome.area.frame();
    const geo_nee south_west = outcome.area.plane().to_grid(frame.west, frame.south, 0.0);
    const geo_nee north_east = outcome.area.plane().to_grid(frame.east(), frame.north(), 0.0);
    const double east = north_east.east - south_west.east;
    const double north = north_east.north - south_west.north;
    const double scale = std::max(east, north) / longer_side;
    Map map = {outcome, relief, std::max(1, static_cast<int>(std::lround(east / scale))),
               std::max(1, static_cast<int>(std::lround(north / scale))), scale};
    visit_pixels(map, [&](const Pixel& pixel) {
        const double above = relief.elevation(pixel.cell_x, pixel.cell_y) - outcome.survey.grade;
        if (pixel.counts && has_elevation(above)) {
            map.largest_cut = std::max(map.largest_cut, above);
            map.largest_fill = std::max(map.largest_fill, -above);
        }
    });
    return map;
}

Canvas draw_map(const Map& map) {
    constexpr COLORREF NO_DATA = RGB(222, 222, 222);
    Canvas canvas(map.width, map.height, NO_DATA);
    const std::vector<COLORREF> stops = elevation_stops();
    const double range = std::max(map.relief.highest() - map.relief.lowest(), 1e-3);
    const double depth = std::max({map.largest_cut, map.largest_fill, 1e-3});
    visit_pixels(map, [&](const Pixel& pixel) {
        const double elevation = map.relief.elevation(pixel.cell_x, pixel.cell_y);
        if (has_elevation(elevation)) {
            const double above = elevation - map.outcome.survey.grade;
            const COLORREF colour = pixel.counts
                                        ? darkened(above > 0.0 ? CUT : FILL, std::abs(above) / depth)
                                        : between_stops(stops, (elevation - map.relief.lowest()) / range);
            canvas.set(pixel.x, pixel.y, lit(colour, map.relief.light(pixel.cell_x, pixel.cell_y)));
        }
    });
    if (!map.outcome.boundary.empty()) {
        draw_boundary(map, canvas);
    }
    if (map.outcome.options.view) {
        draw_view(map, canvas);
    }
    return canvas;
}
