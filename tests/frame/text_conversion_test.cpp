#include <gtest/gtest.h>

#include <string>

#include "basalt/frame.h"

namespace {

// The text that a conversion leaves in a buffer for n characters. Anything written behind index n shows.
template <class Character, class Source>
std::basic_string<Character> converted(void (*convert)(const Source*, Character*, int),
                                       const std::basic_string<Source>& source, int n) {
    std::basic_string<Character> buffer(static_cast<std::size_t>(n) + 3, Character{'?'});
    convert(source.c_str(), buffer.data(), n);
    EXPECT_TRUE(buffer.end()[-1] == '?' && buffer.end()[-2] == '?');
    return buffer.c_str();
}

std::wstring number(int value, int radix, int n = 40) {
    std::wstring buffer(static_cast<std::size_t>(n) + 2, L'?');
    _int2tchar(value, buffer.data(), n, radix);
    EXPECT_TRUE(buffer.end()[-1] == '?' && buffer.end()[-2] == '\0') << "a terminator at n, nothing behind";
    return buffer.c_str();
}

TEST(TextConversion, wide_results_are_truncated_and_narrow_ones_emptied) {
    for (const int n : {0, 1, 5, 6, 10}) {
        const std::wstring part = std::wstring(L"ABCDEF").substr(0, static_cast<std::size_t>(n));
        for (const auto copy : {_tchar2wchar, _wchar2tchar, _tchar2tchar}) {
            EXPECT_EQ(converted<wchar_t>(copy, std::wstring(L"ABCDEF"), n), part);
        }
        EXPECT_EQ(converted<wchar_t>(_char2tchar, std::string("ABCDEF"), n), part);
        EXPECT_EQ(converted<char>(_tchar2char, std::wstring(L"ABCDEF"), n), n < 6 ? "" : "ABCDEF");
    }
    EXPECT_EQ(converted<wchar_t>(_tchar2wchar, std::wstring(L"\xD800\x7FFFFFFF"), 2), L"\xD800\x7FFFFFFF");
    for (const std::size_t size : {65'535U, 65'536U, 65'540U}) {  // the terminator's index has 16 bits
        const int n = static_cast<int>(size);
        EXPECT_EQ(converted<wchar_t>(_char2tchar, std::string(size, 'x'), n).size(), size % 65'536);
        EXPECT_EQ(converted<char>(_tchar2char, std::wstring(size, L'x'), n).size(), size % 65'536);
    }
}

TEST(TextConversion, numbers_fit_with_their_terminator_or_are_empty) {
    EXPECT_EQ(number(-42, 10) + number(-1, 16) + number(35, 36) + number(1 << 31, 10),
              L"-42ffffffffz-2147483648");
    EXPECT_EQ(number(1 << 31, 2) + number(5, 1) + number(5, 37), L"1" + std::wstring(31, L'0'));
    EXPECT_EQ(number(1234, 10, 5) + number(-12, 10, 4), L"1234-12");
    EXPECT_EQ(number(1234, 10, 4) + number(-123, 10, 4) + number(7, 10, 1) + number(7, 10, 0), L"");
}

}  // namespace
