// Hexadecimal text by a plain table loop, for comparison in the benchmark.
#ifndef BASALT_BENCH_PLAIN_HEX_H
#define BASALT_BENCH_PLAIN_HEX_H

#include <array>
#include <string>
#include <vector>

namespace plain {

[[gnu::noinline]] inline std::string encode_hex(const std::vector<unsigned char>& bytes) {
    static constexpr char DIGITS[] = "0123456789abcdef";
    std::string text(2 * bytes.size(), '\0');
    char* out = text.data();
    for (const unsigned char byte : bytes) {
        *out++ = DIGITS[byte >> 4];
        *out++ = DIGITS[byte & 15];
    }
    return text;
}

// The characters are digits.
[[gnu::noinline]] inline std::vector<unsigned char> decode_hex(const std::string& text) {
    static constexpr std::array<unsigned char, 256> VALUES = [] {
        std::array<unsigned char, 256> values{};
        for (unsigned char n = 0; n < 10; ++n) {
            values['0' + n] = n;
        }
        for (unsigned char n = 0; n < 6; ++n) {
            values['a' + n] = values['A' + n] = static_cast<unsigned char>(10 + n);
        }
        return values;
    }();
    std::vector<unsigned char> bytes(text.size() / 2);
    const char* in = text.data();
    for (unsigned char& byte : bytes) {
        const unsigned char high = VALUES[static_cast<unsigned char>(*in++)];
        byte = static_cast<unsigned char>(high << 4 | VALUES[static_cast<unsigned char>(*in++)]);
    }
    return bytes;
}

}  // namespace plain

#endif
