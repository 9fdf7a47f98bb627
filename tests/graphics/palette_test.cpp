#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <cstdlib>
#include <random>
#include <vector>

#include "basalt/graphics.h"
#include "src/graphics/closest_colour.h"

namespace {

using Colours = std::array<std::uint32_t, 256>;

int channel(std::uint32_t colour, int shift) {
    return static_cast<int>(colour >> shift & 0xFF);
}

/// The search as a scan from the first colour to the last.
int plain_closest(const Colours& colours, std::uint32_t wanted) {
    int best = 300;
    int candidate = 0;
    for (int i = 0; i < 256; ++i) {
        const std::uint32_t entry = colours[static_cast<std::size_t>(i)];
        if (entry == wanted) {
            return i;
        }
        int distance = 0;
        for (const int shift : {16, 8, 0}) {
            distance += std::abs((channel(entry, shift) - channel(wanted, shift)) * 100 / 255);
        }
        if (distance < best) {
            best = distance;
            candidate = i;
        }
    }
    return candidate;
}

Colours colours_of(const ColorPalette& palette) {
    Colours colours = {};
    palette.ToMemory(colours.data());
    return colours;
}

TEST(DefaultPalette, IsMadeOfBasicColoursHuesAndGreys) {
    std::vector<std::uint32_t> expected = {0x0000FF, 0x00FFFF, 0x00FF00, 0xFFFF00, 0xFF0000,
                                           0xFF00FF, 0xFFFFFF, 0x808080, 0xC0C0C0};
    // From red to yellow, green, cyan, blue, magenta and back: one channel leads, and a second one goes up or
    // down by quarters of it. Each of five levels comes in the full colour and, after it, with the other
    // channels halfway to the leading one, all cut to whole numbers.
    const struct {
        int leading, moving;  // places of the channels' bits
    } sixths[] = {{0, 8}, {8, 0}, {8, 16}, {16, 8}, {16, 0}, {0, 16}};
    for (int group = 0; group < 24; ++group) {
        const auto [leading, moving] = sixths[group / 4];
        const int quarters = group / 4 % 2 == 0 ? group % 4 : 4 - group % 4;
        for (const int level : {255, 204, group < 4 ? 153 : 152, 127, 76}) {
            const int rise = level * quarters / 4;
            const int full = level << leading | rise << moving;
            const int paler =
                level << leading | (rise + level) / 2 << moving | level / 2 << (24 - leading - moving);
            expected.push_back(static_cast<std::uint32_t>(full));
            expected.push_back(static_cast<std::uint32_t>(paler));
        }
    }
    for (const std::uint32_t grey : {0U, 51U, 91U, 132U, 173U, 214U, 255U}) {
        expected.push_back(grey * 0x010101);
    }
    const Colours colours = colours_of(ColorPalette());
    EXPECT_EQ(std::vector(colours.begin(), colours.end()), expected);
    EXPECT_EQ(ColorPalette()[9], colours[9]);
}

TEST(Palette, SaysItsRanges) {
    EXPECT_EQ(ColorPalette::GetSize(), 256U);
    EXPECT_EQ(ColorPalette()[ColorPalette::GetWhiteColorIndex()], 0xFFFFFFU);
    EXPECT_EQ(ColorPalette::GetSecondPaletteStartIndex(), 0);
    EXPECT_EQ(ColorPalette::GetSecondPaletteEndIndex() + 1, ColorPalette::GetLargePaletteStartIndex());
    EXPECT_EQ(ColorPalette::GetLargePaletteStartIndex() + 24 * 10, ColorPalette::GetThirdPaletteStartIndex());
    EXPECT_EQ(ColorPalette::GetLargePaletteEndIndex() + 1, ColorPalette::GetThirdPaletteStartIndex());
    EXPECT_EQ(ColorPalette::GetThirdPaletteEndIndex(), 254);
    static_assert(sizeof(ColorPalette) == 1024);
}

TEST(Palette, GoesThroughMemory) {
    Colours colours = {};
    for (std::uint32_t i = 0; i < 256; ++i) {
        colours[i] = i * 0x01010101U;
    }
    ColorPalette palette;
    palette.FromMemory(colours.data());
    ColorPalette other;
    other = palette;
    EXPECT_EQ(colours_of(other), colours);
    EXPECT_NE(colours_of(ColorPalette()), colours);
}

TEST(ClosestColour, IsTheFirstOfTheNearest) {
    Colours colours;
    colours.fill(0x01FFFFFF);
    ColorPalette white;
    white.FromMemory(colours.data());
    EXPECT_EQ(white.FindClosestColor(0), 0);  // nothing nearer than the greatest distance
    colours[7] = 0x02FFFFFF;
    white.FromMemory(colours.data());
    EXPECT_EQ(white.FindClosestColor(0x02FFFFFF), 7);  // entry 0 is at distance 0, 7 is equal
}

TEST(ClosestColour, AgreesWithTheScan) {
    std::mt19937 random(17);
    SCOPED_TRACE("seed 17");
    for (int round = 0; round < 400; ++round) {
        ColorPalette palette;
        if (round % 2 == 1) {
            // Few levels make equal distances and equal colours common; the high byte counts for equality
            // alone.
            const std::uint32_t mask = round % 4 == 1 ? 0x01030303U : 0x80FFFFFFU;
            Colours colours = {};
            for (std::uint32_t& colour : colours) {
                colour = static_cast<std::uint32_t>(random()) & mask;
            }
            palette.FromMemory(colours.data());
        }
        const Colours colours = colours_of(palette);
        for (int i = 0; i < 200; ++i) {
            const auto drawn = static_cast<std::uint32_t>(random());
            const std::uint32_t wanted =
                i % 2 == 0 ? colours[drawn & 0xFF] ^ (drawn >> 31) : drawn & 0x01FFFFFF;
            const int expected = plain_closest(colours, wanted);
            ASSERT_EQ(palette.FindClosestColor(wanted), expected) << std::hex << wanted;
            ASSERT_EQ(basalt::graphics::closest_colour_portable(colours.data(), wanted), expected);
        }
    }
}

TEST(ComplementaryColour, IsDarkOverLight) {
    EXPECT_EQ(_complementarycolor(0x808080), 0xFFFFFFU);
    for (const std::uint32_t lighter : {0x818080U, 0x808180U, 0x808081U}) {
        EXPECT_EQ(_complementarycolor(lighter), 0x505050U);
    }
    EXPECT_EQ(_complementarycolor(0xFF000000), 0xFFFFFFU);
}

}  // namespace
