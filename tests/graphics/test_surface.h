// Surfaces for tests, pixel by pixel, and the stored operating-system code.
#ifndef BASALT_TESTS_GRAPHICS_TEST_SURFACE_H
#define BASALT_TESTS_GRAPHICS_TEST_SURFACE_H

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <random>
#include <vector>

#include "basalt/graphics.h"
#include "basalt/platform/drawing.h"
#include "src/frame/environment_state.h"

#include "tests/support/with_failing_allocations.h"

namespace basalt::test {

inline constexpr int NT = 5;

// Stores an operating-system code while alive.
class StoredOsCode {
public:
    explicit StoredOsCode(int code) { store(code); }
    ~StoredOsCode() { store(m_before); }
    StoredOsCode(const StoredOsCode&) = delete;
    StoredOsCode& operator=(const StoredOsCode&) = delete;

private:
    static void store(int code) { frame::environment.os_code.store(static_cast<basalt_os>(code)); }
    int m_before = static_cast<int>(frame::environment.os_code.load());
};

struct Picture {
    int width;
    int height;
    std::vector<COLORREF> pixels;

    Picture(int w, int h, COLORREF colour = 0)
        : width(w), height(h), pixels(static_cast<std::size_t>(w) * static_cast<std::size_t>(h), colour) {}
    bool has(int x, int y) const { return x >= 0 && x < width && y >= 0 && y < height; }
    COLORREF& at(int x, int y) {
        return pixels[static_cast<std::size_t>(y) * static_cast<std::size_t>(width) +
                      static_cast<std::size_t>(x)];
    }
    COLORREF at(int x, int y) const { return const_cast<Picture*>(this)->at(x, y); }
};

// Colours drawn from a few, so that any one of them is common.
inline Picture random_picture(std::mt19937& random, int width, int height,
                              const std::vector<COLORREF>& colours) {
    Picture picture(width, height);
    for (COLORREF& pixel : picture.pixels) {
        pixel = colours[random() % colours.size()];
    }
    return picture;
}

// A bitmap in a memory context.
class TestSurface {
public:
    TestSurface(int width, int height, int depth = 32) : m_width(width), m_height(height) {
        m_bitmap.CreateBitmap(width, height, 1, static_cast<UINT>(depth), nullptr);
        m_dc.CreateCompatibleDC(nullptr);
        m_before = m_dc.SelectObject(&m_bitmap);
        EXPECT_NE(m_before, nullptr);
    }
    explicit TestSurface(const Picture& picture, int depth = 32)
        : TestSurface(picture.width, picture.height, depth) {
        put(picture);
    }
    ~TestSurface() { deselect(); }
    TestSurface(const TestSurface&) = delete;
    TestSurface& operator=(const TestSurface&) = delete;

    HDC dc() const { return m_dc; }
    CDC& context() { return m_dc; }
    // The bitmap, free of the context.
    CBitmap& bitmap() {
        deselect();
        return m_bitmap;
    }
    void select() { m_before = m_dc.SelectObject(&m_bitmap); }

    void put(const Picture& picture) {
        for (int y = 0; y < m_height; ++y) {
            for (int x = 0; x < m_width; ++x) {
                SetPixel(m_dc, x, y, picture.at(x, y));
            }
        }
    }
    Picture picture() {
        if (m_before == nullptr) {
            select();
        }
        Picture picture(m_width, m_height);
        for (int y = 0; y < m_height; ++y) {
            for (int x = 0; x < m_width; ++x) {
                picture.at(x, y) = GetPixel(m_dc, x, y);
            }
        }
        return picture;
    }

private:
    void deselect() {
        if (m_before != nullptr) {
            m_dc.SelectObject(m_before);
            m_before = nullptr;
        }
    }

    int m_width;
    int m_height;
    CBitmap m_bitmap;
    CDC m_dc;
    CBitmap* m_before = nullptr;
};

inline void expect_same(const Picture& actual, const Picture& expected) {
    ASSERT_EQ(actual.width, expected.width);
    ASSERT_EQ(actual.height, expected.height);
    for (int y = 0; y < actual.height; ++y) {
        for (int x = 0; x < actual.width; ++x) {
            ASSERT_EQ(actual.at(x, y), expected.at(x, y)) << std::hex << "at " << x << ", " << y;
        }
    }
}

}  // namespace basalt::test

#endif
