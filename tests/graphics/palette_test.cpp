#include "basalt/graphics/palette.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdlib>
#include <random>
#include <vector>

#include "src/graphics/closest_colour.h"

namespace {

using Colours = std::array<std::uint32_t, 256>;

// The search as a scan from the first colour to the last.
int plain_closest(const Colours& colours, std::uint32_t wanted) {
    int best = 300, candidate = 0;
    for (int i = 0; i < 256; ++i) {
        const std::uint32_t entry = colours[static_cast<std::size_t>(i)];
        int distance = entry == wanted ? -1 : 0;
        for (const int shift : {16, 8, 0}) {
            const int levels =
                static_cast<int>(entry >> shift & 0xFF) - static_cast<int>(wanted >> shift & 0xFF);
            distance += std::abs(levels * 100 / 255);
        }
        if (distance < best) {
            best = distance, candidate = i;
        }
    }
    return candidate;
}

Colours colours_of(const ColorPalette& palette) {
    Colours colours = {};
    palette.ToMemory(colours.data());
    return colours;
}

TEST(DefaultPalette, is_made_of_basic_colours_hues_and_greys) {
    std::vector<std::uint32_t> expected = {0x0000FF, 0x00FFFF, 0x00FF00, 0xFFFF00, 0xFF0000,
                                           0xFF00FF, 0xFFFFFF, 0x808080, 0xC0C0C0};
    // From red to yellow, green, cyan, blue, magenta and back: one channel leads, a second one rises or falls
    // by quarters. Each of five levels comes full and then with the other channels halfway to the leading
    // one, truncated.
    const int sixths[][2] = {{0, 8}, {8, 0}, {8, 16}, {16, 8}, {16, 0}, {0, 16}};
    for (int group = 0; group < 24; ++group) {
        const auto [leading, moving] = sixths[group / 4];
        const int quarters = group / 4 % 2 == 0 ? group % 4 : 4 - group % 4;
        for (const int level : {255, 204, group < 4 ? 153 : 152, 127, 76}) {
            const int rise = level * quarters / 4,
                      paler = (rise + level) / 2 << moving | level / 2 << (24 - leading - moving);
            expected.push_back(std::uint32_t(level << leading | rise << moving));
            expected.push_back(std::uint32_t(level << leading | paler));
        }
    }
    for (const std::uint32_t grey : {0U, 51U, 91U, 132U, 173U, 214U, 255U}) {
        expected.push_back(grey * 0x010101);
    }
    const Colours colours = colours_of(ColorPalette());
    EXPECT_EQ(std::vector(colours.begin(), colours.end()), expected);
    EXPECT_EQ(ColorPalette()[9], colours[9]);
}

TEST(Palette, has_fixed_ranges) {
    using P = ColorPalette;
    EXPECT_EQ((std::vector<int>{P::GetSecondPaletteStartIndex(), P::GetSecondPaletteEndIndex(),
                                P::GetLargePaletteStartIndex(), P::GetLargePaletteEndIndex(),
                                P::GetThirdPaletteStartIndex(), P::GetThirdPaletteEndIndex(),
                                P::GetWhiteColorIndex()}),
              (std::vector<int>{0, 8, 9, 248, 249, 254, 6}));
    EXPECT_TRUE(P::GetSize() == 256 && sizeof(P) == 1024);
}

TEST(ClosestColour, is_that_of_the_scan) {
    std::mt19937 random(17);
    SCOPED_TRACE("seed 17");
    for (int round = 0; round < 400; ++round) {
        ColorPalette palette, copy;
        Colours colours = colours_of(palette);
        // Few levels make equal distances and equal colours common; the high byte counts for equality alone.
        const std::uint32_t mask = round % 4 == 1 ? 0x01030303U : 0x80FFFFFFU;
        if (round % 2 == 1) {
            std::generate(colours.begin(), colours.end(), [&] { return std::uint32_t(random()) & mask; });
            palette.FromMemory(colours.data());
        }
        copy = palette;
        ASSERT_EQ(colours_of(copy), colours);
        for (int i = 0; i < 200; ++i) {
            const auto drawn = static_cast<std::uint32_t>(random());
            const std::uint32_t wanted =
                i % 2 == 0 ? colours[drawn & 0xFF] ^ (drawn >> 31) : drawn & 0x01FFFFFF;
            const int expected = plain_closest(colours, wanted);
            ASSERT_EQ(palette.FindClosestColor(wanted), expected) << std::hex << wanted;
            ASSERT_EQ(basalt::graphics::closest_colour_portable(colours.data(), wanted), expected);
        }
    }
    Colours far;
    far.fill(0xFFFFFF);
    ColorPalette white;
    white.FromMemory(far.data());
    EXPECT_EQ(white.FindClosestColor(0), 0) << "nothing nearer than the greatest distance";
}

TEST(ComplementaryColour, is_dark_over_light) {
    EXPECT_TRUE(_complementarycolor(0x808080) == 0xFFFFFF && _complementarycolor(0xFF000000) == 0xFFFFFF);
    for (const std::uint32_t lighter : {0x818080U, 0x808180U, 0x808081U}) {
        EXPECT_EQ(_complementarycolor(lighter), 0x505050U);
    }
}

}  // namespace
