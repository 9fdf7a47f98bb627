/// @file
/// The colour palette: 256 colours for numbers of one byte, and back. What holds for all of graphics is said
/// in basalt/graphics.h.
#ifndef BASALT_GRAPHICS_PALETTE_H
#define BASALT_GRAPHICS_PALETTE_H

#include <cstdint>

#include "basalt/export.h"

/// 256 colours, at first those of the default table: nine basic colours (the second palette), 240 hues and
/// shades (the large one), six greys (the third) and white.
///
/// Threads: any number may read a palette; who writes one excludes all others.
class BASALT_API ColorPalette {
public:
    /// A palette of the default colours.
    ColorPalette();
    /// A palette of the same colours.
    ColorPalette(const ColorPalette& other) = default;
    ~ColorPalette() = default;

    /// Takes all 256 colours of another.
    ColorPalette& operator=(const ColorPalette& other) = default;

    /// Colour of a number.
    std::uint32_t operator[](unsigned char index) const;

    /// Number of the colour nearest to another one.
    /// @param colour 0x00BBGGRR
    /// @return the first entry equal to it in all 32 bits; without one, the first at the least distance: the
    /// sum over the three channels of the difference in whole hundredths of 255, cut. 0 when every entry
    /// differs by 255 in all channels.
    unsigned char FindClosestColor(std::uint32_t colour) const;

    /// Replaces all colours.
    /// @param colours 256 of them, any alignment a colour may have
    void FromMemory(const std::uint32_t* colours);

    /// Writes all colours out.
    /// @param[out] colours room for 256
    void ToMemory(std::uint32_t* colours) const;

    /// Count of colours: 256.
    static std::uint64_t GetSize();
    /// Number of white: 6.
    static unsigned char GetWhiteColorIndex();
    /// First number of the basic colours: 0.
    static int GetSecondPaletteStartIndex();
    /// Last number of the basic colours: 8.
    static int GetSecondPaletteEndIndex();
    /// First number of the hues and shades: 9.
    static int GetLargePaletteStartIndex();
    /// Last number of the hues and shades: 248.
    static int GetLargePaletteEndIndex();
    /// First number of the greys: 249.
    static int GetThirdPaletteStartIndex();
    /// Last number of the greys: 254.
    static int GetThirdPaletteEndIndex();

private:
    static const int PALETTE_SIZE = 256;
    static const int PALETTE_SECOND_START_INDEX = 0;
    static const int PALETTE_SECOND_END_INDEX = 8;
    static const int PALETTE_LARGE_START_INDEX = 9;
    static const int PALETTE_LARGE_END_INDEX = 248;
    static const int PALETTE_THIRD_START_INDEX = 249;
    static const int PALETTE_THIRD_END_INDEX = 254;

    static std::uint32_t DefaultColorPalette[PALETTE_SIZE];

    std::uint32_t m_colours[PALETTE_SIZE];
};

/// Colour for text over a background: dark grey 0x505050 where red, green and blue add up to more than 384,
/// else white.
/// @param colour background, 0x00BBGGRR
/// Threads: reentrant.
BASALT_API std::uint32_t _complementarycolor(std::uint32_t colour);

#endif
