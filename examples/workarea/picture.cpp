#include "picture.h"

#include <basalt/frame.h>
#include <basalt/graphics.h>

#include <algorithm>
#include <cmath>
#include <string>
#include <vector>

#include "drawing.h"
#include "map.h"
#include "text.h"

namespace {

constexpr int MAP_TOP = 16;
constexpr int GAP = 28;  // between map and legend
constexpr int LEGEND_WIDTH = 272;
constexpr int MARGIN = 16;
constexpr int BELOW_MAP = 40;
constexpr int LINE = 22;
constexpr int ROUNDING = 14;  // diameter
constexpr int SMALLEST_HEIGHT = 640;
constexpr COLORREF OUTLINE = RGB(150, 150, 150);

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

/// Where the map lies on the page, pixels.
int map_left(const Map& map) {
    const GridFrame& frame = map.outcome.area.frame();
    const Ticks ticks = latitudes(map);
    // One end of the range has the longest text.
    const int longest = std::max(Drawing::text_width(ticks.text(frame.south)),
                                 Drawing::text_width(ticks.text(frame.north())));
    return MARGIN + longest + TICK_TO_TEXT + TICK;
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

TRIVERTEX vertex(int x, int y, COLORREF colour) {
    const auto level = [](BYTE channel) { return static_cast<WORD>(channel << 8); };
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

/// What colours and lines mean, from the top of the page down.
class Legend {
public:
    Legend(const Map& map, Drawing& page)
        : m_map(map), m_page(page), m_left(map_left(map) + map.width + GAP) {}

    void draw() {
        if (m_map.outcome.survey.inside < m_map.outcome.area.cells()) {  // else no cell shows its elevation
            draw_elevations();
        }
        draw_earthwork();
        draw_lines();
        draw_scale(std::max(MAP_TOP + m_map.height, SMALLEST_HEIGHT - BELOW_MAP) - 30);
    }

private:
    /// A name on the left, and a figure that ends on the right.
    void line(const std::string& name, const std::string& figure) {
        m_page.text(m_left, m_top, name, INK);
        m_page.text(m_left + LEGEND_WIDTH, m_top, figure, INK, 2, Align::RIGHT);
        m_top += LINE;
    }

    void draw_elevations() {
        line("ELEVATION, M", "");
        constexpr int HEIGHT = 210;
        constexpr int WIDTH = 34;
        const RECT bar = {m_left, m_top, m_left + WIDTH, m_top + HEIGHT};
        draw_bar_outline(m_page, bar);
        const std::vector<COLORREF> stops = elevation_stops();
        const auto parts = static_cast<int>(stops.size() - 1);
        for (int i = 0; i < parts; ++i) {  // from the highest down
            const auto at = static_cast<std::size_t>(parts - i);
            const TRIVERTEX ends[] = {vertex(bar.left, bar.top + HEIGHT * i / parts, stops[at]),
                                      vertex(bar.right, bar.top + HEIGHT * (i + 1) / parts, stops[at - 1])};
            constexpr GRADIENT_RECT JOINED = {0, 1};
            GradientFill(m_page.dc(), ends, 2, &JOINED, 1, GRADIENT_FILL_RECT_V);
        }
        round_corners(m_page, bar);
        if (m_map.relief.highest() > m_map.relief.lowest()) {
            const Ticks ticks(m_map.relief.highest(), m_map.relief.lowest(), HEIGHT, false);
            ticks.visit([&](const std::string& metres, int at) {
                const int y = bar.top + at;
                m_page.fill({bar.right + 2, y, bar.right + 8, y + 1}, INK);
                m_page.text(bar.right + 14, std::clamp<int>(y - 7, bar.top, bar.bottom - 14), metres, INK);
            });
        }
        m_top = bar.bottom + LINE;
    }

    /// A bar from 0 to the largest depth, as long as that is of the larger of the two.
    void draw_depths(const std::string& name, COLORREF hue, double largest) {
        constexpr int HEIGHT = 24;
        if (largest <= 0.0) {
            return;
        }
        const double part = largest / std::max(m_map.largest_cut, m_map.largest_fill);
        line(name, "0 - " + number_text(largest, largest < 10.0 ? 2 : 0) + " M");
        const int width = std::max(ROUNDING, static_cast<int>(LEGEND_WIDTH * part));
        const RECT bar = {m_left, m_top, m_left + width, m_top + HEIGHT};
        draw_bar_outline(m_page, bar);
        _gradientfill(m_page.dc(), bar.left, bar.top, bar.right, bar.bottom, ROUNDING, OUTLINE, hue,
                      darkening_at(part), GRADIENT_FILL_RECT_H);
        m_top = bar.bottom + 12;
    }

    void draw_earthwork() {
        const Survey& survey = m_map.outcome.survey;
        line("GRADE", number_text(survey.grade, 2) + " M");
        m_top += 8;
        draw_depths("CUT", CUT, m_map.largest_cut);
        draw_depths("FILL", FILL, m_map.largest_fill);
        const auto figure = [&](const std::string& name, double value, double metres, const char* power) {
            constexpr double MOST = 1e11;  // widest number that fits
            const bool in_km = value >= MOST;
            line(name + (in_km ? " KM" : " M") + power,
                 number_text(in_km ? value / metres : value, in_km ? 3 : 0));
        };
        m_top += 4;
        figure("CUT", survey.cut, 1e9, "3");
        figure("FILL", survey.fill, 1e9, "3");
        figure("AREA", survey.area, 1e6, "2");
        m_top += 12;
    }

    void draw_lines() {
        constexpr int LENGTH = 54;
        m_top += 8;
        const auto stroke = [&](const char* name, int dash) {
            for (int x = 0; x < LENGTH; x += 2 * dash) {
                m_page.fill({m_left + x, m_top, m_left + x + dash, m_top + 2}, INK);
            }
            m_page.text(m_left + LENGTH + 14, m_top - 6, name, INK);
            m_top += LINE;
        };
        if (!m_map.outcome.boundary.empty()) {
            stroke("BOUNDARY", LENGTH);
        }
        if (m_map.outcome.options.view) {
            stroke("VIEW", 9);
        }
    }

    /// Four lengths, black and white by turns, and an arrow to the north.
    void draw_scale(int top) {
        constexpr int ARROW = 40;
        constexpr double SHORTEST = 80.0;  // and at most two and a half times as long
        const double metres = rounded_up(SHORTEST * m_map.metres_per_pixel);
        const int length = static_cast<int>(std::lround(metres / m_map.metres_per_pixel));
        const int foot = top + 8;
        for (int i = 0; i < 4; ++i) {
            m_page.fill({m_left + length * i / 4, top, m_left + length * (i + 1) / 4, foot},
                        i % 2 == 0 ? INK : PAPER);
        }
        m_page.outline({m_left, top, m_left + length, foot}, INK);
        const bool in_km = metres >= 1000.0;
        const double shown = in_km ? metres / 1000.0 : metres;
        m_page.text(m_left, foot + 8, "0", INK);
        m_page.text(m_left + length, foot + 8,
                    number_text(shown, decimals_for(shown)) + (in_km ? " KM" : " M"), INK, 2, Align::CENTRE);
        const int middle = m_left + LEGEND_WIDTH - ARROW / 2;
        for (int row = 0; row < ARROW; ++row) {
            const int y = foot - ARROW + row;
            m_page.fill({middle - row / 4, y, middle + row / 4 + 1, y + 1}, INK);
        }
        m_page.text(middle + 1, foot + 8, "N", INK, 2, Align::CENTRE);
    }

    const Map& m_map;
    Drawing& m_page;
    int m_left;
    int m_top = MAP_TOP;
};

}  // namespace

PictureSize write_picture(const Outcome& outcome, WorkArea& area) {
    constexpr int LONGER_SIDE = 680;
    const Relief relief(area);
    const Map map = lay_out_map(outcome, relief, LONGER_SIDE);
    Drawing picture(draw_map(map));
    const std::string& file = *outcome.options.picture;
    if (!outcome.options.legend) {
        picture.save(file);
        return {map.width, map.height, map.metres_per_pixel};
    }
    const Canvas paper(map_left(map) + map.width + GAP + LEGEND_WIDTH + MARGIN,
                       std::max(MAP_TOP + map.height + BELOW_MAP, SMALLEST_HEIGHT), PAPER);
    Drawing page(paper);
    BitBlt(page.dc(), map_left(map), MAP_TOP, map.width, map.height, picture.dc(), 0, 0, SRCCOPY);
    _operatingsystem();  // gradients are drawn once the system is known
    draw_frame(map, page);
    Legend(map, page).draw();
    page.save(file);
    return {paper.width(), paper.height(), map.metres_per_pixel};
}
