#include "src/platform/pixels/mapped_words.h"

#include <bit>

#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace basalt::platform {

namespace {

constexpr int PLACE_BITS = AffineRows::PLACE_BITS;

const std::uint32_t* words_of(const Surface& surface) {
    return reinterpret_cast<const std::uint32_t*>(surface.bits.get());
}

}  // namespace

void copy_mapped_words_portable(const Surface& from, const AffineRows& rows, const AffineRows::Run& run,
                                std::uint32_t* row) {
    const std::uint32_t* const words = words_of(from);
    const std::size_t row_words = from.row_bytes / sizeof(std::uint32_t);
    std::uint64_t x = run.x;
    std::uint64_t y = run.y;
    for (int i = run.begin; i < run.end; ++i) {
        row[i] = words[(y >> PLACE_BITS) * row_words + (x >> PLACE_BITS)];
        x += rows.step_x();
        y += rows.step_y();
    }
}

#if defined(__x86_64__)

namespace {

constexpr int LANES = 8;

// Places of columns 0, 1, 4 and 5. With those of 2, 3, 6 and 7, their high halves are eight in order.
[[gnu::target("avx2")]] inline __m256i four_places(std::uint64_t place, std::uint64_t step) {
    const auto at = [=](unsigned column) { return std::bit_cast<long long>(place + column * step); };
    return _mm256_setr_epi64x(at(0), at(1), at(4), at(5));
}

[[gnu::target("avx2")]] inline __m256i high_halves(__m256i a, __m256i b) {
    return _mm256_castps_si256(_mm256_shuffle_ps(_mm256_castsi256_ps(a), _mm256_castsi256_ps(b), 0xDD));
}

// Pixels of a surface are fewer than 2^29, so that 32 bits number them.
[[gnu::target("avx2")]] void copy_avx2(const Surface& from, const AffineRows& rows,
                                       const AffineRows::Run& run, std::uint32_t* row) {
    const std::uint32_t* const words = words_of(from);
    const __m256i row_words = _mm256_set1_epi32(static_cast<int>(from.row_bytes / sizeof(std::uint32_t)));
    const __m256i step_x = _mm256_set1_epi64x(std::bit_cast<long long>(rows.step_x() * LANES));
    const __m256i step_y = _mm256_set1_epi64x(std::bit_cast<long long>(rows.step_y() * LANES));
    __m256i x_a = four_places(run.x, rows.step_x());
    __m256i x_b = four_places(run.x + 2 * rows.step_x(), rows.step_x());
    __m256i y_a = four_places(run.y, rows.step_y());
    __m256i y_b = four_places(run.y + 2 * rows.step_y(), rows.step_y());
    // The source of the pixel four rows below; any address may be prefetched.
    const auto in_four_rows = [](std::int64_t step) {
        return static_cast<std::uintptr_t>(step >> (PLACE_BITS - 2));
    };
    const std::uintptr_t ahead = reinterpret_cast<std::uintptr_t>(words) +
                                 in_four_rows(rows.row_step_y()) * from.row_bytes +
                                 in_four_rows(rows.row_step_x()) * sizeof(std::uint32_t);
    AffineRows::Run rest = run;
    rows.advance(rest, (run.end - run.begin) / LANES * LANES);
    for (int i = run.begin; i < rest.begin; i += LANES) {
        const __m256i at =
            _mm256_add_epi32(_mm256_mullo_epi32(high_halves(y_a, y_b), row_words), high_halves(x_a, x_b));
        const auto first = static_cast<std::uintptr_t>(_mm_cvtsi128_si32(_mm256_castsi256_si128(at)));
        _mm_prefetch(reinterpret_cast<const char*>(ahead + first * sizeof(std::uint32_t)), _MM_HINT_T0);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(row + i),
                            _mm256_i32gather_epi32(reinterpret_cast<const int*>(words), at, 4));
        x_a = _mm256_add_epi64(x_a, step_x);
        x_b = _mm256_add_epi64(x_b, step_x);
        y_a = _mm256_add_epi64(y_a, step_y);
        y_b = _mm256_add_epi64(y_b, step_y);
    }
    copy_mapped_words_portable(from, rows, rest, row);
}

}  // namespace

#endif

bool can_gather_words() {
#if defined(__x86_64__)
    return __builtin_cpu_supports("avx2") != 0;
#else
    return false;
#endif
}

void copy_mapped_words(const Surface& from, const AffineRows& rows, const AffineRows::Run& run,
                       std::uint32_t* row) {
#if defined(__x86_64__)
    if (can_gather_words()) {
        return copy_avx2(from, rows, run, row);
    }
#endif
    copy_mapped_words_portable(from, rows, run, row);
}

}  // namespace basalt::platform
