#include "map.h"

#include <basalt/graphics.h>

#include <algorithm>
#include <cmath>
#include <cstddef>

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

std::vector<CanvasPoint> boundary_on(const Map& map) {
    std::vector<CanvasPoint> points;
    for (const geo_nee& point : map.outcome.boundary) {
        points.push_back(on_map(map, point));
    }
    return points;
}

/// Which pixels count, row by row: inside the view, and inside the boundary by the even-odd rule.
class CountedPixels {
public:
    explicit CountedPixels(const Map& map) : m_map(map), m_boundary(boundary_on(map)) {}
    /// Must come before `counts` for the pixels of a row.
    void go_to_row(int y) {
        m_crossings.clear();
        const double middle = y + 0.5;
        for (std::size_t i = 0; i < m_boundary.size(); ++i) {
            const CanvasPoint& a = m_boundary[i];
            const CanvasPoint& b = m_boundary[(i + 1) % m_boundary.size()];
            if ((a.y <= middle) != (b.y <= middle)) {
                m_crossings.push_back(a.x + (b.x - a.x) * (middle - a.y) / (b.y - a.y));
            }
        }
        std::sort(m_crossings.begin(), m_crossings.end());
    }
    bool counts(int x, int cell_x, int cell_y) const {
        if (!m_map.outcome.view.contains(cell_x, cell_y)) {
            return false;
        }
        const double middle = x + 0.5;
        const auto before = std::lower_bound(m_crossings.begin(), m_crossings.end(), middle);
        return m_boundary.empty() || (before - m_crossings.begin()) % 2 != 0;
    }

private:
    const Map& m_map;
    std::vector<CanvasPoint> m_boundary;
    std::vector<double> m_crossings;
};

/// Calls visit(x, y, place in cells east, north, counts) for every pixel of the map.
template <typename Visit>
void visit_pixels(const Map& map, Visit visit) {
    const GridFrame& frame = map.outcome.area.frame();
    CountedPixels counted(map);
    for (int y = 0; y < map.height; ++y) {
        counted.go_to_row(y);
        const double cell_y = (map.height - y - 0.5) / map.height * frame.rows;
        for (int x = 0; x < map.width; ++x) {
            const double cell_x = (x + 0.5) / map.width * frame.columns;
            visit(x, y, cell_x, cell_y,
                  counted.counts(x, static_cast<int>(cell_x), static_cast<int>(cell_y)));
        }
    }
}

void draw_polygon(Canvas& canvas, const std::vector<CanvasPoint>& points, double thickness, COLORREF colour,
                  double opacity) {
    for (std::size_t i = 0; i < points.size(); ++i) {
        canvas.line(points[i], points[(i + 1) % points.size()], thickness, colour, opacity);
    }
}

void draw_boundary(const Map& map, Canvas& canvas) {
    const std::vector<CanvasPoint> points = boundary_on(map);
    draw_polygon(canvas, points, 4.5, PAPER, 0.8);
    draw_polygon(canvas, points, 2.0, INK, 1.0);
}

void draw_view(const Map& map, Canvas& canvas) {
    const DegreeBox& view = *map.outcome.options.view;
    const LocalPlane& plane = map.outcome.area.plane();
    // A view may be the whole earth: what lies far outside the map needs no dashes.
    const auto near_map = [&map](CanvasPoint point) {
        constexpr double BEYOND = 20.0;
        return CanvasPoint{std::clamp(point.x, -BEYOND, map.width + BEYOND),
                           std::clamp(point.y, -BEYOND, map.height + BEYOND)};
    };
    const CanvasPoint a = near_map(on_map(map, plane.to_grid(view.west, view.north, 0.0)));
    const CanvasPoint c = near_map(on_map(map, plane.to_grid(view.east, view.south, 0.0)));
    const std::vector<CanvasPoint> corners = {a, {c.x, a.y}, c, {a.x, c.y}};
    draw_polygon(canvas, corners, 4.0, PAPER, 0.7);
    for (std::size_t i = 0; i < corners.size(); ++i) {
        constexpr double DASH = 9.0;
        const CanvasPoint from = corners[i];
        const CanvasPoint to = corners[(i + 1) % corners.size()];
        const double length = std::hypot(to.x - from.x, to.y - from.y);
        const auto at = [&](double along) {
            const double part = std::min(1.0, along / length);
            return CanvasPoint{from.x + part * (to.x - from.x), from.y + part * (to.y - from.y)};
        };
        for (double along = 0.0; along < length; along += 2.0 * DASH) {
            canvas.line(at(along), at(along + DASH), 2.0, INK);
        }
    }
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
    // Channels go in a straight line from the whole to 1 / DARKENING.
    return static_cast<float>(1.0 / (1.0 - part + part / static_cast<double>(DARKENING)));
}

Map lay_out_map(const Outcome& outcome, const Relief& relief, int longer_side) {
    const GridFrame& frame = outcome.area.frame();
    const geo_nee south_west = outcome.area.plane().to_grid(frame.west, frame.south, 0.0);
    const geo_nee north_east = outcome.area.plane().to_grid(frame.east(), frame.north(), 0.0);
    const double east = north_east.east - south_west.east;
    const double north = north_east.north - south_west.north;
    const double scale = std::max(east, north) / longer_side;
    Map map = {outcome,
               relief,
               std::max(1, static_cast<int>(std::lround(east / scale))),
               std::max(1, static_cast<int>(std::lround(north / scale))),
               scale,
               0.0,
               0.0};
    visit_pixels(map, [&](int, int, double cell_x, double cell_y, bool counts) {
        const double above = relief.elevation(cell_x, cell_y) - outcome.survey.grade;
        if (counts && !std::isnan(above)) {
            map.largest_cut = std::max(map.largest_cut, above);
            map.largest_fill = std::max(map.largest_fill, -above);
        }
    });
    return map;
}

Canvas draw_map(const Map& map) {
    Canvas canvas(map.width, map.height, PAPER);
    const std::vector<COLORREF> stops = elevation_stops();
    const double range = std::max(map.relief.highest() - map.relief.lowest(), 1e-3);
    const double depth = std::max({map.largest_cut, map.largest_fill, 1e-3});
    visit_pixels(map, [&](int x, int y, double cell_x, double cell_y, bool counts) {
        const double elevation = map.relief.elevation(cell_x, cell_y);
        COLORREF colour = NO_DATA;
        if (!std::isnan(elevation)) {
            const double above = elevation - map.outcome.survey.grade;
            colour = counts ? darkened(above > 0.0 ? CUT : FILL, std::abs(above) / depth)
                            : between_stops(stops, (elevation - map.relief.lowest()) / range);
            colour = lit(colour, map.relief.light(cell_x, cell_y));
        }
        canvas.set(x, y, colour);
    });
    if (!map.outcome.boundary.empty()) {
        draw_boundary(map, canvas);
    }
    if (map.outcome.options.view) {
        draw_view(map, canvas);
    }
    return canvas;
}
