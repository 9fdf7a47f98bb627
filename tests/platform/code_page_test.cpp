#include "src/platform/code_page.h"

#include <gtest/gtest.h>

#include <cstring>

#include "basalt/frame.h"
#include "src/platform/text_conversion.h"
#include "tests/platform/error_of.h"
#include "tests/support/locales.h"

namespace {

using namespace basalt::platform;
using namespace std::string_literals;
using basalt::test::error_of;

// In a process of its own: the C library keeps memory for each locale opened by LOCPATH.
void check_encodings() {
    const CodePage latin("ISO-8859-15");
    EXPECT_EQ(latin.widen("\xA4 \xE9\0"s), L"\x20AC \xE9\0"s);
    EXPECT_EQ(latin.narrow(L"\x20AC \xE9 \x416 \U000E0041\0"s), "\xA4 \xE9 ? ?\0"s);
    std::wstring_view lines(L"\x20AC\n\xE9\0z", 5);
    char bytes[100];
    EXPECT_EQ(std::string(bytes, latin.narrow_line_piece(lines, 5, bytes)), "\xA4\r\n\xE9");
    EXPECT_TRUE(lines.empty());
    const CodePage japanese("EUC-JP");
    EXPECT_EQ(japanese.widen("a\xC6\xFC\xB1"), L"a\x65E5\xFFFD") << "the last character is split";
    EXPECT_EQ(japanese.widen_name("\xC6\xFC\xB1"), L"\x65E5\xDCB1");
    EXPECT_EQ(japanese.narrow(L"a\x65E5\xD800z"), "a\xC6\xFC?z");
    EXPECT_EQ(CodePage("BIG5-HKSCS").narrow(L"\xCAz"), "\x88\x66z") << "a letter that a mark may follow";
    EXPECT_EQ(CodePage("TCVN5712-1").narrow(L"\xE9"), "\xC3\xA9") << "not supported";
    const CodePage ascii("C");
    EXPECT_EQ(ascii.widen("a\xC3z") + ascii.to_upper(L'z') + ascii.to_upper(L'\xE9'), L"a\xFFFDzZ\xE9");
    CodePage closed("ISO-8859-15");
    closed.close();
    EXPECT_EQ(closed.narrow(L"\x20AC"), "\xE2\x82\xAC");
    for (const wchar_t ch : L"\x08\t\r\x0E !@AZ[`az{\xC9\x2003"s) {
        EXPECT_TRUE(closed.to_lower(ch) == ascii.to_lower(ch) && closed.to_upper(ch) == ascii.to_upper(ch));
        EXPECT_EQ(closed.is_space(ch), ascii.is_space(ch));
    }
    EXPECT_EQ(CodePage("no_SUCH.locale").to_lower(L'\x17D'), L'\x17E');
    EXPECT_EQ(uselocale(nullptr), LC_GLOBAL_LOCALE);
    std::_Exit(testing::Test::HasFailure() ? 1 : 0);
}

TEST(CodePage, single_and_double_byte_encodings_and_the_one_the_environment_names) {
    const test_locales::Folder locales;
    for (const char* const encoding : {"ISO-8859-15", "EUC-JP", "BIG5-HKSCS", "TCVN5712-1"}) {
        if (!locales.has(encoding)) {
            GTEST_SKIP() << "localedef cannot make a locale with " << encoding;
        }
    }
    GTEST_FLAG_SET(death_test_style, "threadsafe");  // the environment is read once in a process
    EXPECT_EXIT(check_encodings(), testing::ExitedWithCode(0), "");
    constexpr const char* ROWS[][3] = {{"ISO-8859-15", "", ""}, {"", "ISO-8859-15", "C"},
                                       {"", "", "ISO-8859-15"}, {"C", "ISO-8859-15", ""},
                                       {"", "POSIX", "EUC-JP"}, {"none", "EUC-JP", ""}};
    for (const auto& row : ROWS) {
        setenv("LC_ALL", row[0], 1);
        setenv("LC_CTYPE", row[1], 1);
        setenv("LANG", row[2], 1);
        const auto size_converted = [] {
            char bytes[9];
            _tchar2char(L"\xE9", bytes, 8);
            std::_Exit(static_cast<int>(std::strlen(bytes)));
        };
        const int size = &row < ROWS + 3 ? 1 : 2;  // UTF-8 has two bytes
        EXPECT_EXIT(size_converted(), testing::ExitedWithCode(size), "") << row[0];
    }
    for (const char* const variable : {"LC_ALL", "LC_CTYPE", "LANG"}) {
        unsetenv(variable);
    }
}

TEST(CodePage, conversions_into_buffers) {
    wchar_t wide[] = L".....";
    char back[] = ".....";
    EXPECT_EQ(MultiByteToWideChar(CP_ACP, MB_PRECOMPOSED, "a\xC3\xA9z", 4, nullptr, 0), 3);
    EXPECT_EQ(MultiByteToWideChar(CP_ACP, 0, "a\xC3\xA9z", 4, wide, 3), 3);
    EXPECT_EQ(wide, L"a\u00E9z.."s);
    EXPECT_EQ(WideCharToMultiByte(CP_ACP, 0, wide, 3, nullptr, 0, nullptr, nullptr), 4);
    EXPECT_EQ(error_of(WideCharToMultiByte(CP_ACP, 0, wide, 3, back, 3, nullptr, nullptr)), 122U);
    EXPECT_EQ(MultiByteToWideChar(CP_ACP, 0, "a\xC3\xA9z", -1, wide, 5), 4) << "with the terminator";
    EXPECT_EQ(WideCharToMultiByte(CP_ACP, 0, wide, -1, back, 5, nullptr, nullptr), 5);
    EXPECT_STREQ(back, "a\xC3\xA9z");
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 0, back, 4, wide, 2)), 122U);
    for (const auto& [page, flags, length, room] :
         {std::tuple(1252U, 0U, 1, 4), {0U, 8U, 1, 4}, {0U, 0U, 0, 4}, {0U, 0U, -2, 4}, {0U, 0U, 1, -1}}) {
        EXPECT_EQ(error_of(MultiByteToWideChar(page, flags, back, length, wide, room)), 87U);
        const auto to_narrow = WideCharToMultiByte(page, flags, wide, length, back, room, nullptr, nullptr);
        EXPECT_EQ(error_of(to_narrow), 87U);
    }
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 0, "a", 1, nullptr, 4)), 87U);
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 0, nullptr, 1, wide, 4)), 87U);
}

}  // namespace
