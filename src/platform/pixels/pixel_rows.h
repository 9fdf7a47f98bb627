// Rows of pixels as surfaces store them, at any depth: 1 bit with the left pixel in bit 7, 4 bits with the
// left one in the high nibble, 24 bits as blue, green, red; 16 and 32 bits in the machine's byte order.
#ifndef BASALT_SRC_PLATFORM_PIXELS_PIXEL_ROWS_H
#define BASALT_SRC_PLATFORM_PIXELS_PIXEL_ROWS_H

#include <cstddef>
#include <cstdint>
#include <span>

namespace basalt::platform {

// Pixels unpacked at a time, on the stack.
inline constexpr int PIECE = 512;

// Reads pixels from column x on.
void read_pixels(int depth, const std::byte* row, int x, std::span<std::uint32_t> values);
// Writes pixels from column x on; of the values, the bits that the depth stores.
void write_pixels(int depth, std::byte* row, int x, std::span<const std::uint32_t> values);
// Writes one value to a number of pixels.
void fill_pixels(int depth, std::byte* row, int x, int count, std::uint32_t value);
// Copies pixels; both rows may be the same one and the ranges may overlap.
void copy_pixels(int depth, std::byte* to, int to_x, const std::byte* from, int from_x, int count);

// One pixel.
std::uint32_t read_pixel(int depth, const std::byte* row, int x);

// Calls piece(offset, count) for pieces that make up `count` pixels: from the left, or from the right where a
// piece would overwrite what one to its left has yet to read.
template <typename Piece>
void in_pieces(int count, bool from_right, const Piece& piece) {
    for (int done = 0; done < count;) {
        const int size = count - done < PIECE ? count - done : PIECE;
        piece(from_right ? count - done - size : done, size);
        done += size;
    }
}

}  // namespace basalt::platform

#endif
