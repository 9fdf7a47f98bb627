#include <gtest/gtest.h>

#include <random>

#include "tests/graphics/test_surface.h"

namespace {

using namespace basalt::test;

constexpr COLORREF KEY = 0x00C08040;
const std::vector<COLORREF> INKS = {KEY, 0x000000, 0xFFFFFF, 0x123456, 0xC08041, KEY};

struct Copy {
    int x, y, width, height;                          // destination
    int from_x, from_y, source_width, source_height;  // source
};

// Copies at and across every border of a 40 x 30 destination and a 32 x 24 source.
std::vector<Copy> copies(std::mt19937& random, bool stretched) {
    std::vector<Copy> all = {
        {0, 0, 32, 24, 0, 0, 32, 24}, {5, 6, 1, 1, 7, 8, 1, 1}, {5, 6, 0, 4, 1, 1, 4, 4}};
    const auto draw = [&](int low, int high) {
        return low + static_cast<int>(random() % static_cast<unsigned>(high - low + 1));
    };
    for (int i = 0; i < 40; ++i) {
        Copy copy = {draw(-20, 45), draw(-20, 35), draw(1, 50), draw(1, 40),
                     draw(0, 15),   draw(0, 12),   draw(1, 16), draw(1, 12)};
        all.push_back(copy);
    }
    for (Copy& copy : all) {
        if (!stretched) {
            copy.width = copy.source_width;
            copy.height = copy.source_height;
        }
    }
    return all;
}

int copy_transparent(const Copy& c, HDC dest, HDC source, COLORREF key) {
    return _transparentblt(dest, c.x, c.y, c.width, c.height, source, c.from_x, c.from_y, c.source_width,
                           c.source_height, key);
}

// The picture afterwards, by sampling the middle of every destination pixel.
void paint_transparent(const Copy& c, Picture& dest, const Picture& source, COLORREF key) {
    for (int j = 0; j < c.height; ++j) {
        for (int i = 0; i < c.width; ++i) {
            const int x = c.from_x + (2 * i + 1) * c.source_width / (2 * c.width);
            const int y = c.from_y + (2 * j + 1) * c.source_height / (2 * c.height);
            if (dest.has(c.x + i, c.y + j) && source.at(x, y) != key) {
                dest.at(c.x + i, c.y + j) = source.at(x, y);
            }
        }
    }
}

TEST(TransparentCopy, IsThePlatformsFromTheNtFamilyOn) {
    std::mt19937 random(71);
    SCOPED_TRACE("seed 71");
    for (const int code : {5, 6, 7, 9, 10, 11}) {
        const StoredOsCode os(code);
        for (const Copy& copy : copies(random, true)) {
            Picture expected = random_picture(random, 40, 30, INKS);
            const Picture source = random_picture(random, 32, 24, INKS);
            TestSurface dest(expected);
            const TestSurface from(source);
            EXPECT_NE(copy_transparent(copy, dest.dc(), from.dc(), KEY), 0);
            paint_transparent(copy, expected, source, KEY);
            expect_same(dest.picture(), expected);
        }
        const TestSurface from(4, 4);
        EXPECT_EQ(_transparentblt(nullptr, 0, 0, 4, 4, from.dc(), 0, 0, 4, 4, KEY), 0);
    }
}

TEST(TransparentCopy, GoesByMasksInTheNinetiesFamily) {
    std::mt19937 random(72);
    SCOPED_TRACE("seed 72");
    for (const int code : {2, 3, 4}) {
        const StoredOsCode os(code);
        for (const int depth : {24, 32}) {
            for (Copy copy : copies(random, false)) {
                Picture expected = random_picture(random, 40, 30, INKS);
                const Picture source = random_picture(random, 32, 24, INKS);
                TestSurface dest(expected, depth);
                TestSurface from(source);
                paint_transparent(copy, expected, source, KEY);
                copy.width = 1 + code;  // play no part
                copy.height = -7;
                EXPECT_EQ(copy_transparent(copy, dest.dc(), from.dc(), KEY), 0);
                expect_same(dest.picture(), expected);
                expect_same(from.picture(), source);
            }
        }
    }
}

TEST(TransparentCopy, ByMasksTakesWhatLiesOutsideTheSourceForBlack) {
    const StoredOsCode os(2);
    TestSurface dest(Picture(6, 1, 0x112233));
    const TestSurface source(Picture(2, 1, 0x445566));
    _transparentblt(dest.dc(), 1, 0, 0, 0, source.dc(), -1, 0, 4, 1, KEY);
    Picture expected(6, 1, 0x112233);
    expected.at(1, 0) = expected.at(4, 0) = 0;
    expected.at(2, 0) = expected.at(3, 0) = 0x445566;
    expect_same(dest.picture(), expected);
}

TEST(TransparentCopy, ByMasksDrawsNothingFromWhatCannotBeRead) {
    const StoredOsCode os(2);
    const Picture before(4, 4, 0x112233);
    TestSurface dest(before);
    TestSurface turned(Picture(4, 4, 0x445566));
    SetGraphicsMode(turned.dc(), GM_ADVANCED);
    constexpr XFORM QUARTER = {0, 1, -1, 0, 0, 0};
    SetWorldTransform(turned.dc(), &QUARTER);
    for (HDC const source : {HDC(nullptr), turned.dc()}) {
        EXPECT_EQ(_transparentblt(dest.dc(), 0, 0, 4, 4, source, 0, 0, 4, 4, KEY), 0);
        expect_same(dest.picture(), before);
    }
    const TestSurface source(Picture(4, 4, 0x778899));
    EXPECT_EQ(_transparentblt(turned.dc(), 0, 0, 4, 4, source.dc(), 0, 0, 4, 4, KEY), 0);
    ModifyWorldTransform(turned.dc(), nullptr, MWT_IDENTITY);
    expect_same(turned.picture(), Picture(4, 4, 0x445566));
}

TEST(TransparentCopy, ByMasksOfOneBitKeepsWhatIsWhiteInBoth) {
    const StoredOsCode os(3);
    Picture white_black(4, 1);
    white_black.pixels = {0xFFFFFF, 0xFFFFFF, 0, 0};
    TestSurface dest(white_black, 1);
    Picture stripes(4, 1);
    stripes.pixels = {0xFFFFFF, 0, 0xFFFFFF, 0};
    const TestSurface source(stripes, 1);
    _transparentblt(dest.dc(), 0, 0, 4, 1, source.dc(), 0, 0, 4, 1, KEY);
    Picture expected(4, 1);
    expected.at(0, 0) = 0xFFFFFF;  // the mask of one bit is the source itself: white is what stays out
    expect_same(dest.picture(), expected);
}

TEST(TransparentCopy, IsAnAndFromTheOriginWhileTheSystemIsNotKnown) {
    std::mt19937 random(73);
    SCOPED_TRACE("seed 73");
    for (const int code : {0, 1}) {
        const StoredOsCode os(code);
        for (const Copy& copy : copies(random, true)) {
            Picture expected = random_picture(random, 40, 30, INKS);
            const Picture source = random_picture(random, 32, 24, INKS);
            TestSurface dest(expected);
            const TestSurface from(source);
            for (int j = 0; j < copy.height; ++j) {
                for (int i = 0; i < copy.width; ++i) {
                    if (source.has(i, j) && expected.has(copy.x + i, copy.y + j)) {
                        expected.at(copy.x + i, copy.y + j) &= source.at(i, j);
                    }
                }
            }
            EXPECT_NE(copy_transparent(copy, dest.dc(), from.dc(), KEY), 0);
            expect_same(dest.picture(), expected);
        }
        const TestSurface dest(4, 4);
        EXPECT_EQ(_transparentblt(dest.dc(), 0, 0, 4, 4, nullptr, 0, 0, 4, 4, KEY), 0);
    }
}

TEST(TransparentCopy, DrawsAllOrNothingWithoutMemory) {
    const StoredOsCode os(2);
    Picture copied(64, 64, 0x010203);
    copied.at(5, 5) = KEY;
    const TestSurface source(copied);
    const Picture before(64, 64, 0xABCDEF);
    Picture after = copied;
    after.at(5, 5) = 0xABCDEF;
    TestSurface dest(before);
    with_failing_allocations(
        [&] { _transparentblt(dest.dc(), 0, 0, 64, 64, source.dc(), 0, 0, 64, 64, KEY); },
        [&](bool fired) {
            expect_same(dest.picture(), fired ? before : after);
            dest.put(before);
        });
}

TEST(TransparentCopy, OfNoOrNegativeSizeDrawsNothing) {
    const Picture before(4, 4, 0x777777);
    const TestSurface source(Picture(4, 4, 0x111111));
    for (const int code : {2, 5}) {
        const StoredOsCode os(code);
        for (const int size : {0, -3, -2147483647 - 1}) {
            TestSurface dest(before);
            EXPECT_EQ(_transparentblt(dest.dc(), 1, 1, size, size, source.dc(), 0, 0, size, size, KEY),
                      code == 5 && size == 0);
            expect_same(dest.picture(), before);
        }
    }
}

}  // namespace
