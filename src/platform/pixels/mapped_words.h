// Copies 32-bit pixels from the places that an affine map takes them to.
#ifndef BASALT_SRC_PLATFORM_PIXELS_MAPPED_WORDS_H
#define BASALT_SRC_PLATFORM_PIXELS_MAPPED_WORDS_H

#include <cstdint>

#include "src/platform/pixels/affine.h"
#include "src/platform/pixels/surface.h"

namespace basalt::platform {

// Whether copy_mapped_words() reads several pixels at once; if not, tiles cost more than they gain.
bool can_gather_words();

// Copies a run to a row of the destination. By reference: a run copied on the stack is loaded in wider pieces
// than were stored, which stalls the processor at each run.
void copy_mapped_words(const Surface& from, const AffineRows& rows, const AffineRows::Run& run,
                       std::uint32_t* row);
void copy_mapped_words_portable(const Surface& from, const AffineRows& rows, const AffineRows::Run& run,
                                std::uint32_t* row);

}  // namespace basalt::platform

#endif
