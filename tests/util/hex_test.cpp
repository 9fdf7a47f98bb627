#include "basalt/util/hex.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <stdexcept>

#include "src/util/hex_codec.h"
#include "tests/util/plain_hex.h"

namespace {

using namespace basalt;
using namespace basalt::util;
using namespace std::string_literals;
using Bytes = std::vector<unsigned char>;

// One form of the codec for each row.
struct Form {
    const char* name;
    void (*encode)(const unsigned char*, std::size_t, char*);
    bool (*decode)(const char*, std::size_t, unsigned char*);
};

std::vector<Form> forms() {
    std::vector<Form> all = {{"chosen", encode_hex, decode_hex},
                             {"portable", encode_hex_portable, decode_hex_portable}};
#if BASALT_HAS_VECTOR_HEX
    all.push_back({"SSE2", encode_hex_sse2, decode_hex_sse2});
    if (can_use_avx2()) {
        all.push_back({"AVX2", encode_hex_avx2, decode_hex_avx2});
    }
#endif
    return all;
}

TEST(HexCodec, every_form_agrees_with_the_table_loop_at_every_length) {
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    for (const Form& form : forms()) {
        SCOPED_TRACE(form.name);
        for (std::size_t count = 0; count < 200; ++count) {
            Bytes bytes(count);
            std::generate(bytes.begin(), bytes.end(), [&] { return static_cast<unsigned char>(random()); });
            const std::string expected = plain::encode_hex(bytes);
            std::string digits(2 * count + 1, '?');
            form.encode(bytes.data(), count, digits.data());
            ASSERT_EQ(digits, expected + '?');
            for (char& digit : digits) {
                digit = random() % 2 == 0 ? static_cast<char>(std::toupper(digit)) : digit;
            }
            Bytes decoded(count, 0xA5);
            ASSERT_TRUE(form.decode(digits.data(), count, decoded.data()));
            ASSERT_EQ(decoded, bytes);
        }
    }
}

TEST(HexCodec, every_form_refuses_each_character_that_is_no_digit_at_every_place) {
    const std::string digits = "0123456789ABCDEFabcdef";
    for (const Form& form : forms()) {
        SCOPED_TRACE(form.name);
        for (std::size_t place = 0; place < 2 * 67; ++place) {
            std::string text(2 * 67, '7');
            Bytes bytes(67);
            for (int code = 0; code < 256; ++code) {
                text[place] = static_cast<char>(code);
                const bool is_digit = digits.find(static_cast<char>(code)) != std::string::npos;
                ASSERT_EQ(form.decode(text.data(), 67, bytes.data()), is_digit) << place << ' ' << code;
            }
        }
    }
}

TEST(Hex, encodes_every_byte) {
    EXPECT_EQ(VectorToHexString({0x00, 0xAB, 0x7F}), "00ab7f");
    EXPECT_EQ(StringToHexString("A\0\xFF"s), "4100ff");
}

TEST(Hex, digits_are_told_from_all_other_characters) {
    const std::wstring digits = L"0123456789ABCDEFabcdef";
    for (int code = 0; code < 256; ++code) {
        const bool is_digit = digits.find(static_cast<wchar_t>(code)) != std::wstring::npos;
        EXPECT_EQ(IsHexChar(static_cast<char>(code)), is_digit) << code;
        EXPECT_EQ(IsHexTCHAR(static_cast<wchar_t>(code)), is_digit) << code;
        EXPECT_FALSE(IsHexTCHAR(static_cast<wchar_t>(0x100 + code))) << "the low byte alone does not count";
    }
    EXPECT_TRUE(IsHexString(""));
    EXPECT_TRUE(IsHexString("12fF"));
    EXPECT_FALSE(IsHexString("12fG"));
    EXPECT_FALSE(IsHexString("12\0ff"s)) << "all of the text counts";
}

TEST(Hex, decodes_pairs_in_either_case) {
    EXPECT_EQ(HexStringToVector("00AB7f"), (Bytes{0x00, 0xAB, 0x7F}));
    EXPECT_EQ(HexStringToString("414243"), "ABC");
    EXPECT_EQ(HexStringToString(""), "");
    const std::string with_zeros = "41\0004\0002"s;
    EXPECT_EQ(HexStringToVector(with_zeros), Bytes{0x41}) << "the text ends at its first zero";
    EXPECT_EQ(HexStringToVector(with_zeros.substr(3)), Bytes{}) << "and leaves a digit alone";
    EXPECT_EQ(HexStringToVector("41f"), Bytes{0x41}) << "as does its end";
    EXPECT_EQ(HexStringToString("410"), "A") << "a lone 0 is no zero byte";
    EXPECT_EQ(HexStringToVector("4g4"), Bytes{0x50});
}

TEST(Hex, zero_byte_is_refused_in_text) {
    std::string long_text(200, '4');
    long_text.append("00");
    for (const char* const text : {"00AB", "4100", "0041", "zz00", long_text.c_str()}) {
        try {
            HexStringToString(text);
            ADD_FAILURE() << text;
        } catch (const std::exception& error) {
            EXPECT_STREQ(error.what(), "Null terminator in hex string");
        }
    }
}

// The rule for pairs, in 8 bits, on lower-case characters.
TEST(Hex, other_characters_follow_the_pair_rule) {
    const auto rule = [](int first, int second) {
        const int high = (first > '9' ? first - 7 : first) << 4;
        const int low = second > '9' ? second - 0x57 : second - 0x30;
        return static_cast<unsigned char>((high | low) & 0xFF);
    };
    for (int first = 1; first < 128; ++first) {
        for (int second = 1; second < 128; ++second) {
            const std::string pair = {static_cast<char>(first), static_cast<char>(second)};
            ASSERT_EQ(HexStringToVector("41" + pair),
                      (Bytes{0x41, rule(std::tolower(first), std::tolower(second))}))
                << first << ' ' << second;
        }
    }
    EXPECT_EQ(HexStringToVector("\xC3\x89\x31"), Bytes{rule(0xE9, '1')}) << "one character of two bytes";
}

}  // namespace
