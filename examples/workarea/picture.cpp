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

constexpr int MARGIN = 16;
constexpr int GAP = 28;  // between map and legend
constexpr int LEGEND_WIDTH = 272;
constexpr int BELOW_MAP = 40;
constexpr int SMALLEST_HEIGHT = 540;
constexpr int LINE = 22;
constexpr int TICK = 6;
constexpr int TICK_TO_TEXT = 4;
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

/// With the decimals that multiples of a step need.
std::string multiple_text(double value, double step) {
    return number_text(value, std::max(0, static_cast<int>(std::ceil(-std::log10(step) - 1e-9))));
}

/// Round values along a line of pixels that runs from one value to another.
struct Scale {
    double from;
    double to;
    int pixels;
    int closest;  ///< pixels between two values

    double step() const { return rounded_up(closest * std::abs(to - from) / pixels); }

    /// Calls visit(text, distance from the start in pixels).
    template <typename Visit>
    void visit(Visit visit) const {
        for (double i = std::ceil(std::min(from, to) / step()); i * step() <= std::max(from, to); ++i) {
            visit(multiple_text(i * step(), step()),
                  static_cast<int>(std::lround((i * step() - from) / (to - from) * pixels)));
        }
    }
};

Scale latitudes(const Map& map) {
    const GridFrame& frame = map.outcome.area.frame();
    return {frame.north(), frame.south, map.height, 50};
}

/// Where the map begins on the page, pixels: behind the longest latitude.
int map_left(const Map& map) {
    int longest = 0;
    latitudes(map).visit(
        [&](const std::string& degrees, int) { longest = std::max(longest, Drawing::text_width(degrees)); });
    return MARGIN + longest + TICK_TO_TEXT + TICK;
}

/// Degrees along the map's frame.
void draw_frame(const Map& map, Drawing& page) {
    const GridFrame& frame = map.outcome.area.frame();
    const int left = map_left(map);
    const RECT outline = {left - 1, MARGIN - 1, left + map.width + 1, MARGIN + map.height + 1};
    page.outline(outline, INK);
    const Scale longitudes = {frame.west, frame.east(), map.width, 120};
    longitudes.visit([&](const std::string& degrees, int at) {
        const int x = left + at;
        page.fill({x, outline.bottom, x + 1, outline.bottom + TICK}, INK);
        page.text(x, outline.bottom + TICK + TICK_TO_TEXT, degrees, INK, 2, Align::CENTRE);
    });
    latitudes(map).visit([&](const std::string& degrees, int at) {
        const int y = MARGIN + at;
        page.fill({outline.left - TICK, y, outline.left, y + 1}, INK);
        page.text(outline.left - TICK - TICK_TO_TEXT, y - Drawing::text_height() / 2, degrees, INK, 2,
                  Align::RIGHT);
    });
}

TRIVERTEX vertex(int x, int y, COLORREF colour) {
    const auto level = [](BYTE channel) { return static_cast<WORD>(channel << 8); };
    return {x, y, level(GetRValue(colour)), level(GetGValue(colour)), level(GetBValue(colour)), 0};
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
        line("GRADE", number_text(m_map.outcome.survey.grade, 2) + " M");
        draw_depths("CUT", CUT, m_map.largest_cut);
        draw_depths("FILL", FILL, m_map.largest_fill);
        m_top += LINE;
        if (!m_map.outcome.boundary.empty()) {
            draw_line("BOUNDARY", 54);
        }
        if (m_map.outcome.options.view) {
            draw_line("VIEW", 9);
        }
        draw_distance(std::max(MARGIN + m_map.height, SMALLEST_HEIGHT - BELOW_MAP) - 30);
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
        const RECT bar = {m_left, m_top, m_left + 34, m_top + HEIGHT};
        const std::vector<COLORREF> stops = elevation_stops();
        const auto parts = static_cast<int>(stops.size() - 1);
        for (int i = 0; i < parts; ++i) {  // from the highest down
            const auto at = static_cast<std::size_t>(parts - i);
            const TRIVERTEX ends[] = {vertex(bar.left, bar.top + HEIGHT * i / parts, stops[at]),
                                      vertex(bar.right, bar.top + HEIGHT * (i + 1) / parts, stops[at - 1])};
            constexpr GRADIENT_RECT JOINED = {0, 1};
            GradientFill(m_page.dc(), ends, 2, &JOINED, 1, GRADIENT_FILL_RECT_V);
        }
        m_page.outline(bar, OUTLINE);
        if (m_map.relief.highest() > m_map.relief.lowest()) {
            const Scale elevations = {m_map.relief.highest(), m_map.relief.lowest(), HEIGHT, 50};
            elevations.visit([&](const std::string& metres, int at) {
                const int y = bar.top + at;
                m_page.fill({bar.right + 2, y, bar.right + 2 + TICK, y + 1}, INK);
                m_page.text(bar.right + 14, std::clamp<int>(y - 7, bar.top, bar.bottom - 14), metres, INK);
            });
        }
        m_top = bar.bottom + LINE;
    }

    /// A bar from 0 to the largest depth, as long as that is of the larger of the two.
    void draw_depths(const std::string& name, COLORREF hue, double largest) {
        constexpr int HEIGHT = 24;
        constexpr int ROUNDING = 14;  // diameter
        if (largest <= 0.0) {
            return;
        }
        const double part = largest / std::max(m_map.largest_cut, m_map.largest_fill);
        line(name, "0 - " + number_text(largest, largest < 10.0 ? 2 : 0) + " M");
        const int right = m_left + std::max(ROUNDING, static_cast<int>(LEGEND_WIDTH * part));
        _gradientfill(m_page.dc(), m_left, m_top, right, m_top + HEIGHT, ROUNDING, PAPER, hue,
                      darkening_at(part), GRADIENT_FILL_RECT_H);
        m_top += HEIGHT + 12;
    }

    void draw_line(const char* name, int dash) {
        constexpr int LENGTH = 54;
        for (int x = 0; x < LENGTH; x += 2 * dash) {
            m_page.fill({m_left + x, m_top + 6, m_left + x + dash, m_top + 8}, INK);
        }
        m_page.text(m_left + LENGTH + 14, m_top, name, INK);
        m_top += LINE;
    }

    /// A bar of a round length, with that length.
    void draw_distance(int top) {
        constexpr double SHORTEST = 80.0;  // and at most two and a half times as long
        const double metres = rounded_up(SHORTEST * m_map.metres_per_pixel);
        const int right = m_left + static_cast<int>(std::lround(metres / m_map.metres_per_pixel));
        m_page.fill({m_left, top, right, top + 4}, INK);
        const bool in_km = metres >= 1000.0;
        const double shown = in_km ? metres / 1000.0 : metres;
        m_page.text(m_left, top + 12, multiple_text(shown, shown) + (in_km ? " KM" : " M"), INK);
    }

    const Map& m_map;
    Drawing& m_page;
    int m_left;
    int m_top = MARGIN;
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
                       std::max(MARGIN + map.height + BELOW_MAP, SMALLEST_HEIGHT), PAPER);
    Drawing page(paper);
    BitBlt(page.dc(), map_left(map), MARGIN, map.width, map.height, picture.dc(), 0, 0, SRCCOPY);
    _operatingsystem();  // gradients are drawn once the system is known
    draw_frame(map, page);
    Legend(map, page).draw();
    page.save(file);
    return {paper.width(), paper.height(), map.metres_per_pixel};
}
