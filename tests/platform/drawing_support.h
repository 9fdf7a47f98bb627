// Surfaces for tests, and their pixels taken apart without the library's help.
#ifndef BASALT_TESTS_PLATFORM_DRAWING_SUPPORT_H
#define BASALT_TESTS_PLATFORM_DRAWING_SUPPORT_H

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <random>
#include <vector>

#include "basalt/platform.h"

namespace drawing {

inline constexpr int DEPTHS[] = {1, 4, 8, 16, 24, 32};

/// Stored values of a picture, row by row.
struct Picture {
    int width = 0;
    int height = 0;
    std::vector<std::uint32_t> values;

    Picture(int its_width, int its_height, std::uint32_t value = 0)
        : width(its_width),
          height(its_height),
          values(static_cast<std::size_t>(its_width) * static_cast<std::size_t>(its_height), value) {}

    bool has(std::int64_t x, std::int64_t y) const { return x >= 0 && y >= 0 && x < width && y < height; }
    std::uint32_t& at(std::int64_t x, std::int64_t y) {
        return values[static_cast<std::size_t>(y * width + x)];
    }
    std::uint32_t at(std::int64_t x, std::int64_t y) const {
        return values[static_cast<std::size_t>(y * width + x)];
    }
    friend bool operator==(const Picture&, const Picture&) = default;
};

inline std::uint32_t all_ones(int depth) {
    return depth == 32 ? 0xFFFFFFFFU : (1U << depth) - 1U;
}

inline Picture random_picture(int width, int height, int depth, std::mt19937& random) {
    Picture picture(width, height);
    for (std::uint32_t& value : picture.values) {
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
    Canvas(const Picture& picture, int its_depth) : depth(its_depth) {
        m_dc = CreateCompatibleDC(nullptr);
        m_bitmap = CreateBitmap(picture.width, picture.height, 1, static_cast<UINT>(depth),
                                packed(picture, depth, 16).data());
        m_replaced = SelectObject(m_dc, m_bitmap);
    }
    Canvas(int width, int height, int its_depth) : Canvas(Picture(width, height), its_depth) {}
    ~Canvas() {
        EXPECT_EQ(SelectObject(m_dc, m_replaced), m_bitmap);
        EXPECT_NE(DeleteObject(m_bitmap), 0);
        EXPECT_NE(DeleteDC(m_dc), 0);
    }
    Canvas(const Canvas&) = delete;
    Canvas& operator=(const Canvas&) = delete;

    operator HDC() const { return m_dc; }
    HBITMAP bitmap() const { return m_bitmap; }

    Picture picture() const {
        BITMAP record = {};
        EXPECT_EQ(GetObjectW(m_bitmap, sizeof record, &record), static_cast<int>(sizeof record));
        const int row_bytes = (record.bmWidth * depth + 31) / 32 * 4;
        std::vector<unsigned char> bytes(static_cast<std::size_t>(row_bytes * record.bmHeight));
        DibHeader dib(record.bmWidth, -record.bmHeight, depth);
        EXPECT_EQ(GetDIBits(m_dc, m_bitmap, 0, static_cast<UINT>(record.bmHeight), bytes.data(), dib.info(),
                            DIB_RGB_COLORS),
                  record.bmHeight);
        return unpacked(bytes, record.bmWidth, record.bmHeight, depth, 32);
    }

    const int depth;

private:
    HDC m_dc;
    HBITMAP m_bitmap;
    HGDIOBJ m_replaced;
};

/// Word 0x00RRGGBB of a colour 0x00BBGGRR, and back.
inline std::uint32_t swapped(std::uint32_t colour) {
    return (colour & 0xFF) << 16 | (colour & 0xFF00) | (colour >> 16 & 0xFF);
}

}  // namespace drawing

#endif
