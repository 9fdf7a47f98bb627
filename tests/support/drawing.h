// The picture model: what each drawing call makes of a picture, pixel by pixel and without the library's
// help, and surfaces of the library to compare with. Shared by tests and fuzz targets.
#ifndef BASALT_TESTS_SUPPORT_DRAWING_H
#define BASALT_TESTS_SUPPORT_DRAWING_H

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <numbers>
#include <vector>

#include "basalt/platform.h"

namespace drawing {

inline constexpr int DEPTHS[] = {1, 4, 8, 16, 24, 32};
using Bytes = std::vector<unsigned char>;

constexpr std::uint32_t all_ones(int depth) {
    return depth == 32 ? 0xFFFFFFFFU : (1U << depth) - 1U;
}
// Whether each call returned zero or a null pointer.
template <class... Results>
bool refused(Results... results) {
    return (... && (results == Results{}));
}
// Without the bits that mean nothing.
constexpr std::uint32_t colour_bits(int depth, std::uint32_t value) {
    return value & (depth == 16 ? 0x7FFF : all_ones(depth) & 0xFFFFFF);
}

// Values as a bitmap stores them, row by row.
struct Picture {
    int width, height, depth;
    std::vector<std::uint32_t> pixels;

    Picture(int w, int h, int its_depth, std::uint32_t value = 0)
        : width(w), height(h), depth(its_depth), pixels(std::size_t(w) * std::size_t(h), value) {}
    bool has(std::int64_t x, std::int64_t y) const { return x >= 0 && y >= 0 && x < width && y < height; }
    std::uint32_t& at(std::int64_t x, std::int64_t y) { return pixels[std::size_t(y * width + x)]; }
    std::uint32_t at(std::int64_t x, std::int64_t y) const { return pixels[std::size_t(y * width + x)]; }
    friend bool operator==(const Picture&, const Picture&) = default;
};

template <class Next>
Picture random_picture(int width, int height, int depth, Next& next) {
    Picture picture(width, height, depth);
    std::generate(picture.pixels.begin(), picture.pixels.end(),
                  [&] { return static_cast<std::uint32_t>(next()) & all_ones(depth); });
    return picture;
}

inline int row_bytes(int width, int depth, int align) {
    return (width * depth + align - 1) / align * align / 8;
}

// Calls visit(pixel, bit, byte, shift) for each bit in rows padded to `align` bits: pixels follow each other
// from a byte's highest bit on when smaller than one, and have their lowest byte first when larger.
template <class Visit>
void for_each_bit(const Picture& p, int align, const Visit& visit) {
    const int row_bits = row_bytes(p.width, p.depth, align) * 8;
    for (int pixel = 0; pixel < p.width * p.height; ++pixel) {
        const int start = pixel / p.width * row_bits + pixel % p.width * p.depth;
        for (int bit = 0; bit < p.depth; ++bit) {
            const int place = start + (p.depth < 8 ? p.depth - 1 - bit : bit), shift = place & 7;
            visit(std::size_t(pixel), bit, std::size_t(place >> 3), p.depth < 8 ? 7 - shift : shift);
        }
    }
}

inline Bytes packed(const Picture& picture, int align) {
    Bytes bytes(static_cast<std::size_t>(row_bytes(picture.width, picture.depth, align) * picture.height));
    for_each_bit(picture, align, [&](std::size_t pixel, int bit, std::size_t byte, int shift) {
        bytes[byte] = static_cast<unsigned char>(bytes[byte] | (picture.pixels[pixel] >> bit & 1U) << shift);
    });
    return bytes;
}

inline Picture unpacked(const unsigned char* bytes, int width, int height, int depth, int align) {
    Picture picture(width, height, depth);
    for_each_bit(picture, align, [&](std::size_t pixel, int bit, std::size_t byte, int shift) {
        picture.pixels[pixel] |= (bytes[byte] >> shift & 1U) << bit;
    });
    return picture;
}

struct DibHeader {
    BITMAPINFOHEADER header;
    RGBQUAD table[256] = {};

    DibHeader(int width, int height, int depth)
        : header{40, width, height, 1, static_cast<WORD>(depth), BI_RGB, 0, 0, 0, 0, 0} {}
    BITMAPINFO* info() { return reinterpret_cast<BITMAPINFO*>(this); }
};

// A memory context with a bitmap of its own.
class Canvas {
public:
    explicit Canvas(const Picture& like) : m_like(like) {
        const auto depth = static_cast<UINT>(like.depth);
        m_bitmap.CreateBitmap(like.width, like.height, 1, depth, packed(like, 16).data());
        m_dc.CreateCompatibleDC(nullptr);
        select();
    }
    ~Canvas() { deselect(); }
    Canvas(const Canvas&) = delete;
    Canvas& operator=(const Canvas&) = delete;

    operator HDC() const { return m_dc; }
    CDC& dc() { return m_dc; }
    CBitmap& bitmap() { return m_bitmap; }
    void select() { m_replaced = SelectObject(m_dc, m_bitmap); }
    void deselect() { SelectObject(m_dc, m_replaced); }
    // The bitmap as it is now, in its own depth or as another reads it.
    Picture picture() const { return picture(m_like.depth); }
    Picture picture(int depth) const {
        Bytes bytes(packed(Picture(m_like.width, m_like.height, depth), 32).size());
        DibHeader dib(m_like.width, -m_like.height, depth);
        GetDIBits(m_dc, m_bitmap, 0, static_cast<UINT>(m_like.height), bytes.data(), dib.info(), 0);
        return unpacked(bytes.data(), m_like.width, m_like.height, depth, 32);
    }

private:
    Picture m_like;
    CBitmap m_bitmap;
    CDC m_dc;
    HGDIOBJ m_replaced = nullptr;
};

// The colours of a depth's table, as the library writes it; tests hold facts about it.
inline const std::vector<COLORREF>& table(int depth) {
    static std::array<std::vector<COLORREF>, 9> tables;
    std::vector<COLORREF>& colours = tables[static_cast<std::size_t>(depth)];
    if (colours.empty()) {
        Canvas canvas(Picture(1, 1, depth));
        DibHeader dib(1, 1, depth);
        GetDIBits(canvas, canvas.bitmap(), 0, 0, nullptr, dib.info(), DIB_RGB_COLORS);
        for (std::size_t i = 0; i < std::size_t{1} << depth; ++i) {
            colours.push_back(RGB(dib.table[i].rgbRed, dib.table[i].rgbGreen, dib.table[i].rgbBlue));
        }
    }
    return colours;
}

inline COLORREF colour_of(int depth, std::uint32_t value) {
    const int v = static_cast<int>(value & 0xFFFFFF);
    const auto eight = [v](int shift) { return (v >> shift & 0x1F) << 3 | (v >> shift & 0x1F) >> 2; };
    return depth <= 8    ? table(depth)[value]
           : depth == 16 ? RGB(eight(10), eight(5), eight(0))
                         : RGB(v >> 16, v >> 8, v);
}

// The nearest value of a depth.
inline std::uint32_t value_of(int depth, COLORREF colour) {
    const int r = GetRValue(colour), g = GetGValue(colour), b = GetBValue(colour);
    const auto five = [](int level) { return static_cast<int>(level * 31 / 255.0 + 0.5); };
    if (depth > 8) {
        return static_cast<std::uint32_t>(depth == 16 ? five(r) << 10 | five(g) << 5 | five(b)
                                                      : r << 16 | g << 8 | b);
    }
    const auto distance = [=](COLORREF c) {
        const int x = GetRValue(c) - r, y = GetGValue(c) - g, z = GetBValue(c) - b;
        return x * x + y * y + z * z;
    };
    const auto& all = table(depth);
    const auto is_nearer = [&](COLORREF x, COLORREF y) { return distance(x) < distance(y); };
    return static_cast<std::uint32_t>(std::min_element(all.begin(), all.end(), is_nearer) - all.begin());
}

// What a context is set to.
struct Settings {
    COLORREF text = 0, background = 0xFFFFFF;
    XFORM world = {1, 0, 0, 1, 0, 0};
};

// A source's value on its way into a destination.
inline std::uint32_t arriving(std::uint32_t value, int from, int to, const Settings& s,
                              COLORREF source_background) {
    return from == to  ? value
           : from == 1 ? value_of(to, value != 0 ? s.background : s.text)
           : to == 1   ? colour_bits(from, value) == value_of(from, source_background)
                       : value_of(to, colour_of(from, value));
}

inline CRect ordered(CRect r) {
    return r.NormalizeRect(), r;
}

// Calls paint(x, y, value&) for the pixels of a rectangle that exist.
template <class Paint>
void on(Picture& picture, const RECT& r, const Paint& paint) {
    for (int y = std::max(r.top, 0); y < std::min(r.bottom, picture.height); ++y) {
        for (int x = std::max(r.left, 0); x < std::min(r.right, picture.width); ++x) {
            paint(x, y, picture.at(x, y));
        }
    }
}

__extension__ using Wide = __int128;

// Whether a pixel's middle lies in a rectangle whose corners are quarters of an ellipse; in half pixels.
inline bool is_in_rounded(const RECT& r, int ellipse_width, int ellipse_height, std::int64_t x,
                          std::int64_t y) {
    const Wide wide = std::min<std::int64_t>(ellipse_width, std::int64_t{r.right} - r.left);
    const Wide high = std::min<std::int64_t>(ellipse_height, std::int64_t{r.bottom} - r.top);
    // From the nearest sides inwards, then to the middle of the corner's ellipse.
    const Wide dx = std::min(2 * (x - r.left) + 1, 2 * (r.right - x) - 1) - wide;
    const Wide dy = std::min(2 * (y - r.top) + 1, 2 * (r.bottom - y) - 1) - high;
    return dx >= 0 || dy >= 0 || dx * dx * high * high + dy * dy * wide * wide <= wide * wide * high * high;
}

// Channels are 8.8; between the corners they change by exact fractions.
inline void gradient(Picture& picture, const TRIVERTEX& a, const TRIVERTEX& b, bool across) {
    const std::int64_t from = across ? a.x : a.y, to = across ? b.x : b.y;
    on(picture, ordered({a.x, a.y, b.x, b.y}), [&](int x, int y, std::uint32_t& value) {
        const std::int64_t p = across ? x : y;
        const auto level = [&](WORD first, WORD last) {
            const auto eight = static_cast<int>((last * (p - from) + first * (to - p)) / (to - from) >> 8);
            return picture.depth == 16 ? eight >> 3 << 3 | eight >> 5 : eight;  // truncated, not the nearest
        };
        const COLORREF colour = RGB(level(a.Red, b.Red), level(a.Green, b.Green), level(a.Blue, b.Blue));
        value = value_of(picture.depth, colour);
    });
}

// A turn, clockwise to the eye, about a point.
inline XFORM turn_about(double degrees, double x, double y) {
    const double c = std::cos(degrees * std::numbers::pi / 180),
                 s = std::sin(degrees * std::numbers::pi / 180);
    const auto f = [](double value) { return static_cast<float>(value); };
    return {f(c), f(s), f(-s), f(c), f(x - x * c + y * s), f(y - x * s - y * c)};
}

// Where a copy goes, and which part of a source it takes.
struct Stretch {
    int x, y, width, height, source_x, source_y;
    int source_width = width, source_height = height;
};

// A copy, through the destination's transform. Pixels whose middle comes from within `margin` of a pixel's
// border, which rounding decides, are taken from `actual`.
inline Picture copied(const Picture& to, const Stretch& b, const Picture& from, DWORD rop,
                      const Settings& s = {}, COLORREF source_background = 0xFFFFFF,
                      const Picture* actual = nullptr, double margin = 0) {
    const XFORM& t = s.world;
    const double determinant = double{t.eM11} * t.eM22 - double{t.eM12} * t.eM21;
    Picture result = to;
    on(result, {0, 0, to.width, to.height}, [&](int x, int y, std::uint32_t& value) {
        const double px = x + 0.5 - t.eDx, py = y + 0.5 - t.eDy;
        const double u = (px * t.eM22 - py * t.eM21) / determinant,
                     v = (py * t.eM11 - px * t.eM12) / determinant;
        const double i = std::floor(u) - b.x, j = std::floor(v) - b.y;
        const double column = b.source_x + i, row = b.source_y + j;
        if (std::min(std::fabs(u - std::round(u)), std::fabs(v - std::round(v))) < margin) {
            value = actual->at(x, y);
        } else if (i >= 0 && j >= 0 && i < b.width && j < b.height && column >= 0 && row >= 0 &&
                   column < from.width && row < from.height) {
            const std::uint32_t pixel = from.at(int(column), int(row)), before = value;
            const std::uint32_t source = arriving(pixel, from.depth, to.depth, s, source_background);
            value = 0;
            for (int bit = 0; bit < to.depth; ++bit) {  // by the operation's table: source * 2 + destination
                value |= (rop >> (16 + (source >> bit & 1) * 2 + (before >> bit & 1)) & 1) << bit;
            }
        }
    });
    return result;
}

// A copy without the source's pixels of a colour.
inline Picture keyed(const Picture& to, const Stretch& s, const Picture& from, COLORREF key,
                     const Settings& settings = {}, COLORREF source_background = 0xFFFFFF) {
    Picture result = to;
    on(result, {0, 0, to.width, to.height}, [&](int x, int y, std::uint32_t& value) {
        const std::int64_t i = std::int64_t{x} - s.x, j = std::int64_t{y} - s.y;
        const bool is_in =
            i >= 0 && j >= 0 && i < s.width && j < s.height && s.source_width > 0 && s.source_height > 0;
        const std::int64_t column = is_in ? s.source_x + (2 * i + 1) * s.source_width / (2LL * s.width) : -1;
        const std::int64_t row = is_in ? s.source_y + (2 * j + 1) * s.source_height / (2LL * s.height) : -1;
        if (from.has(column, row) &&
            colour_bits(from.depth, from.at(column, row)) != value_of(from.depth, key)) {
            value = arriving(from.at(column, row), from.depth, to.depth, settings, source_background);
        }
    });
    return result;
}

// Whether a region holds the pixels that are not `out`, in its one form: runs of rows, joined where rows are
// equal.
inline bool holds(HRGN region, const Picture& picture, std::uint32_t out = 0) {
    const auto is_in = [&](int x, int y) { return picture.has(x, y) && picture.at(x, y) != out; };
    std::vector<CRect> rectangles;
    CRect box, its_box(9, 9, 9, 9);
    bool is_same = true;
    std::ptrdiff_t above = 0;  // the first rectangle of the row above
    for (int y = -1; y <= picture.height; ++y) {
        bool is_joined = true;
        for (int x = -1; x <= picture.width; ++x) {
            is_same &= PtInRegion(region, x, y) == is_in(x, y);
            is_joined &= is_in(x, y) == is_in(x, y - 1);
        }
        above = is_joined ? above : std::ssize(rectangles);
        for (int x = 0; x < picture.width && !is_joined; ++x) {
            if (is_in(x, y) && !is_in(x - 1, y)) {
                rectangles.emplace_back(x, y, x, y);
            }
            if (is_in(x, y)) {
                rectangles.back().right = x + 1;
            }
        }
        std::for_each(rectangles.begin() + above, rectangles.end(),
                      [&](CRect& r) { r.bottom = y + 1, box |= r; });
    }
    const std::size_t bytes = rectangles.size() * sizeof(RECT);
    const int kind = rectangles.size() > 1 ? COMPLEXREGION : rectangles.empty() ? NULLREGION : SIMPLEREGION;
    Bytes data(32 + bytes);
    const auto size = static_cast<DWORD>(data.size());
    return is_same && GetRegionData(region, 0, nullptr) == size &&
           GetRegionData(region, size, reinterpret_cast<RGNDATA*>(data.data())) == size &&
           (bytes == 0 || std::memcmp(&data[32], rectangles.data(), bytes) == 0) &&
           GetRgnBox(region, &its_box) == kind && its_box == box;
}

}  // namespace drawing

#endif
