#include "basalt/util/hex.h"

#include <gtest/gtest.h>

#include <cwctype>
#include <stdexcept>

#include "basalt/platform/cstring.h"

namespace {

using namespace basalt;
using namespace std::string_literals;
using Bytes = std::vector<unsigned char>;

TEST(Hex, digits_are_distinguished_from_all_other_characters) {
    const std::wstring digits = L"0123456789ABCDEFabcdef";
    for (int code = 0; code < 256; ++code) {
        const bool is_digit = digits.find(static_cast<wchar_t>(code)) != std::wstring::npos;
        EXPECT_EQ(IsHexChar(static_cast<char>(code)), is_digit) << code;
        EXPECT_EQ(IsHexTCHAR(static_cast<wchar_t>(code)), is_digit) << code;
        EXPECT_FALSE(IsHexTCHAR(static_cast<wchar_t>(0x100 + code))) << "not the low byte alone";
        for (std::size_t size = 1; size < 140; size += 23) {  // in every form, at every place
            std::string text(size, '7');
            text[static_cast<std::size_t>(code) % size] = static_cast<char>(code);
            EXPECT_EQ(IsHexString(text), is_digit);
        }
    }
    EXPECT_TRUE(IsHexString(""));
}

// Two characters that are not digits follow the same arithmetic, in 8 bits and lower case.
TEST(Hex, pairs_are_bytes) {
    const auto rule = [](wint_t first, wint_t second) {
        const wint_t high = (first > '9' ? first - 7 : first) << 4;
        return static_cast<unsigned char>(high | (second > '9' ? second - 0x57 : second - 0x30));
    };
    for (wint_t first = 1; first < 128; ++first) {
        for (wint_t second = 1; second < 128; ++second) {
            const Bytes expected{0x41, rule(std::towlower(first), std::towlower(second))};
            ASSERT_EQ(HexStringToVector({'4', '1', static_cast<char>(first), static_cast<char>(second)}),
                      expected);
        }
    }
    EXPECT_EQ(HexStringToVector("\xC3\x89\x31"), Bytes{rule(0xE9, '1')}) << "one character of two bytes";
    EXPECT_EQ(VectorToHexString({0x00, 0xAB, 0x7F}) + StringToHexString("A\0\xFF"s), "00ab7f4100ff");
    EXPECT_EQ(HexStringToVector("41\0004\0002"s), Bytes{0x41}) << "the text ends at its first zero";
    EXPECT_EQ(HexStringToString("41420") + HexStringToString(""), "AB") << "an odd last digit is ignored";
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
        CString text(" \xC3\x89T\xC3\x89 ");
        if (is_due &&
            (text.MakeLower().Trim() != L"\u00E9t\u00E9" || HexStringToVector("4f") != Bytes{0x4F})) {
            std::_Exit(3);
        }
    }
} late_user;

TEST(HostStatics, use_the_library_until_they_are_gone) {
    late_user.is_due = true;
    EXPECT_EQ(CString(L"\u00C9").MakeLower(), L"\u00E9");
}

}  // namespace
