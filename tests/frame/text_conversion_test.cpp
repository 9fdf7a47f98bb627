#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <limits>
#include <random>
#include <string>
#include <vector>

#include "basalt/frame.h"
#include "tests/support/locales.h"

namespace {

constexpr char UNTOUCHED = 0x55;

// What a conversion leaves in a buffer for n characters. Anything written behind index n shows, and so does a
// result without a terminator.
template <class Character, class Convert>
std::basic_string<Character> converted(int n, const Convert& convert) {
    const auto last = static_cast<std::size_t>(n);
    std::vector<Character> buffer(last + 9, Character{UNTOUCHED});
    convert(buffer.data());
    for (std::size_t i = last + 1; i < buffer.size(); ++i) {
        EXPECT_EQ(buffer[i], Character{UNTOUCHED}) << "written at index " << i << " for n " << n;
    }
    buffer[last + 1] = 0;
    const std::basic_string<Character> text(buffer.data());
    EXPECT_LE(text.size(), last) << "no terminator";
    return text;
}

std::wstring copied(const std::wstring& source, int n) {
    const std::wstring text =
        converted<wchar_t>(n, [&](wchar_t* to) { _tchar2wchar(source.c_str(), to, n); });
    EXPECT_EQ(converted<wchar_t>(n, [&](wchar_t* to) { _wchar2tchar(source.c_str(), to, n); }), text);
    EXPECT_EQ(converted<wchar_t>(n, [&](wchar_t* to) { _tchar2tchar(source.c_str(), to, n); }), text);
    return text;
}
std::wstring widened(const std::string& source, int n) {
    return converted<wchar_t>(n, [&](wchar_t* to) { _char2tchar(source.c_str(), to, n); });
}
std::string narrowed(const std::wstring& source, int n) {
    return converted<char>(n, [&](char* to) { _tchar2char(source.c_str(), to, n); });
}
std::wstring number(int value, int radix, int n = 40) {
    return converted<wchar_t>(n, [&](wchar_t* to) { _int2tchar(value, to, n, radix); });
}

TEST(TextConversion, what_does_not_fit_is_cut_but_emptied_where_it_becomes_narrow) {
    const std::wstring wide = L"ABCDEF";
    const std::string narrow = "ABCDEF";
    for (const int n : {0, 1, 5, 6, 10}) {
        const std::wstring as_far_as_it_fits = wide.substr(0, static_cast<std::size_t>(n));
        EXPECT_EQ(copied(wide, n), as_far_as_it_fits);
        EXPECT_EQ(widened(narrow, n), as_far_as_it_fits);
        EXPECT_EQ(narrowed(wide, n), n < 6 ? "" : narrow);
        EXPECT_EQ(copied(L"", n), L"");
        EXPECT_EQ(widened("", n), L"");
        EXPECT_EQ(narrowed(L"", n), "");
    }
    EXPECT_EQ(copied(L"\x1F30D\xD800\x7FFFFFFF", 2), L"\x1F30D\xD800") << "any unit is copied";
}

TEST(TextConversion, terminator_is_placed_by_a_count_of_16_bits) {
    for (const int length : {65'535, 65'536, 65'540}) {
        const auto size = static_cast<std::size_t>(length);
        EXPECT_EQ(widened(std::string(size, 'x'), length).size(), size % 65'536);
        EXPECT_EQ(narrowed(std::wstring(size, L'x'), length).size(), size % 65'536);
    }
}

TEST(TextConversion, numbers_in_every_radix) {
    EXPECT_EQ(number(-42, 10), L"-42");
    EXPECT_EQ(number(-1, 16), L"ffffffff");
    EXPECT_EQ(number(0, 36), L"0");
    EXPECT_EQ(number(std::numeric_limits<int>::min(), 10), L"-2147483648");
    EXPECT_EQ(number(std::numeric_limits<int>::min(), 2), L"1" + std::wstring(31, L'0'));
    EXPECT_EQ(number(5, 1), L"");
    EXPECT_EQ(number(5, 37), L"");

    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    for (int round = 0; round < 5'000; ++round) {
        const auto value = static_cast<int>(random() >> (random() % 32));
        for (const int radix : {2, 3, 7, 10, 16, 36}) {
            const std::wstring text = number(value, radix);
            const long long back = std::wcstoll(text.c_str(), nullptr, radix);
            ASSERT_EQ(radix == 10 ? back : static_cast<int>(static_cast<unsigned>(back)), value) << radix;
        }
    }
}

TEST(TextConversion, number_and_terminator_fit_or_nothing_is_there) {
    EXPECT_EQ(number(1234, 10, 5), L"1234");
    EXPECT_EQ(number(1234, 10, 4), L"") << "the text alone would fit";
    EXPECT_EQ(number(-123, 10, 4), L"");
    EXPECT_EQ(number(7, 10, 1), L"");
    EXPECT_EQ(number(7, 10, 0), L"");
    wchar_t text[] = L"000000000";
    _int2tchar(12, text, 8, 10);
    EXPECT_EQ(text[8], L'\0') << "a terminator at n as well";
}

struct Encoding {
    const char* name;
    std::string narrow;  // of "aé가€z", as far as the encoding has them
    std::wstring back;
    std::string two;    // of "é가"
    std::string split;  // its last character is cut short
    std::wstring split_wide;
};

void check_conversions(const Encoding& encoding) {
    const std::string process_locale = std::setlocale(LC_ALL, nullptr);
    const auto length = static_cast<int>(encoding.narrow.size());
    EXPECT_EQ(narrowed(L"aé가€z", 100), encoding.narrow);
    EXPECT_EQ(narrowed(L"aé가€z", length), encoding.narrow);
    EXPECT_EQ(narrowed(L"aé가€z", length - 1), "") << "never cut";
    EXPECT_EQ(narrowed(L"a\xD800\x110000z", 4), "a??z") << "no characters";
    EXPECT_EQ(widened(encoding.narrow, 100), encoding.back);
    EXPECT_EQ(widened(encoding.split, 100), encoding.split_wide);
    EXPECT_EQ(widened(encoding.split + "\x81", static_cast<int>(encoding.split.size())), encoding.split_wide)
        << "cut after so many bytes";
    for (std::size_t size = 62; size < 67; ++size) {  // about the size of one piece of work
        EXPECT_EQ(narrowed(std::wstring(size, L'x') + L"é가", 200), std::string(size, 'x') + encoding.two);
    }
    EXPECT_EQ(std::setlocale(LC_ALL, nullptr), process_locale);
}

// Each encoding in a process of its own, since the environment is read once.
TEST(TextConversion, is_in_the_environments_encoding) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    const test_locales::Folder locales;
    for (const Encoding& encoding :
         {Encoding{"UTF-8", "a\xC3\xA9\xEA\xB0\x80\xE2\x82\xACz", L"aé가€z", "\xC3\xA9\xEA\xB0\x80",
                   "a\xEA\xB0", L"a\xFFFD\xFFFD"},
          Encoding{"ISO-8859-1", "a\xE9??z", L"aé??z", "\xE9?", "a\xEA\xB0", L"a\xEA\xB0"},
          Encoding{"EUC-KR", "a?\xB0\xA1\xA2\xE6z", L"a?가€z", "?\xB0\xA1", "a\xB0\xA1\xB0", L"a가\xFFFD"}}) {
        if (!locales.has(encoding.name)) {
            GTEST_SKIP() << "localedef cannot make a locale with " << encoding.name;
        }
        const auto check = [&] {
            locales.enter(encoding.name);
            check_conversions(encoding);
            std::_Exit(testing::Test::HasFailure() ? 1 : 0);
        };
        EXPECT_EXIT(check(), testing::ExitedWithCode(0), "") << encoding.name;
    }
}

}  // namespace
