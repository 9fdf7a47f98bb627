#include "legend.h"

#include <basalt/frame.h>
#include <basalt/graphics.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <string>
#include <vector>

#include "map_colours.h"
#include "number_text.h"

namespace {

constexpr int GAP = 28;  // between map and legend
constexpr int LEGEND_WIDTH = 272;
constexpr int MARGIN = 16;
constexpr int BELOW_MAP = 40;
constexpr int LINE = 22;
constexpr int ROUNDING = 14;  // diameter
constexpr int SMALLEST_HEIGHT = 640;
constexpr COLORREF OUTLINE = RGB(150, 150, 150);

int legend_left(const Map& map) {
    return map_left(map) + map.width + GAP;
}

/// The smallest of 1, 2 and 5 times a power of ten that is not below a value.
double rounded_up(double value) {
    const double power = std::pow(10.0, std::floor(std::log10(value)));
    for (const double factor : {1.0, 2.0, 5.0}) {
        if (power * factor >= value) {
            return power * factor;
        }
    }
    return 10.0 * power;
}

int decimals_for(double step) {
    return std::max(0, static_cast<int>(std::ceil(-std::log10(step) - 1e-9)));
}

/// Round values along a line of pixels that runs from one value to another.
class Ticks {
public:
    /// Labels along the line need their own length, across it their height.
    Ticks(double from, double to, int pixels, bool along) : m_from(from), m_to(to), m_pixels(pixels) {
        constexpr int CLOSEST = 50;
        constexpr int BETWEEN = 20;
        const double per_pixel = std::abs(to - from) / pixels;
        m_step = rounded_up(CLOSEST * per_pixel);
        if (along) {
            m_step = rounded_up((Drawing::text_width(text(from)) + BETWEEN) * per_pixel);
        }
    }
    std::string text(double value) const { return number_text(value, decimals_for(m_step)); }

    /// Calls visit(text, distance from the start in pixels).
    template <typename Visit>
    void visit(Visit visit) const {
        for (double i = std::ceil(std::min(m_from, m_to) / m_step); i * m_step <= std::max(m_from, m_to);
             ++i) {
            visit(text(i * m_step),
                  static_cast<int>(std::lround((i * m_step - m_from) / (m_to - m_from) * m_pixels)));
        }
    }

private:
    double m_from;
    double m_to;
    int m_pixels;
    double m_step;
};

constexpr int TICK = 6;
constexpr int TICK_TO_TEXT = 4;

Ticks latitudes(const Map& map) {
    const GridFrame& frame = map.outcome.area.frame();
    return {frame.north(), frame.south, map.height, false};
}

/// A rounded rectangle one pixel larger than a bar: what is left of it around the bar is its outline.
void draw_bar_outline(Drawing& page, const RECT& bar) {
    _gradientfill(page.dc(), bar.left - 1, bar.top - 1, bar.right + 1, bar.bottom + 1, ROUNDING + 2, PAPER,
                  OUTLINE, 1.0F, GRADIENT_FILL_RECT_H);
}

/// Paints what lies outside the rounding of a rectangle over with the outline's colour.
void round_corners(Drawing& page, const RECT& bar) {
    constexpr COLORREF INSIDE = RGB(128, 128, 128);
    const int width = bar.right - bar.left;
    const int height = bar.bottom - bar.top;
    Drawing mask(Canvas(width, height, OUTLINE));
    HBRUSH const brush = CreateSolidBrush(INSIDE);
    HGDIOBJ const brush_before = SelectObject(mask.dc(), brush);
    SelectObject(mask.dc(), GetStockObject(NULL_PEN));
    RoundRect(mask.dc(), 0, 0, width, height, ROUNDING, ROUNDING);
    SelectObject(mask.dc(), brush_before);
    DeleteObject(brush);
    _transparentblt(page.dc(), bar.left, bar.top, width, height, mask.dc(), 0, 0, width, height, INSIDE);
}

WORD level(BYTE channel) {
    return static_cast<WORD>(channel << 8);
}

TRIVERTEX vertex(int x, int y, COLORREF colour) {
    return {x, y, level(GetRValue(colour)), level(GetGValue(colour)), level(GetBValue(colour)), 0};
}

/// Degrees along the map's frame.
void draw_frame(const Map& map, Drawing& page) {
    const GridFrame& frame = map.outcome.area.frame();
    const int left = map_left(map);
    const RECT outline = {left - 1, MAP_TOP - 1, left + map.width + 1, MAP_TOP + map.height + 1};
    page.outline(outline, INK);
    Ticks(frame.west, frame.east(), map.width, true).visit([&](const std::string& degrees, int at) {
        const int x = left + at;
        page.fill({x, outline.bottom, x + 1, outline.bottom + TICK}, INK);
        page.text(x, outline.bottom + TICK + TICK_TO_TEXT, degrees, INK, 2, Align::CENTRE);
    });
    latitudes(map).visit([&](const std::string& degrees, int at) {
        const int y = MAP_TOP + at;
        page.fill({outline.left - TICK, y, outline.left, y + 1}, INK);
        page.text(outline.left - TICK - TICK_TO_TEXT, y - Drawing::text_height() / 2, degrees, INK, 2,
                  Align::RIGHT);
    });
}

int draw_elevations(const Map& map, Drawing& page, int left, int top) {
    page.text(left, top, "ELEVATION, M", INK);
    constexpr int HEIGHT = 210;
    constexpr int WIDTH = 34;
    const RECT bar = {left, top + LINE, left + WIDTH, top + LINE + HEIGHT};
    draw_bar_outline(page, bar);
    const std::vector<COLORREF> stops = elevation_stops();
    const auto parts = static_cast<int>(stops.size() - 1);
    for (int i = 0; i < parts; ++i) {  // from the highest down
        const auto at = static_cast<std::size_t>(parts - i);
        const TRIVERTEX ends[] = {vertex(bar.left, bar.top + HEIGHT * i / parts, stops[at]),
                                  vertex(bar.right, bar.top + HEIGHT * (i + 1) / parts, stops[at - 1])};
        constexpr GRADIENT_RECT JOINED = {0, 1};
        GradientFill(page.dc(), ends, 2, &JOINED, 1, GRADIENT_FILL_RECT_V);
    }
    round_corners(page, bar);
    if (map.relief.highest() > map.relief.lowest()) {
        const Ticks ticks(map.relief.highest(), map.relief.lowest(), HEIGHT, false);
        ticks.visit([&](const std::string& metres, int at) {
            const int y = bar.top + at;
            page.fill({bar.right + 2, y, bar.right + 8, y + 1}, INK);
            page.text(bar.right + 14, std::clamp<int>(y - 7, bar.top, bar.bottom - 14), metres, INK);
        });
    }
    return bar.bottom + LINE;
}

/// A bar from 0 to the largest depth, as long as that is of the larger of the two.
int draw_depths(Drawing& page, int left, int top, const std::string& name, COLORREF hue, double largest,
                double scale_end) {
    constexpr int HEIGHT = 24;
    const double part = largest / scale_end;
    const int width = std::max(ROUNDING, static_cast<int>(LEGEND_WIDTH * part));
    page.text(left, top, name, INK);
    page.text(left + LEGEND_WIDTH, top, "0 - " + number_text(largest, largest < 10.0 ? 2 : 0) + " M", INK, 2,
              Align::RIGHT);
    top += LINE;
    const RECT bar = {left, top, left + width, top + HEIGHT};
    draw_bar_outline(page, bar);
    _gradientfill(page.dc(), bar.left, bar.top, bar.right, bar.bottom, ROUNDING, OUTLINE, hue,
                  darkening_at(part), GRADIENT_FILL_RECT_H);
    return top + HEIGHT + 12;
}

int draw_earthwork(const Map& map, Drawing& page, int left, int top) {
    const Survey& survey = map.outcome.survey;
    const double scale_end = std::max(map.largest_cut, map.largest_fill);
    page.text(left, top, "GRADE", INK);
    page.text(left + LEGEND_WIDTH, top, number_text(survey.grade, 2) + " M", INK, 2, Align::RIGHT);
    top += LINE + 8;
    if (map.largest_cut > 0.0) {
        top = draw_depths(page, left, top, "CUT", CUT, map.largest_cut, scale_end);
    }
    if (map.largest_fill > 0.0) {
        top = draw_depths(page, left, top, "FILL", FILL, map.largest_fill, scale_end);
    }
    const auto figure = [&](const std::string& name, double value, double metres, const char* power) {
        constexpr double MOST = 1e11;  // widest number that fits
        const bool in_km = value >= MOST;
        page.text(left, top, name + (in_km ? " KM" : " M") + power, INK);
        page.text(left + LEGEND_WIDTH, top, number_text(in_km ? value / metres : value, in_km ? 3 : 0), INK,
                  2, Align::RIGHT);
        top += LINE;
    };
    top += 4;
    figure("CUT", survey.cut, 1e9, "3");
    figure("FILL", survey.fill, 1e9, "3");
    figure("AREA", survey.area, 1e6, "2");
    return top + 12;
}

int draw_lines(const Map& map, Drawing& page, int left, int top) {
    constexpr int LENGTH = 54;
    const auto name = [&](const char* text) {
        page.text(left + LENGTH + 14, top - 6, text, INK);
        top += LINE;
    };
    top += 8;
    if (!map.outcome.boundary.empty()) {
        page.fill({left, top, left + LENGTH, top + 2}, INK);
        name("BOUNDARY");
    }
    if (map.outcome.options.view) {
        for (int x = 0; x < LENGTH; x += 18) {
            page.fill({left + x, top, left + x + 9, top + 2}, INK);
        }
        name("VIEW");
    }
    return top + 12;
}

/// Four lengths, black and white by turns, and an arrow to the north.
void draw_scale(const Map& map, Drawing& page, int left, int top) {
    constexpr int ARROW = 40;
    constexpr double SHORTEST = 80.0;  // and at most two and a half times as long
    const double metres = rounded_up(SHORTEST * map.metres_per_pixel);
    const int length = static_cast<int>(std::lround(metres / map.metres_per_pixel));
    constexpr int HEIGHT = 8;
    for (int i = 0; i < 4; ++i) {
        page.fill({left + length * i / 4, top, left + length * (i + 1) / 4, top + HEIGHT},
                  i % 2 == 0 ? INK : PAPER);
    }
    page.outline({left, top, left + length, top + HEIGHT}, INK);
    const bool in_km = metres >= 1000.0;
    const double shown = in_km ? metres / 1000.0 : metres;
    page.text(left, top + HEIGHT + 8, "0", INK);
    page.text(left + length, top + HEIGHT + 8,
              number_text(shown, decimals_for(shown)) + (in_km ? " KM" : " M"), INK, 2, Align::CENTRE);
    const int middle = left + LEGEND_WIDTH - ARROW / 2;
    const int foot = top + HEIGHT;
    for (int row = 0; row < ARROW; ++row) {
        page.fill({middle - row / 4, foot - ARROW + row, middle + row / 4 + 1, foot - ARROW + row + 1}, INK);
    }
    page.text(middle + 1, foot + 8, "N", INK, 2, Align::CENTRE);
}

}  // namespace

int map_left(const Map& map) {
    const GridFrame& frame = map.outcome.area.frame();
    const Ticks ticks = latitudes(map);
    // One end of the range has the longest text.
    const int longest = std::max(Drawing::text_width(ticks.text(frame.south)),
                                 Drawing::text_width(ticks.text(frame.north())));
    return MARGIN + longest + TICK_TO_TEXT + TICK;
}

Canvas page_for(const Map& map) {
    return {legend_left(map) + LEGEND_WIDTH + MARGIN,
            std::max(MAP_TOP + map.height + BELOW_MAP, SMALLEST_HEIGHT), PAPER};
}

void draw_legend(const Map& map, Drawing& page) {
    _operatingsystem();  // gradients are drawn once the system is known
    draw_frame(map, page);
    const int left = legend_left(map);
    int top = MAP_TOP;
    if (map.outcome.survey.inside < map.outcome.area.cells()) {  // else no cell shows its elevation
        top = draw_elevations(map, page, left, top);
    }
    top = draw_earthwork(map, page, left, top);
    draw_lines(map, page, left, top);
    const int bottom = std::max(MAP_TOP + map.height, SMALLEST_HEIGHT - BELOW_MAP);
    draw_scale(map, page, left, bottom - 30);
}
