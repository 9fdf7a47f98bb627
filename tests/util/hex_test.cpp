#include "basalt/util/hex.h"

#include <gtest/gtest.h>

#include <cwctype>
#include <stdexcept>

#include "basalt/platform/cstring.h"

namespace {

using namespace basalt;
using namespace std::string_literals;
using Bytes = std::vector<unsigned char>;

// Any text is held against a plain form in fuzz/hex.cpp.
TEST(Hex, digits_are_distinguished_from_all_other_characters) {
    const std::wstring digits = L"0123456789ABCDEFabcdef";
    for (int code = 0; code < 256; ++code) {
        const bool is_digit = digits.find(static_cast<wchar_t>(code)) != std::wstring::npos;
        EXPECT_EQ(IsHexChar(static_cast<char>(code)), is_digit) << code;
        EXPECT_EQ(IsHexTCHAR(static_cast<wchar_t>(code)), is_digit) << code;
        EXPECT_FALSE(IsHexTCHAR(static_cast<wchar_t>(0x100 + code))) << "not the low byte alone";
    }
}

// Two characters that are not digits follow the same arithmetic, in 8 bits and lower case.
TEST(Hex, pairs_are_bytes) {
    const auto rule = [](wint_t first, wint_t second) {
        const wint_t high = (first > '9' ? first - 7 : first) << 4;
        return static_cast<unsigned char>(high | (second > '9' ? second - 0x57 : second - 0x30));
    };
    for (wint_t first = 1; first < 128; ++first) {
        for (wint_t second = 1; second < 128; ++second) {
            const std::string text{'4', '1', static_cast<char>(first), static_cast<char>(second)};
            ASSERT_EQ(HexStringToVector(text),
                      (Bytes{0x41, rule(std::towlower(first), std::towlower(second))}));
        }
    }
    EXPECT_EQ(HexStringToVector("\xC3\x89\x31"), Bytes{rule(0xE9, '1')}) << "one character of two bytes";
    EXPECT_EQ(HexStringToVector("41\0004\0002"s), Bytes{0x41}) << "the text ends at its first zero";
    EXPECT_EQ(HexStringToString("41420") + HexStringToString(""), "AB") << "an odd last digit is ignored";
}

TEST(Hex, zero_byte_is_refused_in_text) {
    for (const std::string& text : {"00AB"s, "4100"s, "zz00"s, VectorToHexString(Bytes(99))}) {
        try {
            HexStringToString(text);
            ADD_FAILURE() << text;
        } catch (const std::exception& error) {
            EXPECT_STREQ(error.what(), "Null terminator in hex string");
        }
    }
}

// A host's static object that uses the library in its destructor, after the library was first used.
struct LateUser {
    bool is_due = false;
    ~LateUser() {
        if (is_due && CString(HexStringToString("c38920").c_str()).MakeLower().Trim() != L"\u00E9") {
            std::_Exit(3);
        }
    }
} late_user;

TEST(HostStatics, use_the_library_until_they_are_gone) {
    late_user.is_due = true;
    EXPECT_EQ(CString(L"\u00C9").MakeLower(), L"\u00E9");
}

}  // namespace
