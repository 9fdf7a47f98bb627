// A picture in memory, made pixel by pixel.
#ifndef EXAMPLES_CANVAS_H
#define EXAMPLES_CANVAS_H

#include <basalt/platform.h>

#include <cstddef>
#include <cstdint>
#include <vector>

/// The colour `part` of the way from one to another, 0 to 1.
COLORREF mixed(COLORREF from, COLORREF to, double part);

/// A point in pixels; (0, 0) is the upper left corner of the upper left pixel.
struct CanvasPoint {
    double x;
    double y;
};

/// Pixels outside are left out.
class Canvas {
public:
    Canvas(int width, int height, COLORREF ground);

    int width() const { return m_width; }
    int height() const { return m_height; }
    /// The rows, top first: words 0x00RRGGBB.
    const std::uint32_t* words() const { return m_words.data(); }

    COLORREF get(int x, int y) const;
    void set(int x, int y, COLORREF colour);
    /// Lays a colour over the pixel, so opaque (0 to 1).
    void lay(int x, int y, COLORREF colour, double opacity);
    /// A straight line with round ends and smooth edges.
    void line(CanvasPoint from, CanvasPoint to, double thickness, COLORREF colour, double opacity = 1.0);

private:
    bool has(int x, int y) const { return x >= 0 && x < m_width && y >= 0 && y < m_height; }
    std::size_t index(int x, int y) const {
        return static_cast<std::size_t>(y) * static_cast<std::size_t>(m_width) + static_cast<std::size_t>(x);
    }

    int m_width;
    int m_height;
    std::vector<std::uint32_t> m_words;
};

#endif
