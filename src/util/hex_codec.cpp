#include "src/util/hex_codec.h"

#if BASALT_HAS_VECTOR_HEX
#include <immintrin.h>
#define BASALT_AVX2 [[gnu::target("avx2")]]
#endif

namespace basalt::util {

#if BASALT_HAS_VECTOR_HEX

// The lanes, the same in both widths:
//  - a nibble n becomes '0' + n, and 'a' - '0' - 10 more where n > 9;
//  - a character c is a digit when c - '0' < 10 or (c | 0x20) - 'a' < 6, unsigned: saturating subtraction of
//    the bound leaves 0. Its value is c & 0xF, and 9 more for a letter;
//  - a pair of values becomes a byte by a multiplication of 16-bit lanes: the first character is the low
//  half.

void encode_hex_sse2(const unsigned char* bytes, std::size_t count, char* digits) {
    const __m128i nibble = _mm_set1_epi8(0x0F);
    const auto to_digits = [](__m128i n) {
        const __m128i is_letter = _mm_cmpgt_epi8(n, _mm_set1_epi8(9));
        return _mm_add_epi8(_mm_add_epi8(n, _mm_set1_epi8('0')),
                            _mm_and_si128(is_letter, _mm_set1_epi8('a' - '0' - 10)));
    };
    std::size_t done = 0;
    for (; count - done >= 16; done += 16) {
        const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + done));
        const __m128i high = to_digits(_mm_and_si128(_mm_srli_epi16(block, 4), nibble));
        const __m128i low = to_digits(_mm_and_si128(block, nibble));
        auto* const out = reinterpret_cast<__m128i*>(digits + 2 * done);
        _mm_storeu_si128(out, _mm_unpacklo_epi8(high, low));
        _mm_storeu_si128(out + 1, _mm_unpackhi_epi8(high, low));
    }
    encode_hex_portable(bytes + done, count - done, digits + 2 * done);
}

bool decode_hex_sse2(const char* digits, std::size_t count, unsigned char* bytes) {
    __m128i bad = _mm_setzero_si128();
    const auto to_pairs = [&bad](__m128i c) {
        const __m128i from_0 = _mm_sub_epi8(c, _mm_set1_epi8('0'));
        const __m128i from_a = _mm_sub_epi8(_mm_or_si128(c, _mm_set1_epi8(0x20)), _mm_set1_epi8('a'));
        const __m128i is_decimal =
            _mm_cmpeq_epi8(_mm_subs_epu8(from_0, _mm_set1_epi8(9)), _mm_setzero_si128());
        const __m128i is_letter =
            _mm_cmpeq_epi8(_mm_subs_epu8(from_a, _mm_set1_epi8(5)), _mm_setzero_si128());
        bad = _mm_or_si128(bad, _mm_cmpeq_epi8(_mm_or_si128(is_decimal, is_letter), _mm_setzero_si128()));
        const __m128i value =
            _mm_add_epi8(_mm_and_si128(c, _mm_set1_epi8(0x0F)), _mm_and_si128(is_letter, _mm_set1_epi8(9)));
        const __m128i high = _mm_and_si128(_mm_slli_epi16(value, 4), _mm_set1_epi16(0xF0));
        return _mm_or_si128(high, _mm_srli_epi16(value, 8));
    };
    std::size_t done = 0;
    for (; count - done >= 16; done += 16) {
        const auto* const in = reinterpret_cast<const __m128i*>(digits + 2 * done);
        const __m128i first = to_pairs(_mm_loadu_si128(in));
        const __m128i second = to_pairs(_mm_loadu_si128(in + 1));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(bytes + done), _mm_packus_epi16(first, second));
    }
    const bool rest = decode_hex_portable(digits + 2 * done, count - done, bytes + done);
    return rest && _mm_movemask_epi8(bad) == 0;
}

BASALT_AVX2 void encode_hex_avx2(const unsigned char* bytes, std::size_t count, char* digits) {
    const __m256i nibble = _mm256_set1_epi8(0x0F);
    // Shuffling looks a nibble's digit up in one step.
    const __m256i table = _mm256_broadcastsi128_si256(
        _mm_setr_epi8('0', '1', '2', '3', '4', '5', '6', '7', '8', '9', 'a', 'b', 'c', 'd', 'e', 'f'));
    std::size_t done = 0;
    for (; count - done >= 32; done += 32) {
        __m256i block = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(bytes + done));
        // The halves are interleaved apart, so the middle quarters change places first.
        block = _mm256_permute4x64_epi64(block, 0b11'01'10'00);
        const __m256i high =
            _mm256_shuffle_epi8(table, _mm256_and_si256(_mm256_srli_epi16(block, 4), nibble));
        const __m256i low = _mm256_shuffle_epi8(table, _mm256_and_si256(block, nibble));
        auto* const out = reinterpret_cast<__m256i*>(digits + 2 * done);
        _mm256_storeu_si256(out, _mm256_unpacklo_epi8(high, low));
        _mm256_storeu_si256(out + 1, _mm256_unpackhi_epi8(high, low));
    }
    encode_hex_sse2(bytes + done, count - done, digits + 2 * done);
}

namespace {

struct Pairs {
    __m256i bytes;  // in 16-bit lanes
    __m256i bad;    // not 0 where a character is no digit
};

BASALT_AVX2 inline Pairs to_pairs_avx2(__m256i c) {
    const __m256i from_0 = _mm256_sub_epi8(c, _mm256_set1_epi8('0'));
    const __m256i from_a = _mm256_sub_epi8(_mm256_or_si256(c, _mm256_set1_epi8(0x20)), _mm256_set1_epi8('a'));
    const __m256i zero = _mm256_setzero_si256();
    const __m256i is_decimal = _mm256_cmpeq_epi8(_mm256_subs_epu8(from_0, _mm256_set1_epi8(9)), zero);
    const __m256i is_letter = _mm256_cmpeq_epi8(_mm256_subs_epu8(from_a, _mm256_set1_epi8(5)), zero);
    const __m256i value = _mm256_add_epi8(_mm256_and_si256(c, _mm256_set1_epi8(0x0F)),
                                          _mm256_and_si256(is_letter, _mm256_set1_epi8(9)));
    return {_mm256_maddubs_epi16(value, _mm256_set1_epi16(0x0110)),
            _mm256_cmpeq_epi8(_mm256_or_si256(is_decimal, is_letter), zero)};
}

}  // namespace

BASALT_AVX2 bool decode_hex_avx2(const char* digits, std::size_t count, unsigned char* bytes) {
    __m256i bad = _mm256_setzero_si256();
    std::size_t done = 0;
    for (; count - done >= 32; done += 32) {
        const auto* const in = reinterpret_cast<const __m256i*>(digits + 2 * done);
        const Pairs first = to_pairs_avx2(_mm256_loadu_si256(in));
        const Pairs second = to_pairs_avx2(_mm256_loadu_si256(in + 1));
        bad = _mm256_or_si256(bad, _mm256_or_si256(first.bad, second.bad));
        const __m256i packed = _mm256_packus_epi16(first.bytes, second.bytes);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(bytes + done),
                            _mm256_permute4x64_epi64(packed, 0b11'01'10'00));
    }
    const bool rest = decode_hex_sse2(digits + 2 * done, count - done, bytes + done);
    return rest && _mm256_testz_si256(bad, bad) != 0;
}

#endif

}  // namespace basalt::util
