// The loops that work through whole screens: each in a form of eight pixels at once, where the processor has
// it, and a portable one with the same result.
#ifndef BASALT_SRC_PLATFORM_PIXELS_ROW_KERNELS_H
#define BASALT_SRC_PLATFORM_PIXELS_ROW_KERNELS_H

#include <cstddef>
#include <cstdint>

namespace basalt::platform {

// Writes one word to `count` places.
void fill_words(std::uint32_t* to, std::size_t count, std::uint32_t word);

// Copies words but those whose low 24 bits are the key's. The ranges do not overlap.
void copy_words_but_key(std::uint32_t* to, const std::uint32_t* from, std::size_t count, std::uint32_t key);
void copy_words_but_key_portable(std::uint32_t* to, const std::uint32_t* from, std::size_t count,
                                 std::uint32_t key);

}  // namespace basalt::platform

#endif
