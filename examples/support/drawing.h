// A picture in memory, made pixel by pixel, and the same as a bitmap that the library draws on and writes.
#ifndef EXAMPLES_DRAWING_H
#define EXAMPLES_DRAWING_H

#include <basalt/platform.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

/// The colour `part` of the way from one to another, 0 to 1.
COLORREF mixed(COLORREF from, COLORREF to, double part);

/// A point in pixels; (0, 0) is the upper left corner of the upper left pixel.
struct CanvasPoint {
    double x;
    double y;
};

/// An array of pixels. Outside it set() does nothing, and get() returns CLR_INVALID.
class Canvas {
public:
    Canvas(int width, int height, COLORREF ground);

    int width() const { return m_width; }
    int height() const { return m_height; }
    /// The rows, top first: words 0x00RRGGBB.
    const std::uint32_t* words() const { return m_words.data(); }

    COLORREF get(int x, int y) const;
    void set(int x, int y, COLORREF colour);
    /// A straight line with round ends and smooth edges. opacity: 0 to 1.
    void line(CanvasPoint from, CanvasPoint to, double thickness, COLORREF colour, double opacity = 1.0);

private:
    bool has(int x, int y) const { return x >= 0 && x < m_width && y >= 0 && y < m_height; }
    std::size_t index(int x, int y) const { return static_cast<std::size_t>(std::int64_t{y} * m_width + x); }

    int m_width;
    int m_height;
    std::vector<std::uint32_t> m_words;
};

enum class Align { LEFT, CENTRE, RIGHT };

/// A canvas as a bitmap in a device context. std::runtime_error when the bitmap cannot be allocated.
class Drawing {
public:
    explicit Drawing(const Canvas& canvas);
    ~Drawing() { m_dc.SelectObject(m_before); }
    Drawing(const Drawing&) = delete;
    Drawing& operator=(const Drawing&) = delete;

    HDC dc() const { return m_dc; }
    void fill(const RECT& rectangle, COLORREF colour);
    /// Lines of one pixel just inside the rectangle.
    void outline(const RECT& rectangle, COLORREF colour);
    /// One line of digits, capital letters and the signs that figures need, each pixel of the font `scale`
    /// wide and high; `x` is where it begins, has its middle or ends, `y` its top. Small letters are drawn as
    /// capitals, characters that the font lacks as blanks.
    void text(int x, int y, const std::string& line, COLORREF colour, int scale = 2,
              Align align = Align::LEFT);
    static int text_width(const std::string& line, int scale = 2);
    static int text_height(int scale = 2);

    /// Writes a BMP file; the drawing cannot be used afterwards. std::runtime_error, naming the file and, if
    /// known, the system's reason, when that fails.
    void save(const std::string& path);

private:
    CBitmap m_bitmap;
    CDC m_dc;
    CBitmap* m_before;
};

#endif
