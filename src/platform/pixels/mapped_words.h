// Copies 32-bit pixels from the places that an affine map takes them to.
#ifndef BASALT_SRC_PLATFORM_PIXELS_MAPPED_WORDS_H
#define BASALT_SRC_PLATFORM_PIXELS_MAPPED_WORDS_H

#include <cstddef>
#include <cstdint>

#include "src/platform/pixels/affine.h"
#include "src/platform/pixels/surface.h"

namespace basalt::platform {

class MappedWords {
public:
    // Keeps references. from: 32 bits a pixel.
    MappedWords(const Surface& from, const AffineRows& rows);

    // Whether copy() reads several pixels at once; if not, tiles cost more than they gain.
    static bool can_gather();

    // Copies a run to a row of the destination. Runs are passed by reference: a copy on the stack is read
    // back by wider loads than wrote it, which stalls the processor at each run.
    void copy(const AffineRows::Run& run, std::uint32_t* row) const;
    void copy_portable(const AffineRows::Run& run, std::uint32_t* row) const;

private:
    static constexpr int LANES = 8;

    void copy_scalar(std::uint32_t* to, const std::uint32_t* end, std::uint64_t x, std::uint64_t y) const;
    void copy_avx2(const AffineRows::Run& run, std::uint32_t* row) const;

    const AffineRows& m_rows;
    const std::uint32_t* m_words;
    std::size_t m_row_words;
    // Steps to each lane, ordered so that the high halves of two vectors of four form eight in order.
    std::uint64_t m_lane_x[LANES];
    std::uint64_t m_lane_y[LANES];
    std::uintptr_t m_ahead;  // bytes from a pixel's source to that of the pixel four rows below
};

}  // namespace basalt::platform

#endif
