// Bytes to hexadecimal digits and back, portable and by SIMD. All forms return the same for every input.
#ifndef BASALT_SRC_UTIL_HEX_CODEC_H
#define BASALT_SRC_UTIL_HEX_CODEC_H

#include <array>
#include <cstddef>
#include <cstring>

#if defined(__x86_64__)
#define BASALT_HAS_VECTOR_HEX 1
#else
#define BASALT_HAS_VECTOR_HEX 0
#endif

namespace basalt::util {

inline constexpr std::array<std::array<char, 2>, 256> DIGITS_OF_BYTE = [] {
    constexpr char DIGITS[] = "0123456789abcdef";
    std::array<std::array<char, 2>, 256> digits{};
    for (std::size_t byte = 0; byte < digits.size(); ++byte) {
        digits[byte] = {DIGITS[byte >> 4], DIGITS[byte & 0xF]};
    }
    return digits;
}();

inline constexpr unsigned char NO_DIGIT = 0xFF;

inline constexpr std::array<unsigned char, 256> VALUE_OF_DIGIT = [] {
    std::array<unsigned char, 256> values{};
    for (auto& value : values) {
        value = NO_DIGIT;
    }
    for (unsigned char n = 0; n < 16; ++n) {
        values[static_cast<std::size_t>(n < 10 ? '0' + n : 'a' + n - 10)] = n;
        values[static_cast<std::size_t>(n < 10 ? '0' + n : 'A' + n - 10)] = n;
    }
    return values;
}();

inline void encode_hex_portable(const unsigned char* bytes, std::size_t count, char* digits) {
    for (std::size_t i = 0; i < count; ++i) {
        std::memcpy(digits + 2 * i, DIGITS_OF_BYTE[bytes[i]].data(), 2);
    }
}

inline bool decode_hex_portable(const char* digits, std::size_t count, unsigned char* bytes) {
    unsigned all = 0;
    for (std::size_t i = 0; i < count; ++i) {
        const unsigned high = VALUE_OF_DIGIT[static_cast<unsigned char>(digits[2 * i])];
        const unsigned low = VALUE_OF_DIGIT[static_cast<unsigned char>(digits[2 * i + 1])];
        all |= high | low;
        bytes[i] = static_cast<unsigned char>(high << 4 | low);
    }
    return all < 16;
}

#if BASALT_HAS_VECTOR_HEX
// 16 bytes at a time; available on every processor of this architecture.
void encode_hex_sse2(const unsigned char* bytes, std::size_t count, char* digits);
bool decode_hex_sse2(const char* digits, std::size_t count, unsigned char* bytes);
// 32 bytes at a time; only where __builtin_cpu_supports("avx2").
void encode_hex_avx2(const unsigned char* bytes, std::size_t count, char* digits);
bool decode_hex_avx2(const char* digits, std::size_t count, unsigned char* bytes);

inline bool can_use_avx2() {
    return __builtin_cpu_supports("avx2") != 0;
}
#endif

// Writes two lower-case digits for each byte, high nibble first.
inline void encode_hex(const unsigned char* bytes, std::size_t count, char* digits) {
#if BASALT_HAS_VECTOR_HEX
    if (count >= 32) {
        return can_use_avx2() ? encode_hex_avx2(bytes, count, digits) : encode_hex_sse2(bytes, count, digits);
    }
#endif
    encode_hex_portable(bytes, count, digits);
}

// Reads `count` pairs of digits, of either case. False, with the output unspecified, if a character is not a
// digit.
inline bool decode_hex(const char* digits, std::size_t count, unsigned char* bytes) {
#if BASALT_HAS_VECTOR_HEX
    return count >= 32 && can_use_avx2() ? decode_hex_avx2(digits, count, bytes)
                                         : decode_hex_sse2(digits, count, bytes);
#else
    return decode_hex_portable(digits, count, bytes);
#endif
}

}  // namespace basalt::util

#endif
