#include "src/util/hex_codec.h"

#include <cstdint>
#include <cstring>

#if BASALT_HAS_VECTOR_HEX
#include <immintrin.h>
#define BASALT_AVX2 [[gnu::target("avx2")]]
#endif

namespace basalt::util {

#if BASALT_HAS_VECTOR_HEX

// The same in both widths:
//  - A nibble n becomes '0' + n, plus 'a' - '0' - 10 if n > 9.
//  - A character's value is the smaller of its values as a decimal digit and as a letter. Saturating
//    arithmetic makes each of them 16 or more for any other character.
//  - A pair of values becomes a byte in 16-bit lanes, with the first character in the low half.
// The last block overlaps the one before.

namespace {

void store_4(void* to, __m128i lanes) {
    const std::int32_t word = _mm_cvtsi128_si32(lanes);
    std::memcpy(to, &word, sizeof word);
}
__m128i load_8(const void* from) {
    return _mm_loadl_epi64(static_cast<const __m128i*>(from));
}
void store_8(void* to, __m128i lanes) {
    _mm_storel_epi64(static_cast<__m128i*>(to), lanes);
}
__m128i load_16(const void* from) {
    return _mm_loadu_si128(static_cast<const __m128i*>(from));
}
void store_16(void* to, __m128i lanes) {
    _mm_storeu_si128(static_cast<__m128i*>(to), lanes);
}
__m128i upper_8(__m128i lanes) {
    return _mm_unpackhi_epi64(lanes, lanes);
}

// Converts sixteen digits and accumulates the largest values in `largest`.
__m128i to_pairs(__m128i c, __m128i& largest) {
    const __m128i at_top =
        _mm_subs_epu8(_mm_add_epi8(c, _mm_set1_epi8(static_cast<char>(0xFF - '9'))), _mm_set1_epi8(6));
    const __m128i decimal = _mm_sub_epi8(at_top, _mm_set1_epi8(static_cast<char>(0xF0)));
    const __m128i from_a =
        _mm_sub_epi8(_mm_and_si128(c, _mm_set1_epi8(static_cast<char>(0xDF))), _mm_set1_epi8('A'));
    const __m128i value = _mm_min_epu8(decimal, _mm_adds_epu8(from_a, _mm_set1_epi8(10)));
    largest = _mm_max_epu8(largest, value);
    const __m128i high = _mm_and_si128(_mm_slli_epi16(value, 4), _mm_set1_epi16(0xF0));
    return _mm_or_si128(high, _mm_srli_epi16(value, 8));
}

bool are_digits(__m128i largest) {
    const __m128i too_large = _mm_subs_epu8(largest, _mm_set1_epi8(15));
    return _mm_movemask_epi8(_mm_cmpeq_epi8(too_large, _mm_setzero_si128())) == 0xFFFF;
}

}  // namespace

void encode_hex_sse2(const unsigned char* bytes, std::size_t count, char* digits) {
    const __m128i nibble = _mm_set1_epi8(0x0F);
    const auto to_digits = [](__m128i n) {
        const __m128i is_letter = _mm_cmpgt_epi8(n, _mm_set1_epi8(9));
        return _mm_add_epi8(_mm_add_epi8(n, _mm_set1_epi8('0')),
                            _mm_and_si128(is_letter, _mm_set1_epi8('a' - '0' - 10)));
    };
    std::size_t done = 0;
    for (; count - done >= 16; done += 16) {
        const __m128i block = load_16(bytes + done);
        const __m128i high = to_digits(_mm_and_si128(_mm_srli_epi16(block, 4), nibble));
        const __m128i low = to_digits(_mm_and_si128(block, nibble));
        store_16(digits + 2 * done, _mm_unpacklo_epi8(high, low));
        store_16(digits + 2 * done + 16, _mm_unpackhi_epi8(high, low));
    }
    encode_hex_portable(bytes + done, count - done, digits + 2 * done);
}

bool decode_hex_sse2(const char* digits, std::size_t count, unsigned char* bytes) {
    if (count < 4) {
        return decode_hex_portable(digits, count, bytes);
    }
    __m128i largest = _mm_setzero_si128();
    if (count < 8) {
        const std::size_t last = count - 4;
        const __m128i both = _mm_unpacklo_epi64(load_8(digits), load_8(digits + 2 * last));
        const __m128i pairs = to_pairs(both, largest);
        const __m128i packed = _mm_packus_epi16(pairs, pairs);
        store_4(bytes, packed);
        store_4(bytes + last, _mm_srli_epi64(packed, 32));
        return are_digits(largest);
    }
    if (count < 16) {
        const std::size_t last = count - 8;
        const __m128i first = to_pairs(load_16(digits), largest);
        const __m128i packed = _mm_packus_epi16(first, to_pairs(load_16(digits + 2 * last), largest));
        store_8(bytes, packed);
        store_8(bytes + last, upper_8(packed));
        return are_digits(largest);
    }
    const auto block = [&](std::size_t at) {
        const __m128i first = to_pairs(load_16(digits + 2 * at), largest);
        const __m128i second = to_pairs(load_16(digits + 2 * at + 16), largest);
        store_16(bytes + at, _mm_packus_epi16(first, second));
    };
    for (std::size_t done = 0; done + 16 < count; done += 16) {
        block(done);
    }
    block(count - 16);
    return are_digits(largest);
}

BASALT_AVX2 void encode_hex_avx2(const unsigned char* bytes, std::size_t count, char* digits) {
    const __m256i nibble = _mm256_set1_epi8(0x0F);
    // Looks up each nibble's digit by shuffling.
    const __m256i table = _mm256_broadcastsi128_si256(
        _mm_setr_epi8('0', '1', '2', '3', '4', '5', '6', '7', '8', '9', 'a', 'b', 'c', 'd', 'e', 'f'));
    std::size_t done = 0;
    for (; count - done >= 32; done += 32) {
        __m256i block = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(bytes + done));
        // Unpacking works on each half separately, so the middle quarters are swapped first.
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

// As to_pairs(), with 32 digits.
BASALT_AVX2 inline __m256i to_pairs_avx2(__m256i c, __m256i& largest) {
    const __m256i at_top = _mm256_subs_epu8(
        _mm256_add_epi8(c, _mm256_set1_epi8(static_cast<char>(0xFF - '9'))), _mm256_set1_epi8(6));
    const __m256i decimal = _mm256_sub_epi8(at_top, _mm256_set1_epi8(static_cast<char>(0xF0)));
    const __m256i from_a = _mm256_sub_epi8(_mm256_and_si256(c, _mm256_set1_epi8(static_cast<char>(0xDF))),
                                           _mm256_set1_epi8('A'));
    const __m256i value = _mm256_min_epu8(decimal, _mm256_adds_epu8(from_a, _mm256_set1_epi8(10)));
    largest = _mm256_max_epu8(largest, value);
    return _mm256_maddubs_epi16(value, _mm256_set1_epi16(0x0110));
}

}  // namespace

BASALT_AVX2 bool decode_hex_avx2(const char* digits, std::size_t count, unsigned char* bytes) {
    __m256i largest = _mm256_setzero_si256();
    std::size_t done = 0;
    for (; count - done >= 32; done += 32) {
        const auto* const in = reinterpret_cast<const __m256i*>(digits + 2 * done);
        const __m256i first = to_pairs_avx2(_mm256_loadu_si256(in), largest);
        const __m256i second = to_pairs_avx2(_mm256_loadu_si256(in + 1), largest);
        const __m256i packed = _mm256_packus_epi16(first, second);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(bytes + done),
                            _mm256_permute4x64_epi64(packed, 0b11'01'10'00));
    }
    const bool rest = decode_hex_sse2(digits + 2 * done, count - done, bytes + done);
    return rest &&
           are_digits(_mm_max_epu8(_mm256_castsi256_si128(largest), _mm256_extracti128_si256(largest, 1)));
}

#endif

}  // namespace basalt::util
