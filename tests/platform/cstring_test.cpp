#include "basalt/platform/cstring.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <ctime>

namespace {

const wchar_t* const NONE = nullptr;
constexpr char BYTE = '\xC3';  // the first of two
constexpr wchar_t WIDE = L'a';

template <class... Arguments>
CString text_of(const wchar_t* format, const Arguments&... arguments) {
    CString text;
    text.Format(format, arguments...);
    return text;
}

// Results and texts, separated.
template <class... Parts>
CString all(const Parts&... parts) {
    return (text_of(L"%s|", parts) + ... + CString());
}

TEST(CString, null_is_empty_and_positions_and_counts_are_clamped) {
    for (const CString& empty :
         {CString(nullptr), CString(NONE), CString(NONE, 5), CString(L"a", -1),
          CString(static_cast<const char*>(nullptr)), CString("a", -1), CString('x', -3)}) {
        EXPECT_TRUE(empty.IsEmpty() && *empty.GetString() == L'\0' && empty == nullptr && empty == 0);
    }
    const std::wstring plain = L"survey";
    const CString text(plain.c_str());
    const auto clamp = [](int count) { return static_cast<std::size_t>(std::clamp(count, 0, 6)); };
    constexpr int COUNTS[] = {INT_MIN, -1, 0, 1, 3, 6, 7, INT_MAX};
    for (const int n : COUNTS) {
        const std::size_t size = clamp(n);
        EXPECT_EQ(all(text.Left(n), text.Right(n), text.Mid(n)).GetString(),
                  plain.substr(0, size) + L"|" + plain.substr(6 - size) + L"|" + plain.substr(size) + L"|");
        EXPECT_EQ(text.GetAt(n), n < 0 || n > 5 ? L'\0' : plain[size]);
        for (const int first : COUNTS) {
            EXPECT_EQ(text.Mid(first, n), plain.substr(clamp(first), size).c_str()) << first << ' ' << n;
        }
    }
}

TEST(CString, searches_splits_and_compares) {
    const CString text = L"abcabc";
    EXPECT_EQ(all(text.Find(L'b'), text.Find(L'b', 2), text.Find(L"bc", 2), text.Find(L"", 6)), L"1|4|4|6|");
    EXPECT_EQ(all(text.ReverseFind(L'b'), text.FindOneOf(L"xcb"), text.Find(L"cb")), L"4|1|-1|");
    EXPECT_EQ(all(text.Find(L"", 7), text.Find(L'a', -1), text.Find(L"a", INT_MAX)), L"-1|-1|-1|");
    EXPECT_EQ(all(text.Find(NONE), text.ReverseFind(L'x'), text.FindOneOf(L"")), L"-1|-1|-1|");
    EXPECT_EQ(all(text.SpanIncluding(L"ba"), text.SpanExcluding(L"cb"), text.SpanIncluding(NONE)), L"ab|a||");
    int at = 0;
    for (const wchar_t* const part : {L"one6", L"two10", L"x13", L"-1", L"-1"}) {
        const CString token = CString(L",;one,two;;x;").Tokenize(L",;", at);
        EXPECT_EQ(token + text_of(L"%d", at), part);
    }
    const CString a = L"Alpha";
    EXPECT_EQ(all(a.Compare(L"alpha"), CString(L"alpha").Compare(a), a.Compare(a), a.Compare(NONE)),
              L"-1|1|0|1|");
    EXPECT_EQ(all(a.CompareNoCase(L"aLPHA"), a.CompareNoCase(L"alph"), a.CompareNoCase(L"ALPHAS")),
              L"0|1|-1|");
    EXPECT_EQ(CString(L"_").CompareNoCase(L"A"), -1) << "lower case is compared";
    EXPECT_TRUE(a < L"B" && L"B" > a && a <= L"Alpha" && L"Alpha" >= a && a == L"Alpha" && L"Alpha" == a);
    EXPECT_TRUE(a > L"A" && a >= L"A" && L"A" < a && L"A" <= a && a != L"A" && L"A" != a && a != nullptr);
    EXPECT_FALSE(a < a || a > a || a != a || a == L"A" || a <= L"A" || L"A" >= a || a != "Alpha" ||
                 L'A' == a);
    EXPECT_NE(CString(L"a\0b", 3), CString(L"a\0c", 3)) << "counted";
}

TEST(CString, concatenates_texts_and_characters_and_itself) {
    CString text("\xE2\x82\xAC 5", 4);
    ((((text += L"b") += L'c') += CString(L'd', 2)) += "e") += NONE;
    text += text;
    text += text.GetString() + 12;
    text.AppendChar(L'f');
    text.Append(L"g\0h", 2);
    EXPECT_EQ(text, CString(L"\x20AC bcdde\x20AC bcddedefg\0", 19));
    const CString wide(BYTE);
    EXPECT_EQ(L'x' + (L"y" + CString(L"a")) + L"b" + CString(L"c") + L'd' + "e" + BYTE, L"xyabcde" + wide);
    EXPECT_EQ('x' + wide + BYTE + 'y' + (L'0' + 1), L"x" + wide + wide + L"y1")
        << "numbers are wide characters";
    text = 0x416;
    EXPECT_EQ((L'a' + 1) + text + (CString() = BYTE) + (BYTE + CString()), L"b\x416" + wide + wide);
}

TEST(CString, changes_in_place) {
    CString text = L"one two one";
    CString log;
    const auto step = [&](int result) { log += all(result, text); };
    step(text.Replace(L"one", L"three")), step(text.Replace(L"three", NONE)), step(text.Replace(L"", L"x"));
    step(text.Replace(L' ', L'.')), step(text.Replace(L'.', L'.')), step(text.Remove(L'.'));
    step(text.Insert(-3, L'<')), step(text.Insert(99, L">")), step(text.Insert(1, text.GetString()));
    step(text.Delete(6, 99)), step(text.Delete(0)), step(text.Delete(-5, 1)), step(text.Delete(2, -1));
    step((text = L"aaaa").Replace(L"aa", L"a"));
    EXPECT_EQ(log,
              L"2|three two three|2| two |0| two |2|.two.|0|.two.|2|two|4|<two|5|<two>|10|<<two>two>|"
              L"6|<<two>|5|<two>|4|two>|4|two>|2|aa|");
    EXPECT_EQ(CString(L"n\u00FC\u0437").MakeUpper() + CString(L"N\u00DC\u0416").MakeLower().MakeReverse(),
              L"N\u00DC\u0417\u0436\u00FCn");
    const CString gaps = L"\x2003 \t\r\n a b \x2003";
    EXPECT_EQ(all(CString(gaps).Trim(), CString(gaps).TrimLeft()), L"a b|a b \x2003|");
    text = L"xax";
    EXPECT_EQ(all(CString(text).TrimLeft(L'x'), CString(text).TrimRight(L'x'), CString(text).Trim(L'x')),
              L"ax|xa|a|");
    EXPECT_EQ(all(CString(L"yax").TrimLeft(L"xy"), CString(L" a ").TrimRight().TrimRight(L"ya")), L"ax| |");
    text = L"xyabyx";
    EXPECT_EQ(text.Trim(text.GetString() + 4), L"ab") << "by a part of itself";
    EXPECT_EQ(text.Trim(L'a').Trim(text).Trim(NONE), L"");
    std::copy_n(L"0123\0 678", 10, text.GetBuffer(10));
    text.ReleaseBuffer(INT_MAX);
    EXPECT_EQ(text.GetLength(), 10);
    text.ReleaseBuffer();
    text.SetAt(1, L'X');
    text.SetAt(4, L'X');
    EXPECT_EQ(text, L"0X23");
    text.GetBufferSetLength(3)[2] = L'x';
    EXPECT_EQ(text, L"0Xx");
    EXPECT_EQ(text.GetBufferSetLength(-1), CString());
}

TEST(CStringFormat, numbers_and_texts_by_their_own_types) {
    EXPECT_EQ(text_of(L"%s %02d.%02d.%02d.%02d", CString(L"Name"), 1, 2, 33, 444), L"Name 01.02.33.444");
    EXPECT_EQ(text_of(L"%5d|%-5d|%+d|% d|%.3d|%.0d", 42, 42, 42, 42, 7, 0), L"   42|42   |+42| 42|007|");
    EXPECT_EQ(text_of(L"%u %x %X %#o %#x", -1, 255, -1, 8, 255), L"4294967295 ff FFFFFFFF 010 0xff");
    EXPECT_EQ(text_of(L"%I64d %Iu %llx", LLONG_MIN, ULLONG_MAX, ULLONG_MAX),
              L"-9223372036854775808 18446744073709551615 ffffffffffffffff");
    EXPECT_EQ(text_of(L"%hd %hhu %I32d %ld", 0x18000, 0x1FF, 0x1FFFFFFFFL, 5L), L"-32768 255 -1 5");
    EXPECT_EQ(text_of(L"%u %d", static_cast<signed char>(-1), std::uint8_t{200}), L"4294967295 200");
    EXPECT_EQ(text_of(L"%*d|%-*d|%*d|%.*d", 4, 1, 4, 2, -4, 3, 3, 4), L"   1|2   |3   |004");
    EXPECT_EQ(text_of(L"%8.2f|%-8.1e|%g|%.*f", 2.5, 12e3, 1e-4, -1, 0.5),
              L"    2.50|1.2e+04 |0.0001|0.500000");
    EXPECT_EQ(text_of(L"%s%S%hs%ls%ws%S", L"\x416", "\xC3\xA9", "h", L"l", L"w", L"S"), L"\x416\u00E9hlwS");
    EXPECT_EQ(text_of(L"%6s|%-6s|%.2s|%6.1s", L"abc", "abc", L"abc", "abc"), L"   abc|abc   |ab|     a");
    EXPECT_EQ(text_of(L"%c%C%c%hc|%3c", L'\x416', 'n', 65, 'h', L'x'), L"\x416nAh|  x");
    EXPECT_EQ(text_of(L"%.1s%.1S", &WIDE, &BYTE), CString(WIDE) + BYTE) << "no zero is needed";
    for (int width = 60; width < 70; ++width) {  // about the size of the usual buffer
        EXPECT_EQ(text_of(L"%*.1f", width, 1.5), CString(L' ', width - 3) + L"1.5");
    }
    CString text = L"a";
    text.Format(L"%s%s", text, text.GetString());
    text.AppendFormat(L"+%s%s", text, NONE);
    EXPECT_EQ(text, L"aa+aa(null)") << "arguments from the text itself";
}

TEST(CStringFormat, wrong_formats_and_arguments_are_harmless_and_take_linear_time) {
    EXPECT_EQ(text_of(L"%d %s", 1) + text_of(L"%d", 1, 2, 3) + text_of(nullptr, 1), L"1 1");
    EXPECT_EQ(text_of(L"%s %d %f %d 100%% %y %n %", 7, L"text", 8, 2.5), L"7 text 8 2.5 100% %y %n %");
    void* const pointer = reinterpret_cast<void*>(0xBEEF);
    EXPECT_EQ(text_of(L"%+p %-18p|", pointer, 0xBEEF), L"000000000000BEEF 000000000000BEEF  |");
    EXPECT_EQ(text_of(L"%d[%*d]", 1) + text_of(L"[%*d]", L"text", 5), L"1[][5]");
    EXPECT_EQ(text_of(L"%99999999999d%p", 1, L"text").GetLength(), 1'000'016);
    EXPECT_EQ(text_of(L"%*.*f|%-*s", INT_MIN, INT_MAX, 1.0, INT_MIN, L"").GetLength(), 2'000'003);
    EXPECT_EQ(text_of(L"%.99999999999s", L"abc"), L"abc");
    const auto time_of = [](int conversions, int times) {
        CString format(L'x', conversions), values = format;
        format.Replace(L"x", L"%%"), values.Replace(L"x", L"%d");
        const std::clock_t start = std::clock();
        for (; times > 0; --times) {
            text_of(format + values, 1);
        }
        return std::clock() - start;
    };
    EXPECT_LT(time_of(200'000, 1), 20 * time_of(1000, 200));
}

}  // namespace
