#include "drawing.h"

#include <basalt/graphics.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <stdexcept>
#include <string_view>
#include <system_error>

#include "program.h"

namespace {

constexpr int GLYPH_WIDTH = 5;
constexpr int GLYPH_HEIGHT = 7;
constexpr int ADVANCE = GLYPH_WIDTH + 1;

/// The characters of the font, and for each its rows, top first, from the highest of 35 bits on.
constexpr std::string_view CHARACTERS = " 0123456789ABCDEFGHIJKLMNOPQRSTUVWXYZ.,-+:/%";
constexpr std::uint64_t GLYPHS[] = {
    0x000000000, 0x3A33AE62E, 0x11842108E, 0x3A213221F, 0x3A213062E, 0x08CA97C42, 0x7E1E0862E, 0x1910F462E,
    0x7C2222108, 0x3A317462E, 0x3A317844C, 0x3A31FC631, 0x7A31F463E, 0x3A308422E, 0x7A318C63E, 0x7E10F421F,
    0x7E10F4210, 0x3A30BC62F, 0x4631FC631, 0x38842108E, 0x1C4210A4C, 0x4654C5251, 0x42108421F, 0x4775AC631,
    0x47359C631, 0x3A318C62E, 0x7A31F4210, 0x3A318D64D, 0x7A31F5251, 0x3E107043E, 0x7C8421084, 0x46318C62E,
    0x46318C544, 0x4631AD771, 0x462A22A31, 0x462A21084, 0x7C222221F, 0x00000018C, 0x000003088, 0x0000F8000,
    0x0084F9080, 0x018C03180, 0x042222210, 0x632222263};

std::uint64_t glyph(char character) {
    const bool small = character >= 'a' && character <= 'z';
    const std::size_t at = CHARACTERS.find(small ? static_cast<char>(character - 'a' + 'A') : character);
    return GLYPHS[at == std::string_view::npos ? 0 : at];
}

/// Swaps red and blue: words are 0x00RRGGBB, colours 0x00BBGGRR.
std::uint32_t swapped(std::uint32_t colour) {
    return (colour & 0xFF) << 16 | (colour & 0xFF00) | (colour >> 16 & 0xFF);
}

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

}  // namespace

COLORREF mixed(COLORREF from, COLORREF to, double part) {
    const auto channel = [part](int a, int b) { return static_cast<int>(std::lround(a + (b - a) * part)); };
    return RGB(channel(GetRValue(from), GetRValue(to)), channel(GetGValue(from), GetGValue(to)),
               channel(GetBValue(from), GetBValue(to)));
}

Canvas::Canvas(int width, int height, COLORREF ground)
    : m_width(width), m_height(height), m_words(index(0, height), swapped(ground)) {}

COLORREF Canvas::get(int x, int y) const {
    return has(x, y) ? swapped(m_words[index(x, y)]) : CLR_INVALID;
}

void Canvas::set(int x, int y, COLORREF colour) {
    if (has(x, y)) {
        m_words[index(x, y)] = swapped(colour);
    }
}

void Canvas::line(CanvasPoint from, CanvasPoint to, double thickness, COLORREF colour, double opacity) {
    // A pixel's share falls from 1 to 0 within half a pixel on either side of the line's edge.
    const double reach = thickness / 2 + 0.5;
    const double dx = to.x - from.x;
    const double dy = to.y - from.y;
    const double length2 = dx * dx + dy * dy;
    const auto pixel = [](double place, int size) {
        return static_cast<int>(std::clamp(std::floor(place), -1.0, static_cast<double>(size)));
    };
    const int last_x = pixel(std::max(from.x, to.x) + reach, m_width);
    const int last_y = pixel(std::max(from.y, to.y) + reach, m_height);
    for (int y = pixel(std::min(from.y, to.y) - reach, m_height); y <= last_y; ++y) {
        for (int x = pixel(std::min(from.x, to.x) - reach, m_width); x <= last_x; ++x) {
            const double px = x + 0.5 - from.x;
            const double py = y + 0.5 - from.y;
            const double along = length2 > 0 ? std::clamp((px * dx + py * dy) / length2, 0.0, 1.0) : 0.0;
            const double distance = std::hypot(px - along * dx, py - along * dy);
            set(x, y, mixed(get(x, y), colour, opacity * std::clamp(reach - distance, 0.0, 1.0)));
        }
    }
}

Drawing::Drawing(const Canvas& canvas) {
    m_bitmap.CreateBitmap(canvas.width(), canvas.height(), 1, 32, canvas.words());
    m_dc.CreateCompatibleDC(nullptr);
    m_before = m_dc.SelectObject(&m_bitmap);
    if (m_before == nullptr) {
        throw std::runtime_error("no memory for a picture of " + std::to_string(canvas.width()) + " x " +
                                 std::to_string(canvas.height()) + " pixels");
    }
}

void Drawing::fill(const RECT& rectangle, COLORREF colour) {
    FillRect(m_dc, &rectangle, Brush(colour));
}

void Drawing::outline(const RECT& r, COLORREF colour) {
    for (const RECT& side :
         {RECT{r.left, r.top, r.right, r.top + 1}, RECT{r.left, r.bottom - 1, r.right, r.bottom},
          RECT{r.left, r.top, r.left + 1, r.bottom}, RECT{r.right - 1, r.top, r.right, r.bottom}}) {
        fill(side, colour);
    }
}

void Drawing::text(int x, int y, const std::string& line, COLORREF colour, int scale, Align align) {
    const Brush brush(colour);
    const int width = text_width(line, scale);
    x -= align == Align::RIGHT ? width : align == Align::CENTRE ? width / 2 : 0;
    for (const char character : line) {
        const std::uint64_t bits = glyph(character);
        for (int i = 0; i < GLYPH_WIDTH * GLYPH_HEIGHT; ++i) {
            if ((bits >> (GLYPH_WIDTH * GLYPH_HEIGHT - 1 - i) & 1) != 0) {
                const int left = x + i % GLYPH_WIDTH * scale;
                const int top = y + i / GLYPH_WIDTH * scale;
                const RECT dot = {left, top, left + scale, top + scale};
                FillRect(m_dc, &dot, brush);
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
    // DumpBitmap reports no failure to write the file: check first, and its size afterwards.
    std::FILE* file = std::fopen(path.c_str(), "ab");
    if (file == nullptr) {
        fail_to_write(path);
    }
    std::fclose(file);
    vex_util::mfc::DumpBitmap(m_bitmap, CString(path.c_str()));
    constexpr std::uintmax_t HEADERS = 54;
    BITMAP record = {};
    m_bitmap.GetBitmap(&record);
    const std::int64_t pixels = std::int64_t{record.bmWidthBytes} * record.bmHeight;
    std::error_code error;
    if (std::filesystem::file_size(path, error) != HEADERS + static_cast<std::uintmax_t>(pixels) || error) {
        throw std::runtime_error("cannot write all of " + path);
    }
}
