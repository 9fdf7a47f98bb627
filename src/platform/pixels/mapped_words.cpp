#include "src/platform/pixels/mapped_words.h"

#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace basalt::platform {

namespace {

constexpr int PLACE_BITS = AffineRows::PLACE_BITS;

}  // namespace

MappedWords::MappedWords(const Surface& from, const AffineRows& rows)
    : m_rows(rows),
      m_words(reinterpret_cast<const std::uint32_t*>(from.bits.get())),
      m_row_words(from.row_bytes / sizeof(std::uint32_t)) {
    constexpr unsigned ORDER[LANES] = {0, 1, 4, 5, 2, 3, 6, 7};
    for (int i = 0; i < LANES; ++i) {
        m_lane_x[i] = rows.step_x() * ORDER[i];
        m_lane_y[i] = rows.step_y() * ORDER[i];
    }
    const auto in_four_rows = [](std::int64_t per_row) {
        return static_cast<std::uintptr_t>(per_row >> (PLACE_BITS - 2));
    };
    m_ahead = in_four_rows(rows.row_step_y()) * from.row_bytes +
              in_four_rows(rows.row_step_x()) * sizeof(std::uint32_t);
}

inline void MappedWords::copy_scalar(std::uint32_t* to, const std::uint32_t* end, std::uint64_t x,
                                     std::uint64_t y) const {
    const std::uint64_t step_x = m_rows.step_x();
    const std::uint64_t step_y = m_rows.step_y();
    for (; to != end; ++to) {
        *to = m_words[(y >> PLACE_BITS) * m_row_words + (x >> PLACE_BITS)];
        x += step_x;
        y += step_y;
    }
}

void MappedWords::copy_portable(const AffineRows::Run& run, std::uint32_t* row) const {
    copy_scalar(row + run.begin, row + run.end, run.x, run.y);
}

#if defined(__x86_64__)

// Pixels of a surface are fewer than 2^29, so that 32 bits number them.
[[gnu::target("avx2")]] void MappedWords::copy_avx2(const AffineRows::Run& run, std::uint32_t* row) const {
    constexpr int HIGH_HALVES = 0xDD;
    const auto* const lane_x = reinterpret_cast<const __m256i*>(m_lane_x);
    const auto* const lane_y = reinterpret_cast<const __m256i*>(m_lane_y);
    const __m256i step_x = _mm256_set1_epi64x(static_cast<long long>(m_rows.step_x() * LANES));
    const __m256i step_y = _mm256_set1_epi64x(static_cast<long long>(m_rows.step_y() * LANES));
    const __m256i row_words = _mm256_set1_epi32(static_cast<int>(m_row_words));
    const __m256i begin_x = _mm256_set1_epi64x(static_cast<long long>(run.x));
    const __m256i begin_y = _mm256_set1_epi64x(static_cast<long long>(run.y));
    __m256i x_low = _mm256_add_epi64(begin_x, _mm256_loadu_si256(lane_x));
    __m256i x_high = _mm256_add_epi64(begin_x, _mm256_loadu_si256(lane_x + 1));
    __m256i y_low = _mm256_add_epi64(begin_y, _mm256_loadu_si256(lane_y));
    __m256i y_high = _mm256_add_epi64(begin_y, _mm256_loadu_si256(lane_y + 1));
    const std::uint32_t* const words = m_words;
    const std::uintptr_t ahead = reinterpret_cast<std::uintptr_t>(words) + m_ahead;
    const int groups = (run.end - run.begin) / LANES;
    std::uint32_t* to = row + run.begin;
    for (const std::uint32_t* const end = to + groups * LANES; to != end; to += LANES) {
        const __m256 columns =
            _mm256_shuffle_ps(_mm256_castsi256_ps(x_low), _mm256_castsi256_ps(x_high), HIGH_HALVES);
        const __m256 lines =
            _mm256_shuffle_ps(_mm256_castsi256_ps(y_low), _mm256_castsi256_ps(y_high), HIGH_HALVES);
        const __m256i at = _mm256_add_epi32(_mm256_mullo_epi32(_mm256_castps_si256(lines), row_words),
                                            _mm256_castps_si256(columns));
        // Any address may be prefetched. Hardware does not predict reads that change rows every few pixels.
        const auto first = static_cast<std::uintptr_t>(_mm_cvtsi128_si32(_mm256_castsi256_si128(at)));
        _mm_prefetch(reinterpret_cast<const char*>(ahead + first * sizeof(std::uint32_t)), _MM_HINT_T0);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(to),
                            _mm256_i32gather_epi32(reinterpret_cast<const int*>(words), at, 4));
        x_low = _mm256_add_epi64(x_low, step_x);
        x_high = _mm256_add_epi64(x_high, step_x);
        y_low = _mm256_add_epi64(y_low, step_y);
        y_high = _mm256_add_epi64(y_high, step_y);
    }
    const auto done = static_cast<std::uint64_t>(groups * LANES);
    copy_scalar(to, row + run.end, run.x + m_rows.step_x() * done, run.y + m_rows.step_y() * done);
}

#endif

bool MappedWords::can_gather() {
#if defined(__x86_64__)
    return __builtin_cpu_supports("avx2") != 0;
#else
    return false;
#endif
}

void MappedWords::copy(const AffineRows::Run& run, std::uint32_t* row) const {
#if defined(__x86_64__)
    if (can_gather()) {
        return copy_avx2(run, row);
    }
#endif
    copy_portable(run, row);
}

}  // namespace basalt::platform
