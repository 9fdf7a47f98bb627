#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <span>

#include "basalt/graphics/bitmap_functions.h"
#include "src/platform/raster_extras.h"

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

namespace basalt::graphics {

namespace {

/// Pixels that are compared with the key at a time, a bit of a word each.
constexpr std::size_t WORD_BITS = 64;
/// Pixels read at a time, on the stack: a bitmap may have a row of 2^31 pixels.
constexpr std::size_t PIECE = 64 * WORD_BITS;

/// One bit a pixel, the first in bit 0: whether it differs from the key.
std::uint64_t opaque_bits(std::span<const std::uint32_t> pixels, std::uint32_t key) {
    std::uint64_t bits = 0;
    for (std::size_t i = 0; i < pixels.size(); ++i) {
        bits |= std::uint64_t{pixels[i] != key} << i;
    }
    return bits;
}

/// The same for 64 pixels.
std::uint64_t opaque_word(const std::uint32_t* pixels, std::uint32_t key) {
#if defined(__SSE2__)
    const __m128i keys = _mm_set1_epi32(static_cast<int>(key));
    const auto equal = [keys](const std::uint32_t* four) {
        return _mm_cmpeq_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i*>(four)), keys);
    };
    std::uint64_t equal_bits = 0;
    for (std::size_t i = 0; i < WORD_BITS; i += 16) {
        const std::uint32_t* const at = pixels + i;
        const __m128i low = _mm_packs_epi32(equal(at), equal(at + 4));
        const __m128i high = _mm_packs_epi32(equal(at + 8), equal(at + 12));
        const auto bits = static_cast<unsigned>(_mm_movemask_epi8(_mm_packs_epi16(low, high)));
        equal_bits |= std::uint64_t{bits} << i;
    }
    return ~equal_bits;
#else
    return opaque_bits(std::span(pixels, WORD_BITS), key);
#endif
}

/// Adds the runs of one row of opaque pixels, given 64 at a time, to a band.
class RunCollector {
public:
    explicit RunCollector(platform::BandBuilder& band) : m_band(band) {}

    /// The next pixels, from a column on; bits behind the row's end are 0.
    void add(int column, std::uint64_t opaque) {
        // A bit wherever a pixel differs from the one before.
        std::uint64_t changes = opaque ^ (opaque << 1 | std::uint64_t{m_is_open});
        for (; changes != 0; changes &= changes - 1) {
            toggle(column + std::countr_zero(changes));
        }
    }
    void end_row(int width) {
        if (m_is_open) {
            toggle(width);
        }
    }

private:
    void toggle(int column) {
        if (m_is_open) {
            m_band.add(m_left, column);
        }
        m_left = column;
        m_is_open = !m_is_open;
    }

    platform::BandBuilder& m_band;
    bool m_is_open = false;
    int m_left = 0;
};

/// Adds the runs of a row; false when it cannot be read.
bool add_row(HBITMAP bitmap, int row, int width, std::uint32_t key, platform::BandBuilder& band) {
    RunCollector runs(band);
    std::uint32_t pixels[PIECE];
    for (int column = 0; column < width;) {
        const std::size_t size = std::min(PIECE, static_cast<std::size_t>(width - column));
        if (!platform::read_row(bitmap, row, column, std::span(pixels, size))) {
            return false;
        }
        std::size_t i = 0;
        for (; i + WORD_BITS <= size; i += WORD_BITS) {
            runs.add(column + static_cast<int>(i), opaque_word(pixels + i, key));
        }
        if (i < size) {
            runs.add(column + static_cast<int>(i), opaque_bits(std::span(pixels + i, size - i), key));
        }
        column += static_cast<int>(size);
    }
    runs.end_row(width);
    return true;
}

}  // namespace

}  // namespace basalt::graphics

namespace vex_util::mfc {

bool RegionFromBitmap(CRgn& region, CBitmap& bitmap, unsigned long transparentColour) {
    BITMAP record = {};
    if (region.GetSafeHandle() != nullptr || transparentColour > std::numeric_limits<COLORREF>::max() ||
        bitmap.GetBitmap(&record) == 0) {
        return false;
    }
    const std::uint32_t key =
        basalt::platform::row_value(record.bmBitsPixel, static_cast<COLORREF>(transparentColour));
    basalt::platform::BandBuilder rows;
    for (int row = 0; row < record.bmHeight; ++row) {
        rows.begin(row, row + 1);
        if (!basalt::graphics::add_row(bitmap, row, record.bmWidth, key, rows)) {
            return false;
        }
        rows.end();
    }
    return region.Attach(basalt::platform::create_region(rows.take())) != 0;
}

}  // namespace vex_util::mfc
