// Surfaces for tests, pixel by pixel, and the stored operating-system code.
#ifndef BASALT_TESTS_GRAPHICS_TEST_SURFACE_H
#define BASALT_TESTS_GRAPHICS_TEST_SURFACE_H

#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "basalt/graphics.h"
#include "src/frame/environment_state.h"
#include "tests/support/drawing.h"
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

using drawing::Picture;

// Colours drawn from a few, so that any one of them is common.
inline Picture random_picture(std::mt19937& random, int width, int height,
                              const std::vector<COLORREF>& colours) {
    Picture picture(width, height);
    for (COLORREF& pixel : picture.pixels) {
        pixel = colours[random() % colours.size()];
    }
    return picture;
}

inline int between(std::mt19937& random, int low, int high) {
    return low + static_cast<int>(random() % static_cast<unsigned>(high - low + 1));
}

// A canvas whose picture holds colours.
class TestSurface : public drawing::Canvas {
public:
    TestSurface(int its_width, int its_height, int its_depth = 32)
        : Canvas(its_width, its_height, its_depth) {}
    explicit TestSurface(const Picture& picture, int its_depth = 32)
        : Canvas(picture.width, picture.height, its_depth) {
        put(picture);
    }
    CDC& context() { return *CDC::FromHandle(*this); }
    // The bitmap, free of the context.
    CBitmap& free_bitmap() {
        deselect();
        return *CBitmap::FromHandle(bitmap());
    }
    void put(const Picture& picture) {
        for (int y = 0; y < height; ++y) {
            for (int x = 0; x < width; ++x) {
                SetPixel(*this, x, y, picture.at(x, y));
            }
        }
    }
    Picture picture() {
        select();
        Picture picture(width, height);
        for (int y = 0; y < height; ++y) {
            for (int x = 0; x < width; ++x) {
                picture.at(x, y) = GetPixel(*this, x, y);
            }
        }
        return picture;
    }
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
