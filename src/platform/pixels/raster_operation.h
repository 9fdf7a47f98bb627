// Raster operations: what a copy makes of brush, source and destination, bit by bit.
#ifndef BASALT_SRC_PLATFORM_PIXELS_RASTER_OPERATION_H
#define BASALT_SRC_PLATFORM_PIXELS_RASTER_OPERATION_H

#include <cstddef>
#include <cstdint>
#include <span>

#include "basalt/platform/types.h"

namespace basalt::platform {

class RasterOperation {
public:
    // Bits 16 to 23 of the code are its truth table: the bit numbered brush * 4 + source * 2 + destination.
    constexpr explicit RasterOperation(DWORD code) : m_table(code >> 16 & 0xFF) {}

    // Whether the result depends on each of the three: their two halves of the table differ.
    constexpr bool needs_brush() const { return ((m_table >> 4 ^ m_table) & 0x0F) != 0; }
    constexpr bool needs_source() const { return ((m_table >> 2 ^ m_table) & 0x33) != 0; }
    constexpr bool needs_destination() const { return ((m_table >> 1 ^ m_table) & 0x55) != 0; }
    constexpr bool is_copy() const { return m_table == 0xCC; }

    // Combines values into those of the source.
    void combine(std::span<std::uint32_t> source, const std::uint32_t* destination,
                 std::uint32_t brush) const {
        switch (m_table) {
            case 0x88:
                for (std::size_t i = 0; i < source.size(); ++i) {
                    source[i] &= destination[i];
                }
                break;
            case 0xEE:
                for (std::size_t i = 0; i < source.size(); ++i) {
                    source[i] |= destination[i];
                }
                break;
            default:
                for (std::size_t i = 0; i < source.size(); ++i) {
                    source[i] = combined(brush, source[i], destination[i]);
                }
        }
    }

private:
    // The union of the table's terms: where all three are as a term's number says.
    constexpr std::uint32_t combined(std::uint32_t brush, std::uint32_t source,
                                     std::uint32_t destination) const {
        std::uint32_t result = 0;
        for (std::uint32_t term = 0; term < 8; ++term) {
            if ((m_table >> term & 1) != 0) {
                result |= ((term & 4) != 0 ? brush : ~brush) & ((term & 2) != 0 ? source : ~source) &
                          ((term & 1) != 0 ? destination : ~destination);
            }
        }
        return result;
    }

    std::uint32_t m_table;
};

}  // namespace basalt::platform

#endif
