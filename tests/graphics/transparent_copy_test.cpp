#include <gtest/gtest.h>

#include <random>

#include "tests/graphics/test_surface.h"

namespace {

using namespace basalt::test;
using drawing::Stretch;

constexpr COLORREF KEY = 0x00C08040;
const std::vector<COLORREF> INKS = {KEY, 0x000000, 0xFFFFFF, 0x123456, 0xC08041, KEY};
constexpr Stretch FOUR_SQUARE = {0, 0, 4, 4, 0, 0, 4, 4};

int copy_transparent(HDC dest, HDC source, const Stretch& s) {
    return _transparentblt(dest, s.x, s.y, s.width, s.height, source, s.source_x, s.source_y, s.source_width,
                           s.source_height, KEY);
}

// Copies at and across every border of a 40 x 30 destination and a 32 x 24 source, against the platform's
// own.
TEST(TransparentCopy, GoesByTheFamilyOfTheSystem) {
    std::mt19937 random(71);
    SCOPED_TRACE("seed 71");
    std::vector<Stretch> copies = {
        {0, 0, 32, 24, 0, 0, 32, 24}, {5, 6, 1, 1, 7, 8, 1, 1}, {5, 6, 0, 4, 1, 1, 4, 4}};
    for (int i = 0; i < 40; ++i) {
        copies.push_back({between(random, -20, 45), between(random, -20, 35), between(random, 1, 50),
                          between(random, 1, 40), between(random, 0, 15), between(random, 0, 12),
                          between(random, 1, 16), between(random, 1, 12)});
    }
    for (const int code : {0, 1, 2, 3, 4, 5, 6, 7, 9, 10, 11}) {
        SCOPED_TRACE(testing::Message() << "system " << code);
        const StoredOsCode os(code);
        for (std::size_t i = 0; i < copies.size(); ++i) {
            const int depth = i % 2 == 0 ? 24 : 32;
            const Stretch& s = copies[i];
            const Picture before = random_picture(random, 40, 30, INKS);
            const Picture source = random_picture(random, 32, 24, INKS);
            TestSurface dest(before, depth);
            TestSurface expected(before, depth);
            TestSurface from(source);
            if (code >= 5) {
                EXPECT_NE(copy_transparent(dest, from, s), 0);
                TransparentBlt(expected, s.x, s.y, s.width, s.height, from, s.source_x, s.source_y,
                               s.source_width, s.source_height, KEY);
            } else if (code >= 2) {  // by masks; the destination's size plays no part
                EXPECT_EQ(copy_transparent(dest, from,
                                           {s.x, s.y, 1 + code, -7, s.source_x, s.source_y, s.source_width,
                                            s.source_height}),
                          0);
                TransparentBlt(expected, s.x, s.y, s.source_width, s.source_height, from, s.source_x,
                               s.source_y, s.source_width, s.source_height, KEY);
            } else {
                const TestSurface same_depth(source, depth);
                EXPECT_NE(copy_transparent(dest, same_depth, s), 0);
                BitBlt(expected, s.x, s.y, s.width, s.height, same_depth, 0, 0, SRCAND);
            }
            expect_same(dest.picture(), expected.picture());
            expect_same(from.picture(), source);
        }
    }
}

TEST(TransparentCopy, SaysThatItCannotBeMade) {
    const TestSurface surface(4, 4);
    for (const int code : {0, 1, 5, 11}) {
        const StoredOsCode os(code);
        EXPECT_EQ(copy_transparent(nullptr, surface, FOUR_SQUARE), 0);
        EXPECT_EQ(copy_transparent(surface, nullptr, FOUR_SQUARE), 0);
    }
}

TEST(TransparentCopy, ByMasksTakesWhatLiesOutsideTheSourceForBlack) {
    const StoredOsCode os(2);
    TestSurface dest(Picture(6, 1, 0x112233));
    const TestSurface source(Picture(2, 1, 0x445566));
    copy_transparent(dest, source, {1, 0, 0, 0, -1, 0, 4, 1});
    EXPECT_EQ(dest.picture().pixels, (std::vector<COLORREF>{0x112233, 0, 0x445566, 0x445566, 0, 0x112233}));
}

TEST(TransparentCopy, ByMasksDrawsNothingFromWhatCannotBeRead) {
    const StoredOsCode os(2);
    const Picture before(4, 4, 0x112233);
    TestSurface dest(before);
    TestSurface turned(Picture(4, 4, 0x445566));
    SetGraphicsMode(turned, GM_ADVANCED);
    constexpr XFORM QUARTER = {0, 1, -1, 0, 0, 0};
    SetWorldTransform(turned, &QUARTER);
    for (HDC const source : {HDC(nullptr), HDC(turned)}) {
        EXPECT_EQ(copy_transparent(dest, source, FOUR_SQUARE), 0);
        expect_same(dest.picture(), before);
    }
    EXPECT_EQ(copy_transparent(turned, dest, FOUR_SQUARE), 0);
    ModifyWorldTransform(turned, nullptr, MWT_IDENTITY);
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
    copy_transparent(dest, source, {0, 0, 4, 1, 0, 0, 4, 1});
    // The mask of one bit is the source itself: white is what stays out.
    EXPECT_EQ(dest.picture().pixels, (std::vector<COLORREF>{0xFFFFFF, 0, 0, 0}));
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
        [&] {
            copy_transparent(dest, source, {0, 0, 64, 64, 0, 0, 64, 64});
        },
        [&](bool fired) {
            expect_same(dest.picture(), fired ? before : after);
            dest.put(before);
        });
}

TEST(TransparentCopy, OfNoOrNegativeSizeDrawsNothing) {
    const Picture before(4, 4, 0x777777);
    TestSurface dest(before);
    const TestSurface source(Picture(4, 4, 0x111111));
    for (const int code : {2, 5}) {
        const StoredOsCode os(code);
        for (const int size : {0, -3, -2147483647 - 1}) {
            EXPECT_EQ(copy_transparent(dest, source, {1, 1, size, size, 0, 0, size, size}),
                      code == 5 && size == 0);
            expect_same(dest.picture(), before);
        }
    }
}

}  // namespace
