#include <gtest/gtest.h>

#include <clocale>
#include <string>
#include <tuple>

#include "basalt/frame.h"
#include "tests/support/locales.h"

namespace {

// The text that a conversion leaves in a buffer for n characters. Anything written behind index n shows.
template <class Character, class Source>
std::basic_string<Character> converted(void (*convert)(const Source*, Character*, int),
                                       const std::basic_string<Source>& source, int n) {
    std::basic_string<Character> buffer(static_cast<std::size_t>(n) + 3, Character{'?'});
    convert(source.c_str(), buffer.data(), n);
    EXPECT_EQ(buffer.substr(static_cast<std::size_t>(n) + 1),
              std::basic_string<Character>(2, Character{'?'}));
    return buffer.substr(0, buffer.find(Character{}));
}

std::wstring number(int value, int radix, int n = 40) {
    std::wstring buffer(static_cast<std::size_t>(n) + 2, L'?');
    _int2tchar(value, buffer.data(), n, radix);
    EXPECT_EQ(buffer.substr(static_cast<std::size_t>(n)), std::wstring(L"\0?", 2))
        << "a terminator at n, nothing behind";
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

// Each encoding in a process of its own, since the environment is read once.
TEST(TextConversion, is_in_the_environments_encoding) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    const test_locales::Folder locales;
    const std::string start(62, 'x');  // the others are about the end of a piece
    const std::wstring wide_start(62, L'x');
    const std::tuple<const char*, std::string, std::wstring> encodings[] = {
        {"UTF-8", start + "a\xC3\xA9\xEA\xB0\x80\xE2\x82\xAC?z", wide_start + L"a\u00E9\uAC00\u20AC?z"},
        {"ISO-8859-1", start + "a\xE9???z", wide_start + L"a\u00E9???z"},
        {"EUC-KR", start + "a?\xB0\xA1\xA2\xE6?z", wide_start + L"a?\uAC00\u20AC?z"}};
    for (const auto& [name, narrow, back] : encodings) {
        if (!locales.has(name)) {
            GTEST_SKIP() << "localedef cannot make a locale with " << name;
        }
        const auto check = [&, narrow = narrow, back = back] {
            const int length = static_cast<int>(narrow.size());
            const std::wstring wide = wide_start + L"a\u00E9\uAC00\u20AC\xD800z";
            EXPECT_EQ(converted<char>(_tchar2char, wide, length), narrow);
            EXPECT_EQ(converted<char>(_tchar2char, wide, length - 1), "");
            EXPECT_EQ(converted<wchar_t>(_char2tchar, narrow, length), back);
            EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C");
            std::_Exit(testing::Test::HasFailure() ? 1 : 0);
        };
        locales.enter(name);
        EXPECT_EXIT(check(), testing::ExitedWithCode(0), "") << name;
        unsetenv("LC_ALL");
    }
}

}  // namespace
