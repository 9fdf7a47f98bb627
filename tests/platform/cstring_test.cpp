#include "basalt/platform/cstring.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdarg>
#include <cstdio>
#include <ctime>
#include <new>
#include <optional>

#include "tests/support/with_failing_allocations.h"

namespace {

bool snprintf_fails = false;  // as where it finds no memory

}  // namespace

// The names the linker's --wrap makes of snprintf, and of what takes its place where sizes are checked.
extern "C" {
[[gnu::format(printf, 3, 4)]] int __wrap_snprintf(char* text, size_t room, const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    const int length = snprintf_fails ? -1 : std::vsnprintf(text, room, format, arguments);
    va_end(arguments);
    return length;
}
[[gnu::format(printf, 5, 6)]] int __wrap___snprintf_chk(char* text, size_t room, int, size_t,
                                                        const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    const int length = snprintf_fails ? -1 : std::vsnprintf(text, room, format, arguments);
    va_end(arguments);
    return length;
}
}

namespace {

template <class... Arguments>
std::wstring formatted(const wchar_t* format, const Arguments&... arguments) {
    CString text;
    text.Format(format, arguments...);
    return {text.GetString(), static_cast<std::size_t>(text.GetLength())};
}

TEST(CString, construction) {
    const wchar_t* const no_text = nullptr;
    for (const CString& empty :
         {CString(), CString(nullptr), CString(no_text), CString(no_text, 5), CString(L""),
          CString(static_cast<const char*>(nullptr)), CString(L"abc", 0), CString(L"abc", -1),
          CString("abc", -1), CString(L'x', 0), CString('x', -3)}) {
        EXPECT_TRUE(empty.IsEmpty());
        EXPECT_STREQ(empty.GetString(), L"");
    }
    EXPECT_STREQ(CString("\xE2\x82\xAC 5"), L"\x20AC 5");
    EXPECT_STREQ(CString("\xE2\x82\xAC 5", 4), L"\x20AC ");
    EXPECT_STREQ(CString(L'x', 3), L"xxx");
    EXPECT_STREQ(CString('y'), L"y");
    EXPECT_EQ(CString(L"a\0b", 3).GetLength(), 3);
    CString text = L"before";
    text = L'c';
    EXPECT_STREQ(text, L"c");
}

TEST(CString, characters_by_position) {
    CString text = L"abc";
    text.SetAt(1, L'X');
    text.SetAt(3, L'Y');
    text.SetAt(-1, L'Z');
    EXPECT_STREQ(text, L"aXc");
    EXPECT_EQ(text[0], L'a');
    EXPECT_EQ(text[std::size_t{2}], L'c');
    EXPECT_EQ(text[3], L'\0');
    EXPECT_EQ(text.GetAt(-1), L'\0');
    EXPECT_EQ(text.GetAt(INT_MAX), L'\0');
}

TEST(CString, parts_are_clamped) {
    const std::wstring plain = L"survey";
    const CString text(plain.c_str());
    constexpr int COUNTS[] = {INT_MIN, -1, 0, 1, 3, 6, 7, INT_MAX};
    const auto clamp = [](int count) { return static_cast<std::size_t>(std::clamp(count, 0, 6)); };
    for (const int count : COUNTS) {
        EXPECT_EQ(text.Left(count), plain.substr(0, clamp(count)).c_str()) << count;
        EXPECT_EQ(text.Right(count), plain.substr(6 - clamp(count)).c_str()) << count;
        EXPECT_EQ(text.Mid(count), plain.substr(clamp(count)).c_str()) << count;
        for (const int first : COUNTS) {
            EXPECT_EQ(text.Mid(first, count), plain.substr(clamp(first), clamp(count)).c_str()) << first;
        }
    }
}

TEST(CString, searching) {
    const CString text = L"abcabc";
    EXPECT_EQ(text.Find(L'b'), 1);
    EXPECT_EQ(text.Find(L'b', 2), 4);
    EXPECT_EQ(text.Find(L"bc", 2), 4);
    EXPECT_EQ(text.Find(L"cb"), -1);
    EXPECT_EQ(text.Find(L"", 6), 6);
    EXPECT_EQ(text.Find(L"", 7), -1);
    EXPECT_EQ(text.Find(L'a', -1), -1);
    EXPECT_EQ(text.Find(L"a", INT_MAX), -1);
    EXPECT_EQ(text.Find(static_cast<const wchar_t*>(nullptr)), -1);
    EXPECT_EQ(text.ReverseFind(L'b'), 4);
    EXPECT_EQ(text.ReverseFind(L'x'), -1);
    EXPECT_EQ(text.FindOneOf(L"xcb"), 1);
    EXPECT_EQ(text.FindOneOf(L""), -1);
}

TEST(CString, comparison) {
    const CString a = L"Alpha";
    const CString b = L"alpha";
    EXPECT_EQ(a.Compare(b), -1);
    EXPECT_EQ(b.Compare(a), 1);
    EXPECT_EQ(a.Compare(nullptr), 1);
    EXPECT_EQ(a.CompareNoCase(b), 0);
    EXPECT_EQ(a.CompareNoCase(L"alph"), 1);
    EXPECT_EQ(a.CompareNoCase(L"ALPHAS"), -1);
    EXPECT_EQ(CString(L"_").CompareNoCase(L"A"), -1) << "lower case is what counts";
    EXPECT_TRUE(a < b && a <= b && b > a && b >= a && a != b && !(a == b));
    EXPECT_TRUE(a < L"B" && L"B" > a && a <= L"Alpha" && L"Alpha" >= a && a == L"Alpha" && L"Alpha" == a);
    EXPECT_TRUE(a > L"A" && a >= L"A" && L"A" < a && L"A" <= a && a != L"A" && L"A" != a && a != nullptr);
    EXPECT_TRUE(a == "Alpha");
    EXPECT_NE(CString(L"a\0b", 3), CString(L"a\0c", 3)) << "counted";
}

TEST(CString, joining) {
    CString text = L"a";
    text += L"b";
    text += L'c';
    text += CString(L"d");
    text += "e";
    text += static_cast<const wchar_t*>(nullptr);
    text += text;
    text += text.GetString() + 8;
    EXPECT_EQ(text, L"abcdeabcdede");
    EXPECT_EQ(L'x' + (L"y" + CString(L"a")) + L"b" + CString(L"c") + L'd' + "e", L"xyabcde");
}

TEST(CString, narrow_character_is_one_of_the_code_page) {
    const char byte = '\xC3';  // the first of two
    const CString wide(byte);
    CString text = L"a";
    text += byte;
    text += 'b';
    EXPECT_EQ(text, L"a" + wide + L"b");
    EXPECT_EQ('x' + wide + byte + 'y', L"x" + wide + wide + L"y");
    EXPECT_EQ(byte + CString(), wide);
    text = byte;
    EXPECT_EQ(text, wide);
    text = 'c';
    EXPECT_EQ(text, L"c");
    text += L'0' + 1;
    EXPECT_EQ(text + (L'0' + 2), L"c12") << "numbers count as wide characters";
    text = 0x416;
    EXPECT_EQ((L'a' + 1) + text, L"b\x416");
}

TEST(CString, changing) {
    CString text = L"one two one";
    EXPECT_EQ(text.Replace(L"one", L"three"), 2);
    EXPECT_EQ(text, L"three two three");
    EXPECT_EQ(text.Replace(L"three", nullptr), 2);
    EXPECT_EQ(text, L" two ");
    EXPECT_EQ(text.Replace(L"", L"x"), 0);
    EXPECT_EQ(text.Replace(L' ', L'.'), 2);
    EXPECT_EQ(text.Replace(L'.', L'.'), 0);
    EXPECT_EQ(text.Remove(L'.'), 2);
    EXPECT_EQ(text.Insert(-3, L'<'), 4);
    EXPECT_EQ(text.Insert(99, L">>"), 6);
    EXPECT_EQ(text, L"<two>>");
    EXPECT_EQ(text.Insert(1, text.GetString()), 12);
    EXPECT_EQ(text, L"<<two>>two>>");
    EXPECT_EQ(text.Delete(7, 99), 7);
    EXPECT_EQ(text.Delete(0), 6);
    EXPECT_EQ(text.Delete(-5, 1), 5);
    EXPECT_EQ(text.Delete(2, -1), 5);
    EXPECT_EQ(text, L"two>>");
    CString overlapping = L"aaaa";
    EXPECT_EQ(overlapping.Replace(L"aa", L"a"), 2);
    EXPECT_EQ(CString(L"Grün ЖЗ 12").MakeUpper(), L"GRÜN ЖЗ 12");
    EXPECT_EQ(CString(L"Grün ЖЗ 12").MakeLower(), L"grün жз 12");
}

TEST(CString, trimming) {
    EXPECT_EQ(CString(L" \t\r\n a b \x2003").Trim(), L"a b");
    EXPECT_EQ(CString(L"  a  ").TrimLeft(), L"a  ");
    EXPECT_EQ(CString(L"  a  ").TrimRight(), L"  a");
    EXPECT_EQ(CString(L"xxaxx").Trim(L'x'), L"a");
    EXPECT_EQ(CString(L"xyaxy").TrimLeft(L"yx"), L"axy");
    EXPECT_EQ(CString(L"xyaxy").TrimRight(L"yx"), L"xya");
    CString own = L"abcba";
    EXPECT_EQ(own.Trim(own), L"");
}

TEST(CString, lack_of_memory_trims_neither_end) {
    std::optional<CString> text(L"-+*/ text */+-");
    const long failed = with_failing_allocations([&] { text->Trim(L"+-*/"); },
                                                 [&](bool fired) {
                                                     EXPECT_EQ(*text, fired ? L"-+*/ text */+-" : L" text ");
                                                     text.emplace(L"-+*/ text */+-");
                                                 });
    EXPECT_GT(failed, 0);
}

TEST(CString, buffer) {
    CString text = L"abc";
    wchar_t* const buffer = text.GetBuffer(10);
    std::wmemcpy(buffer, L"0123456789", 11);
    text.ReleaseBuffer();
    EXPECT_EQ(text, L"0123456789");
    text.GetBuffer()[4] = L'\0';
    text.ReleaseBuffer();
    EXPECT_EQ(text, L"0123");
    for (const int length : {2, INT_MAX}) {
        text.ReleaseBuffer(length);
        EXPECT_EQ(text, L"01");
    }
}

TEST(CStringFormat, integers) {
    EXPECT_EQ(formatted(L"%s %02d.%02d.%02d.%02d", CString(L"Name"), 1, 2, 33, 444), L"Name 01.02.33.444");
    EXPECT_EQ(formatted(L"%s\\~%07i.mem", L"/tmp", std::uint16_t{4711}), L"/tmp\\~0004711.mem");
    EXPECT_EQ(formatted(L"[%5d|%-5d|%+d|% d|%.3d]", 42, 42, 42, 42, 7), L"[   42|42   |+42| 42|007]");
    EXPECT_EQ(formatted(L"%u %x %X %#o %#x", -1, 255, -1, 8, 255), L"4294967295 ff FFFFFFFF 010 0xff");
    EXPECT_EQ(formatted(L"%I64d %lld %Iu %I64x", INT64_MIN, INT64_MAX, UINT64_MAX, UINT64_MAX),
              L"-9223372036854775808 9223372036854775807 18446744073709551615 ffffffffffffffff");
    EXPECT_EQ(formatted(L"%hd %hhu %I32d %ld", 0x18000, 0x1FF, INT64_C(0x1FFFFFFFF), 5L), L"-32768 255 -1 5");
    EXPECT_EQ(formatted(L"%u %d", static_cast<signed char>(-1), std::uint8_t{200}), L"4294967295 200");
    EXPECT_EQ(formatted(L"%*d|%-*d|%*d|%.*d", 4, 1, 4, 2, -4, 3, 3, 4), L"   1|2   |3   |004");
    EXPECT_EQ(formatted(L"[%.0d]", 0), L"[]");
}

TEST(CStringFormat, floating_point) {
    EXPECT_EQ(formatted(L"%.3f|%8.2f|%-8.1e|%g", 1.0005, 2.5, 12345.0, 0.0001),
              L"1.000|    2.50|1.2e+04 |0.0001");
    const std::wstring huge = formatted(L"%f", 1e308);
    EXPECT_EQ(huge.size(), 316U);
    EXPECT_EQ(huge.substr(0, 6), L"100000");
    EXPECT_EQ(formatted(L"%.*f", -1, 0.5), L"0.500000") << "a negative precision is none";
    for (int width = 3; width < 600; ++width) {
        ASSERT_EQ(formatted(L"%*.1f", width, 1.5),
                  std::wstring(static_cast<std::size_t>(width - 3), L' ') + L"1.5");
    }
}

TEST(CStringFormat, texts_are_written_as_what_they_are) {
    EXPECT_EQ(formatted(L"%s|%S|%hs|%ls|%ws", L"wide \x416", "narrow \xC3\xA9", "h", L"l", L"w"),
              L"wide \x416|narrow é|h|l|w");
    EXPECT_EQ(formatted(L"%s|%S", "narrow", L"wide"), L"narrow|wide");
    EXPECT_EQ(formatted(L"[%6s|%-6s|%.2s|%6.1s]", L"abc", L"abc", L"abc", L"abc"),
              L"[   abc|abc   |ab|     a]");
    EXPECT_EQ(formatted(L"%c%C%c%hc|%3c", L'\x416', 'n', 65, 'h', L'x'), L"\x416nAh|  x");
    const wchar_t open_wide[2] = {L'a', L'b'};
    const char open_narrow[2] = {'a', 'b'};
    EXPECT_EQ(formatted(L"%.2s %.2S", &open_wide[0], &open_narrow[0]), L"ab ab") << "no zero is needed";
    const std::wstring longest(100'000, L'x');
    EXPECT_EQ(formatted(L"<%s>", longest.c_str()), L"<" + longest + L">");
    EXPECT_EQ(formatted(L"%s|%S", static_cast<const wchar_t*>(nullptr), static_cast<const char*>(nullptr)),
              L"(null)|(null)");
}

TEST(CStringFormat, whatever_does_not_fit_is_harmless) {
    EXPECT_EQ(formatted(L"%d %s", 1), L"1 ");
    EXPECT_EQ(formatted(L"%d", 1, 2, 3), L"1");
    EXPECT_EQ(formatted(L"%s %d %f %d", 7, L"text", 8, 2.5), L"7 text 8 2.5");
    EXPECT_EQ(formatted(L"100%% %y %n %", 1), L"100% %y %n %");
    EXPECT_EQ(formatted(L"%p %p", reinterpret_cast<void*>(0xBEEF), nullptr),
              L"000000000000BEEF 0000000000000000");
    EXPECT_EQ(formatted(L"%p", 0xBEEF), L"000000000000BEEF");
    const wchar_t* const wide = L"wide";
    const char* const narrow = "narrow";
    EXPECT_EQ(formatted(L"%p %p", wide, narrow),
              formatted(L"%p %p", static_cast<const void*>(wide), static_cast<const void*>(narrow)));
    EXPECT_EQ(formatted(L"%d[%*d]", 1), L"1[]");
    EXPECT_EQ(formatted(L"[%*d]", L"text", 5), L"[5]") << "a width that is no number is none";
    EXPECT_EQ(formatted(nullptr, 1), L"");
    EXPECT_EQ(formatted(L"%99999999999d", 1).size(), 1'000'000U);
    EXPECT_EQ(formatted(L"%*.*f|%-*s", INT_MIN, INT_MAX, 1.0, INT_MIN, L"").size(), 2'000'003U);
    EXPECT_EQ(formatted(L"%.99999999999s", L"abc"), L"abc");
}

TEST(CStringFormat, time_grows_no_faster_than_the_format) {
    const auto time_of = [](int conversions, int times) {
        std::wstring format;
        for (int i = 0; i < conversions; ++i) {
            format += L"%d";
        }
        const std::clock_t start = std::clock();
        for (int i = 0; i < times; ++i) {
            formatted(format.c_str(), 1);
        }
        return std::clock() - start;
    };
    EXPECT_LT(time_of(200'000, 1), 20 * time_of(1000, 200));
}

TEST(CStringFormat, lack_of_memory_in_the_c_library_is_bad_alloc) {
    CString text = L"before";
    bool is_bad_alloc = false;
    snprintf_fails = true;
    try {
        text.Format(L"%.*f", 1'000'000, 1.5);
    } catch (const std::bad_alloc&) {
        is_bad_alloc = true;
    } catch (const std::exception&) {
        is_bad_alloc = false;
    }
    snprintf_fails = false;
    EXPECT_TRUE(is_bad_alloc);
    EXPECT_EQ(text, L"before");
}

TEST(CStringFormat, arguments_may_come_from_the_text_itself) {
    CString text = L"a";
    text.Format(L"%s%s", text, text.GetString());
    text.AppendFormat(L"+%s", text);
    EXPECT_EQ(text, L"aa+aa");
}

}  // namespace
