#include "drawing.h"

#include <basalt/graphics.h>

#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <stdexcept>
#include <system_error>

#include "pixel_font.h"

namespace {

constexpr int ADVANCE = GLYPH_WIDTH + 1;

class Brush {
public:
    explicit Brush(COLORREF colour) : m_brush(CreateSolidBrush(colour)) {}
    ~Brush() { DeleteObject(m_brush); }
    Brush(const Brush&) = delete;
    Brush& operator=(const Brush&) = delete;
    operator HBRUSH() const { return m_brush; }

private:
    HBRUSH m_brush;
};

/// DumpBitmap reports no failure to write the file: check first.
void expect_writable(const std::string& path) {
    std::FILE* file = std::fopen(path.c_str(), "ab");
    if (file == nullptr) {
        throw std::runtime_error("cannot write to " + path + ": " + std::generic_category().message(errno));
    }
    std::fclose(file);
}

}  // namespace

Drawing::Drawing(const Canvas& canvas) {
    m_bitmap.CreateBitmap(canvas.width(), canvas.height(), 1, 32, canvas.words());
    m_dc.CreateCompatibleDC(nullptr);
    m_before = m_dc.SelectObject(&m_bitmap);
    if (m_before == nullptr) {
        throw std::runtime_error("no memory for a picture of " + std::to_string(canvas.width()) + " x " +
                                 std::to_string(canvas.height()) + " pixels");
    }
}

Drawing::~Drawing() {
    m_dc.SelectObject(m_before);
}

void Drawing::fill(const RECT& rectangle, COLORREF colour) {
    FillRect(m_dc, &rectangle, Brush(colour));
}

void Drawing::outline(const RECT& r, COLORREF colour) {
    fill({r.left, r.top, r.right, r.top + 1}, colour);
    fill({r.left, r.bottom - 1, r.right, r.bottom}, colour);
    fill({r.left, r.top, r.left + 1, r.bottom}, colour);
    fill({r.right - 1, r.top, r.right, r.bottom}, colour);
}

void Drawing::text(int x, int y, const std::string& line, COLORREF colour, int scale, Align align) {
    const Brush brush(colour);
    x -= align == Align::RIGHT    ? text_width(line, scale)
         : align == Align::CENTRE ? text_width(line, scale) / 2
                                  : 0;
    for (const char character : line) {
        const Glyph& rows = glyph(character);
        for (int row = 0; row < GLYPH_HEIGHT; ++row) {
            for (int column = 0; column < GLYPH_WIDTH; ++column) {
                if ((rows[static_cast<std::size_t>(row)] >> (GLYPH_WIDTH - 1 - column) & 1) != 0) {
                    const RECT dot = {x + column * scale, y + row * scale, x + (column + 1) * scale,
                                      y + (row + 1) * scale};
                    FillRect(m_dc, &dot, brush);
                }
            }
        }
        x += ADVANCE * scale;
    }
}

int Drawing::text_width(const std::string& line, int scale) {
    return line.empty() ? 0 : (static_cast<int>(line.size()) * ADVANCE - 1) * scale;
}

int Drawing::text_height(int scale) {
    return GLYPH_HEIGHT * scale;
}

void Drawing::save(const std::string& path) {
    m_dc.SelectObject(m_before);  // the codec takes a bitmap that no context holds
    expect_writable(path);
    vex_util::mfc::DumpBitmap(m_bitmap, CString(path.c_str()));
    constexpr std::uintmax_t HEADERS = 54;
    BITMAP record = {};
    m_bitmap.GetBitmap(&record);
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(path, error);
    if (error || size != HEADERS + static_cast<std::uintmax_t>(record.bmWidthBytes) *
                                       static_cast<std::uintmax_t>(record.bmHeight)) {
        throw std::runtime_error("cannot write all of " + path);
    }
}
