#include "basalt/graphics/palette.h"

#include <algorithm>

#include "src/graphics/closest_colour.h"

namespace {

constexpr unsigned char WHITE_INDEX = 6;
constexpr std::uint32_t DARK_GREY = 0x505050;
constexpr std::uint32_t WHITE = 0xFFFFFF;
constexpr std::uint32_t BRIGHT = 384;

}  // namespace

ColorPalette::ColorPalette() {
    FromMemory(DefaultColorPalette);
}

std::uint32_t ColorPalette::operator[](unsigned char index) const {
    return m_colours[index];
}

unsigned char ColorPalette::FindClosestColor(std::uint32_t colour) const {
    return basalt::graphics::closest_colour(m_colours, colour);
}

void ColorPalette::FromMemory(const std::uint32_t* colours) {
    std::copy_n(colours, PALETTE_SIZE, m_colours);
}

void ColorPalette::ToMemory(std::uint32_t* colours) const {
    std::copy_n(m_colours, PALETTE_SIZE, colours);
}

std::uint64_t ColorPalette::GetSize() {
    return PALETTE_SIZE;
}

unsigned char ColorPalette::GetWhiteColorIndex() {
    return WHITE_INDEX;
}

int ColorPalette::GetSecondPaletteStartIndex() {
    return PALETTE_SECOND_START_INDEX;
}

int ColorPalette::GetSecondPaletteEndIndex() {
    return PALETTE_SECOND_END_INDEX;
}

int ColorPalette::GetLargePaletteStartIndex() {
    return PALETTE_LARGE_START_INDEX;
}

int ColorPalette::GetLargePaletteEndIndex() {
    return PALETTE_LARGE_END_INDEX;
}

int ColorPalette::GetThirdPaletteStartIndex() {
    return PALETTE_THIRD_START_INDEX;
}

int ColorPalette::GetThirdPaletteEndIndex() {
    return PALETTE_THIRD_END_INDEX;
}

std::uint32_t _complementarycolor(std::uint32_t colour) {
    const std::uint32_t sum = (colour & 0xFF) + (colour >> 8 & 0xFF) + (colour >> 16 & 0xFF);
    return sum > BRIGHT ? DARK_GREY : WHITE;
}
