/// @file
/// The colour palette: 256 colours by an index of one byte, and back. basalt/graphics.h has what holds for
/// all of graphics.
#ifndef BASALT_GRAPHICS_PALETTE_H
#define BASALT_GRAPHICS_PALETTE_H

#include <cstdint>

#include "basalt/export.h"

/// 256 colours, initially those of the default table: nine basic colours (the second palette), 240 hues and
/// shades (the large one), six greys (the third) and white.
///
/// Threads: any number may read a palette; a writer excludes all others.
class BASALT_API ColorPalette {
public:
    /// A palette of the default colours.
    ColorPalette();
    /// A palette of the same colours.
    ColorPalette(const ColorPalette& other) = default;
    ~ColorPalette() = default;

    /// Copies all 256 colours.
    ColorPalette& operator=(const ColorPalette& other) = default;

    /// Colour at an index.
    std::uint32_t operator[](unsigned char index) const;

    /// Index of the colour nearest to another one.
    /// @param colour 0x00BBGGRR
    /// @return the first entry equal to it in all 32 bits; without one, the first at the least distance: the
    /// sum over the three channels of the difference in hundredths of 255, truncated. 0 when every entry
    /// differs by 255 in all channels.
    unsigned char FindClosestColor(std::uint32_t colour) const;

    /// Replaces all colours.
    /// @param colours 256 colours
    void FromMemory(const std::uint32_t* colours);

    /// Writes all colours out.
    /// @param[out] colours buffer of 256 colours
    void ToMemory(std::uint32_t* colours) const;

    /// Number of colours: 256.
    static std::uint64_t GetSize();
    /// Index of white: 6.
    static unsigned char GetWhiteColorIndex();
    /// First index of the basic colours: 0.
    static int GetSecondPaletteStartIndex();
    /// Last index of the basic colours: 8.
    static int GetSecondPaletteEndIndex();
    /// First index of the hues and shades: 9.
    static int GetLargePaletteStartIndex();
    /// Last index of the hues and shades: 248.
    static int GetLargePaletteEndIndex();
    /// First index of the greys: 249.
    static int GetThirdPaletteStartIndex();
    /// Last index of the greys: 254.
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

/// Colour for text over a background: dark grey 0x505050 where red + green + blue > 384,
/// else white.
/// @param colour background, 0x00BBGGRR
/// Threads: reentrant.
BASALT_API std::uint32_t _complementarycolor(std::uint32_t colour);

#endif
