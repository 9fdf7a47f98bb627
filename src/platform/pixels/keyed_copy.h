// A copy of 32-bit pixels that leaves one colour out.
#ifndef BASALT_SRC_PLATFORM_PIXELS_KEYED_COPY_H
#define BASALT_SRC_PLATFORM_PIXELS_KEYED_COPY_H

#include <cstddef>
#include <cstdint>

namespace basalt::platform {

// Copies words except those whose low 24 bits are the key's. The ranges do not overlap. The portable form has
// the same result.
void copy_words_but_key(std::uint32_t* to, const std::uint32_t* from, std::size_t count, std::uint32_t key);
void copy_words_but_key_portable(std::uint32_t* to, const std::uint32_t* from, std::size_t count,
                                 std::uint32_t key);

}  // namespace basalt::platform

#endif
