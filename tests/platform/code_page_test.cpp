#include "src/platform/code_page.h"

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <memory>
#include <random>

#include "tests/support/locales.h"

namespace {

using namespace basalt::platform;
using namespace std::string_literals;

struct Pair {
    std::string narrow;
    std::wstring wide;
};

TEST(Utf8, characters_of_every_length) {
    for (const auto& [narrow, wide] : {
             Pair{"a\0b"s, L"a\0b"s},
             Pair{"\x7F\xC2\x80\xDF\xBF", L"\x7F\x80\x7FF"s},
             Pair{"\xE0\xA0\x80\xED\x9F\xBF\xEE\x80\x80\xEF\xBF\xBF", L"\x800\xD7FF\xE000\xFFFF"s},
             Pair{"\xF0\x90\x80\x80\xF4\x8F\xBF\xBF", L"\x10000\x10FFFF"s},
         }) {
        EXPECT_EQ(wide_from_utf8(narrow), wide);
        EXPECT_EQ(utf8_from_wide(wide), narrow);
    }
}

// At every place of texts up to a few lanes long, what lanes might take for a printing character.
TEST(Utf8, lanes_tell_printing_characters_from_all_others) {
    const std::wstring others =
        L"\n\t\r\x1F\x7F\x80\xA0\xFF\x100\x120\x7F41\xFF41\x10041\x1F30D\xD841\x7FFFFF41"s +
        static_cast<wchar_t>(-1) + L'\0';
    for (std::size_t size = 1; size < 50; ++size) {
        for (std::size_t place = 0; place < size; ++place) {
            for (const wchar_t other : others) {
                std::wstring text(size, L'a');
                text[place] = other;
                const std::string expected = utf8_from_wide(text);
                std::string bytes(size * MAX_UTF8_BYTES, '-');
                bytes.resize(static_cast<std::size_t>(write_utf8(text, bytes.data()) - bytes.data()));
                ASSERT_EQ(bytes, expected) << size << ' ' << place;

                std::string lines(size * MAX_UTF8_BYTES, '-');
                char* end = lines.data();
                const std::size_t done = write_utf8_lines(text, end);
                lines.resize(static_cast<std::size_t>(end - lines.data()));
                ASSERT_EQ(done, other == L'\0' ? place : size);
                ASSERT_EQ(lines, other == L'\0'   ? std::string(place, 'a')
                                 : other == L'\n' ? expected.substr(0, place) + '\r' + expected.substr(place)
                                                  : expected);
            }
        }
    }
}

TEST(Utf8, each_byte_of_no_character_is_replaced) {
    for (const auto& [narrow, wide] : {
             Pair{"a\xE9z", L"a\xFFFDz"},        // a lone lead byte before ordinary text
             Pair{"\xE2\x82", L"\xFFFD\xFFFD"},  // split at the end
             Pair{"\xF0\x9F\x98\xE2\x82\xAC", L"\xFFFD\xFFFD\xFFFD\x20AC"},
             Pair{"\xF0\x8F\xBF\xBF", L"\xFFFD\xFFFD\xFFFD\xFFFD"},  // overlong
             Pair{"\xED\xA0\x80", L"\xFFFD\xFFFD\xFFFD"},            // surrogate
             Pair{"\xF4\x90\x80\x80", L"\xFFFD\xFFFD\xFFFD\xFFFD"},  // beyond 0x10FFFF
         }) {
        EXPECT_EQ(wide_from_utf8(narrow), wide);
    }
    EXPECT_EQ(utf8_from_wide(L"\xD800|\xDFFF|\x110000|"s + static_cast<wchar_t>(-1)), "?|?|?|?");
}

// The coder against the system's own, on bytes that are likely to form and to break characters.
TEST(Utf8, agrees_with_the_systems_conversion) {
    const std::unique_ptr<std::remove_pointer_t<locale_t>, decltype(&freelocale)> locale(
        newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr), freelocale);
    if (locale == nullptr) {
        GTEST_SKIP() << "the system's UTF-8 locale is not installed";
    }
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    constexpr std::string_view BYTES =
        "A\x80\x8F\x90\x9F\xA0\xBF\xC1\xC2\xDF\xE0\xE2\xED\xEF\xF0\xF3\xF4\xF5";
    for (int round = 0; round < 20'000; ++round) {
        std::string narrow;
        std::wstring wide;
        for (auto left = random() % 24; left > 0; --left) {
            narrow += BYTES[random() % BYTES.size()];
            wide += static_cast<wchar_t>(random() >> (random() % 32));
        }
        ASSERT_EQ(wide_from_utf8(narrow), widen_by_locale(narrow, locale.get()));
        ASSERT_EQ(utf8_from_wide(wide), narrow_by_locale(wide, locale.get()));
    }
}

TEST(CodePage, plain_c_locale_knows_ascii_alone) {
    const CodePage ascii("C");
    EXPECT_EQ(ascii.widen("a\0\xC3\xA9z"s), L"a\0\xFFFD\xFFFDz"s);
    EXPECT_EQ(ascii.narrow(L"a\0é\x416z"s), "a\0??z"s);
    EXPECT_EQ(ascii.to_upper(L'z'), L'Z');
    EXPECT_EQ(ascii.to_upper(L'é'), L'é');
}

TEST(CodePage, missing_locale_is_utf8) {
    for (const char* const name : {static_cast<const char*>(nullptr), "no_SUCH.locale"}) {
        const CodePage utf8(name);
        EXPECT_EQ(utf8.widen("\xE2\x82\xAC"), L"\x20AC");
        EXPECT_EQ(utf8.narrow(L"\x20AC"), "\xE2\x82\xAC");
        EXPECT_EQ(utf8.to_lower(L'Ž'), L'ž');
        EXPECT_EQ(utf8.to_upper(L'ж'), L'Ж');
        EXPECT_TRUE(utf8.is_space(L'\x2003'));
    }
}

TEST(CodePage, closed_one_keeps_utf8_and_knows_ascii_classes) {
    CodePage page("C.UTF-8");
    page.close();
    EXPECT_EQ(page.widen("\xE2\x82\xAC"), L"\x20AC");
    EXPECT_EQ(page.narrow(L"\x20AC"), "\xE2\x82\xAC");
    const std::wstring upper = L"@AZ[`az{\xC9";
    const std::wstring lower = L"@az[`az{\xC9";
    for (std::size_t i = 0; i < upper.size(); ++i) {
        EXPECT_EQ(page.to_lower(upper[i]), lower[i]);
        EXPECT_EQ(page.to_upper(lower[i]), lower[i] >= L'a' && lower[i] <= L'z' ? lower[i] - 32 : lower[i]);
    }
    for (const wchar_t ch : L"\x08\t\n\r\x0E !\x2003"s) {
        EXPECT_EQ(page.is_space(ch), ch == L' ' || ch == L'\t' || ch == L'\n' || ch == L'\r') << int{ch};
    }
}

// Encodings other than UTF-8, from locales made here where the system has the parts.
TEST(CodePage, single_and_double_byte_encodings) {
    const test_locales::Folder locales;
    for (const char* encoding :
         {"ISO-8859-15", "EUC-JP", "BIG5-HKSCS", "SHIFT_JISX0213", "TCVN5712-1", "TSCII"}) {
        if (!locales.has(encoding)) {
            GTEST_SKIP() << "localedef cannot make a locale with " << encoding;
        }
    }
    // In a process of its own, since the C library keeps some memory for each locale opened by LOCPATH.
    const auto convert = [&] {
        locales.enter("C");
        const CodePage latin("ISO-8859-15");
        EXPECT_EQ(latin.widen("\xA4 \xE9"), L"\x20AC \xE9");
        EXPECT_EQ(latin.narrow(L"\x20AC \xE9 \x416"), "\xA4 \xE9 ?");
        EXPECT_EQ(latin.narrow(L"a\U000E0041\U000E007F|"), "a??|") << "which the C library leaves out";
        wchar_t room[] = L"###";
        EXPECT_EQ(latin.widen_to("\xA4\xE9z", room, 2), 3U);
        EXPECT_EQ(std::wstring(room), L"\x20AC\xE9#") << "nothing behind the room";
        char line[100];
        std::mbstate_t at_start{};
        std::wstring_view cut(L"\x20AC\n\xE9\0z", 5);
        EXPECT_EQ(std::string(line, latin.narrow_line_piece(cut, 5, line, at_start)), "\xA4\r\n\xE9");
        EXPECT_TRUE(cut.empty());
        CodePage closed("ISO-8859-15");
        closed.close();
        EXPECT_EQ(closed.narrow(L"\x20AC"), "\xE2\x82\xAC");
        const CodePage japanese("EUC-JP");
        EXPECT_EQ(japanese.widen("a\xC6\xFC\xB1"), L"a\x65E5\xFFFD") << "the last character is split";
        EXPECT_EQ(japanese.narrow(L"a\x65E5\xD800z"), "a\xC6\xFC?z");
        // Encodings in which one character becomes two, or waits for a mark that belongs to it.
        const CodePage hong_kong("BIG5-HKSCS");
        EXPECT_EQ(hong_kong.widen("\x88\x62z\x88\x62"), L"\xCA\x304z\xCA\x304");
        EXPECT_EQ(hong_kong.widen("\x88\x62\xFF"), L"\xCA\x304\xFFFD");
        EXPECT_EQ(hong_kong.narrow(L"\xCA\x304z\xCA\x416\xCA\xD800\xCA"),
                  "\x88\x62z\x88\x66\xC7\xFA\x88\x66?\x88\x66");
        EXPECT_EQ(hong_kong.narrow(L"\xCA\U000E0041\x304"), "\x88\x66??") << "no mark of what is kept back";
        EXPECT_EQ(CodePage("SHIFT_JISX0213").widen("\x82\xF5z"), L"\x304B\x309Az");
        const CodePage vietnamese("TCVN5712-1");
        EXPECT_EQ(vietnamese.widen("ba"), L"ba");
        EXPECT_EQ(vietnamese.widen("\0a\0"s), L"\0a\0"s);
        EXPECT_EQ(vietnamese.narrow(L"ba\x65E5"), "ba?");
        EXPECT_EQ(CodePage("TSCII").widen("C\xD6\xEC"), L"C\xBB2\xBC1\xB95\xBCD") << "longer than its bytes";
        // However a text is cut into pieces.
        const std::wstring text = L"\xCA\x304z\xCA\x416\xCA\xD800\xCA\x30C\xCA";
        for (std::size_t most = 1; most <= text.size(); ++most) {
            char bytes[100];
            char* end = bytes;
            std::mbstate_t state{};
            for (std::wstring_view left = text; !left.empty();) {
                end = hong_kong.narrow_piece(left, most, end, state);
            }
            EXPECT_EQ(std::string(bytes, end), hong_kong.narrow(text)) << most;
        }
        std::_Exit(testing::Test::HasFailure() ? 1 : 0);
    };
    GTEST_FLAG_SET(death_test_style, "fast");
    EXPECT_EXIT(convert(), testing::ExitedWithCode(0), "");
}

TEST(CodePage, locale_of_the_process_and_thread_stays) {
    const std::string process_before = std::setlocale(LC_ALL, nullptr);
    CodePage("C").widen("\xFF");
    CodePage("C").narrow(L"\x20AC");
    widen("\xE2\x82\xAC");
    EXPECT_EQ(std::setlocale(LC_ALL, nullptr), process_before);
    EXPECT_EQ(uselocale(nullptr), LC_GLOBAL_LOCALE) << "here or in a test before";
}

// The environment is read once a process, and here before main, so each case is the whole life of a process.
TEST(CodePage, environment_names_the_encoding) {
    struct Row {
        const char *all, *ctype, *lang, *euro;
    };
    constexpr char LATIN[] = "ISO-8859-15";
    constexpr char UTF8_EURO[] = "\xE2\x82\xAC";
    const test_locales::Folder locales;
    if (!locales.has(LATIN)) {
        GTEST_SKIP() << "localedef cannot make a locale with " << LATIN;
    }
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    for (const Row& row :
         {Row{LATIN, "", "", "\xA4"}, Row{"", LATIN, "C", "\xA4"}, Row{"", "", LATIN, "\xA4"},
          Row{"C", LATIN, LATIN, UTF8_EURO}, Row{"", "POSIX", LATIN, UTF8_EURO},
          Row{"no_SUCH.locale", LATIN, LATIN, UTF8_EURO}, Row{"", "", "", UTF8_EURO}}) {
        locales.enter(row.all);
        setenv("LC_CTYPE", row.ctype, 1);
        setenv("LANG", row.lang, 1);
        EXPECT_EXIT(std::_Exit(narrow(L"\x20AC") == row.euro ? 0 : 1), testing::ExitedWithCode(0), "")
            << row.all << '|' << row.ctype << '|' << row.lang;
    }
    for (const char* const variable : {"LOCPATH", "LC_ALL", "LC_CTYPE", "LANG"}) {
        unsetenv(variable);
    }
}

}  // namespace
