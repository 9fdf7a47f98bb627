// A canvas as a bitmap in a device context: what the library draws on, and writes to a file.
#ifndef EXAMPLES_DRAWING_H
#define EXAMPLES_DRAWING_H

#include <basalt/platform.h>

#include <string>

#include "canvas.h"

enum class Align { LEFT, CENTRE, RIGHT };

/// std::runtime_error when the bitmap cannot be allocated.
class Drawing {
public:
    explicit Drawing(const Canvas& canvas);
    ~Drawing();
    Drawing(const Drawing&) = delete;
    Drawing& operator=(const Drawing&) = delete;

    HDC dc() const { return m_dc; }
    void fill(const RECT& rectangle, COLORREF colour);
    /// Lines of one pixel just inside the rectangle.
    void outline(const RECT& rectangle, COLORREF colour);
    /// One line of text, each pixel of the font `scale` wide and high; `x` is where it begins, has its middle
    /// or ends, `y` its top.
    void text(int x, int y, const std::string& line, COLORREF colour, int scale = 2,
              Align align = Align::LEFT);
    static int text_width(const std::string& line, int scale = 2);
    static int text_height(int scale = 2);

    /// Writes a BMP file; nothing can be drawn any more. std::runtime_error, naming the file and, where it is
    /// known, the system's reason, when that fails.
    void save(const std::string& path);

private:
    CBitmap m_bitmap;
    CDC m_dc;
    CBitmap* m_before;
};

#endif
