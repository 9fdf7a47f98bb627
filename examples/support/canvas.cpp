#include "canvas.h"

#include <algorithm>
#include <cmath>

namespace {

/// Words hold red high, colours blue: the same exchange both ways.
std::uint32_t exchanged(std::uint32_t colour) {
    return (colour & 0xFF) << 16 | (colour & 0xFF00) | (colour >> 16 & 0xFF);
}

int channel(int from, int to, double part) {
    return static_cast<int>(std::lround(from + (to - from) * part));
}

}  // namespace

COLORREF mixed(COLORREF from, COLORREF to, double part) {
    return RGB(channel(GetRValue(from), GetRValue(to), part), channel(GetGValue(from), GetGValue(to), part),
               channel(GetBValue(from), GetBValue(to), part));
}

Canvas::Canvas(int width, int height, COLORREF ground)
    : m_width(width),
      m_height(height),
      m_words(static_cast<std::size_t>(width) * static_cast<std::size_t>(height), exchanged(ground)) {}

COLORREF Canvas::get(int x, int y) const {
    return has(x, y) ? exchanged(m_words[index(x, y)]) : CLR_INVALID;
}

void Canvas::set(int x, int y, COLORREF colour) {
    if (has(x, y)) {
        m_words[index(x, y)] = exchanged(colour);
    }
}

void Canvas::lay(int x, int y, COLORREF colour, double opacity) {
    if (has(x, y)) {
        set(x, y, mixed(get(x, y), colour, opacity));
    }
}

void Canvas::line(CanvasPoint from, CanvasPoint to, double thickness, COLORREF colour, double opacity) {
    // A pixel's share falls from 1 to 0 within half a pixel on either side of the line's edge.
    const double reach = thickness / 2 + 0.5;
    const double dx = to.x - from.x;
    const double dy = to.y - from.y;
    const double length2 = dx * dx + dy * dy;
    const auto first = [reach](double a, double b, int size) {
        return static_cast<int>(
            std::clamp(std::floor(std::min(a, b) - reach), 0.0, static_cast<double>(size)));
    };
    const auto last = [reach](double a, double b, int size) {
        return static_cast<int>(std::clamp(std::floor(std::max(a, b) + reach), -1.0, size - 1.0));
    };
    for (int y = first(from.y, to.y, m_height); y <= last(from.y, to.y, m_height); ++y) {
        for (int x = first(from.x, to.x, m_width); x <= last(from.x, to.x, m_width); ++x) {
            const double px = x + 0.5 - from.x;
            const double py = y + 0.5 - from.y;
            const double along = length2 > 0 ? std::clamp((px * dx + py * dy) / length2, 0.0, 1.0) : 0.0;
            const double distance = std::hypot(px - along * dx, py - along * dy);
            lay(x, y, colour, opacity * std::clamp(reach - distance, 0.0, 1.0));
        }
    }
}
