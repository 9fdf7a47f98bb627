// Pictures and surfaces for tests: pixels taken apart, and copies and shapes made, without the library's
// help.
#ifndef BASALT_TESTS_SUPPORT_DRAWING_H
#define BASALT_TESTS_SUPPORT_DRAWING_H

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <numbers>
#include <random>
#include <vector>

#include "basalt/platform.h"

namespace drawing {

inline constexpr int DEPTHS[] = {1, 4, 8, 16, 24, 32};

/// Colours, or values as a bitmap stores them, row by row.
struct Picture {
    int width;
    int height;
    std::vector<std::uint32_t> pixels;

    Picture(int its_width, int its_height, std::uint32_t pixel = 0)
        : width(its_width),
          height(its_height),
          pixels(static_cast<std::size_t>(its_width) * static_cast<std::size_t>(its_height), pixel) {}

    bool has(std::int64_t x, std::int64_t y) const { return x >= 0 && y >= 0 && x < width && y < height; }
    std::uint32_t& at(std::int64_t x, std::int64_t y) {
        return pixels[static_cast<std::size_t>(y * width + x)];
    }
    std::uint32_t at(std::int64_t x, std::int64_t y) const {
        return pixels[static_cast<std::size_t>(y * width + x)];
    }
    friend bool operator==(const Picture&, const Picture&) = default;
};

inline std::uint32_t all_ones(int depth) {
    return depth == 32 ? 0xFFFFFFFFU : (1U << depth) - 1U;
}

/// White as a bitmap stores it; what 32 bits do not use is 0.
inline std::uint32_t white(int depth) {
    return depth == 16 ? 0x7FFF : all_ones(depth) & 0xFFFFFF;
}

inline Picture random_picture(int width, int height, int depth, std::mt19937& random) {
    Picture picture(width, height);
    for (std::uint32_t& value : picture.pixels) {
        value = static_cast<std::uint32_t>(random()) & all_ones(depth);
    }
    return picture;
}

/// Rows with a padding of `align` bits, bit by bit: pixels follow each other from a byte's highest bit on
/// when they are smaller than one, and have their lowest byte first when they are larger.
inline std::vector<unsigned char> packed(const Picture& picture, int depth, int align) {
    const int row_bytes = (picture.width * depth + align - 1) / align * align / 8;
    std::vector<unsigned char> bytes(static_cast<std::size_t>(row_bytes * picture.height));
    for (int y = 0; y < picture.height; ++y) {
        for (int x = 0; x < picture.width; ++x) {
            for (int bit = 0; bit < depth; ++bit) {
                const bool is_set = (picture.at(x, y) >> bit & 1) != 0;
                const int place = x * depth + (depth < 8 ? depth - 1 - bit : bit);
                const int shift = depth < 8 ? 7 - place % 8 : place % 8;
                auto& byte = bytes[static_cast<std::size_t>(y * row_bytes + place / 8)];
                byte = static_cast<unsigned char>(byte | (is_set ? 1 : 0) << shift);
            }
        }
    }
    return bytes;
}

inline Picture unpacked(const std::vector<unsigned char>& bytes, int width, int height, int depth,
                        int align) {
    const int row_bytes = (width * depth + align - 1) / align * align / 8;
    Picture picture(width, height);
    for (int y = 0; y < height; ++y) {
        for (int x = 0; x < width; ++x) {
            for (int bit = 0; bit < depth; ++bit) {
                const int place = x * depth + (depth < 8 ? depth - 1 - bit : bit);
                const int shift = depth < 8 ? 7 - place % 8 : place % 8;
                const unsigned set = bytes[static_cast<std::size_t>(y * row_bytes + place / 8)] >> shift & 1U;
                picture.at(x, y) |= set << bit;
            }
        }
    }
    return picture;
}

struct DibHeader {
    BITMAPINFOHEADER header;
    RGBQUAD table[256];

    DibHeader(int width, int height, int depth) : header(), table() {
        header.biSize = 40;
        header.biWidth = width;
        header.biHeight = height;
        header.biPlanes = 1;
        header.biBitCount = static_cast<WORD>(depth);
    }
    BITMAPINFO* info() { return reinterpret_cast<BITMAPINFO*>(this); }
};

/// A memory context with a bitmap of its own.
class Canvas {
public:
    Canvas(const Picture& picture, int its_depth)
        : width(picture.width), height(picture.height), depth(its_depth), m_dc(CreateCompatibleDC(nullptr)) {
        m_bitmap =
            CreateBitmap(width, height, 1, static_cast<UINT>(depth), packed(picture, depth, 16).data());
        select();
    }
    Canvas(int its_width, int its_height, int its_depth)
        : Canvas(Picture(its_width, its_height), its_depth) {}
    ~Canvas() {
        deselect();
        EXPECT_NE(DeleteObject(m_bitmap), 0);
        EXPECT_NE(DeleteDC(m_dc), 0);
    }
    Canvas(const Canvas&) = delete;
    Canvas& operator=(const Canvas&) = delete;

    operator HDC() const { return m_dc; }
    HBITMAP bitmap() const { return m_bitmap; }
    void select() {
        if (m_replaced == nullptr) {
            m_replaced = SelectObject(m_dc, m_bitmap);
            EXPECT_NE(m_replaced, nullptr);
        }
    }
    void deselect() {
        if (m_replaced != nullptr) {
            EXPECT_EQ(SelectObject(m_dc, m_replaced), m_bitmap);
            m_replaced = nullptr;
        }
    }
    Picture picture() const {
        std::vector<unsigned char> bytes(packed(Picture(width, height), depth, 32).size());
        DibHeader dib(width, -height, depth);
        EXPECT_EQ(
            GetDIBits(m_dc, m_bitmap, 0, static_cast<UINT>(height), bytes.data(), dib.info(), DIB_RGB_COLORS),
            height);
        return unpacked(bytes, width, height, depth, 32);
    }

    const int width, height, depth;

private:
    HDC m_dc;
    HBITMAP m_bitmap;
    HGDIOBJ m_replaced = nullptr;
};

/// Where a copy goes, and which part of a source it takes.
struct Stretch {
    int x, y, width, height, source_x, source_y, source_width, source_height;
};

inline Picture upside_down(const Picture& picture) {
    Picture result = picture;
    for (int y = 0; y < picture.height; ++y) {
        for (int x = 0; x < picture.width; ++x) {
            result.at(x, y) = picture.at(x, picture.height - 1 - y);
        }
    }
    return result;
}

/// Whether a pixel's middle lies in a rectangle whose corners are quarters of an ellipse; in half pixels.
inline bool is_in_rounded(const RECT& r, int ellipse_width, int ellipse_height, std::int64_t x,
                          std::int64_t y) {
    const std::int64_t wide = std::min<std::int64_t>(ellipse_width, std::int64_t{r.right} - r.left);
    const std::int64_t high = std::min<std::int64_t>(ellipse_height, std::int64_t{r.bottom} - r.top);
    // From the nearest sides inwards, then to the middle of the corner's ellipse.
    const std::int64_t in_x = std::min(2 * (x - r.left) + 1, 2 * (r.right - x) - 1);
    const std::int64_t in_y = std::min(2 * (y - r.top) + 1, 2 * (r.bottom - y) - 1);
    const std::int64_t dx = in_x - wide;
    const std::int64_t dy = in_y - high;
    return in_x >= 0 && in_y >= 0 &&
           (dx >= 0 || dy >= 0 || dx * dx * high * high + dy * dy * wide * wide <= wide * wide * high * high);
}

inline RECT ordered(const RECT& r) {
    return {std::min(r.left, r.right), std::min(r.top, r.bottom), std::max(r.left, r.right),
            std::max(r.top, r.bottom)};
}

/// A channel at place p of a ramp from `first` at a to `last` at b, by division of whole numbers. The ends
/// are 8.8.
inline int gradient_level(std::int64_t first, std::int64_t last, std::int64_t a, std::int64_t b,
                          std::int64_t p) {
    return static_cast<int>((last * (p - a) + first * (b - p)) / (b - a) >> 8);
}

inline void fill(Picture& picture, const RECT& r, std::uint32_t pixel) {
    for (int y = std::max(r.top, 0); y < std::min(r.bottom, picture.height); ++y) {
        for (int x = std::max(r.left, 0); x < std::min(r.right, picture.width); ++x) {
            picture.at(x, y) = pixel;
        }
    }
}

/// That a region holds the pixels that are not the key, and no others.
inline void expect_region(HRGN region, const Picture& picture, std::uint32_t key) {
    for (int y = -1; y <= picture.height; ++y) {
        for (int x = -1; x <= picture.width; ++x) {
            ASSERT_EQ(PtInRegion(region, x, y) != 0, picture.has(x, y) && picture.at(x, y) != key)
                << x << ", " << y;
        }
    }
}

/// A turn, clockwise to the eye, about a point.
inline XFORM turn_about(double degrees, double x, double y) {
    const double c = std::cos(degrees * std::numbers::pi / 180);
    const double s = std::sin(degrees * std::numbers::pi / 180);
    return {static_cast<float>(c),
            static_cast<float>(s),
            static_cast<float>(-s),
            static_cast<float>(c),
            static_cast<float>(x - x * c + y * s),
            static_cast<float>(y - x * s - y * c)};
}

/// Where the middle of a destination pixel comes from, and by how much it misses the border of a pixel.
struct Origin {
    std::int64_t x, y;
    double margin;
};

inline Origin origin(const XFORM& t, int x, int y) {
    const double determinant = double{t.eM11} * t.eM22 - double{t.eM12} * t.eM21;
    const double px = x + 0.5 - t.eDx;
    const double py = y + 0.5 - t.eDy;
    const double u = (px * t.eM22 - py * t.eM21) / determinant;
    const double v = (py * t.eM11 - px * t.eM12) / determinant;
    return {static_cast<std::int64_t>(std::floor(u)), static_cast<std::int64_t>(std::floor(v)),
            std::min(std::fabs(u - std::round(u)), std::fabs(v - std::round(v)))};
}

}  // namespace drawing

#endif
