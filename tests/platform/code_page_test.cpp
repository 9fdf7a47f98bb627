#include "src/platform/code_page.h"

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>

#include "basalt/frame.h"
#include "tests/support/scratch_folder.h"

namespace {

using namespace basalt::platform;
using namespace std::string_literals;

std::string narrowed(const CodePage& code_page, std::wstring_view text) {
    char bytes[100];
    return std::string(bytes, code_page.narrow_piece(text, text.size(), bytes));
}

// In a process of its own: the C library keeps memory for each locale opened by LOCPATH.
void check_encodings() {
    const CodePage latin("ISO-8859-15");
    EXPECT_EQ(latin.widen("\xA4 \xE9\0"s), L"\x20AC \xE9\0"s);
    EXPECT_EQ(narrowed(latin, L"\x20AC \xE9 \x416 \U000E0041\0"s), "\xA4 \xE9 ? ?\0"s);
    std::wstring_view lines(L"\x20AC\n\xE9\0z", 5);
    char bytes[100];
    EXPECT_EQ(std::string(bytes, latin.narrow_line_piece(lines, 5, bytes)), "\xA4\r\n\xE9");
    const CodePage japanese("EUC-JP");
    EXPECT_EQ(japanese.widen("a\xC6\xFC\xB1"), L"a\x65E5\xFFFD") << "the last character is split";
    EXPECT_EQ(japanese.widen_name("\xC6\xFC\xB1"), L"\x65E5\xDCB1");
    EXPECT_EQ(narrowed(japanese, L"a\x65E5\xD800z"), "a\xC6\xFC?z");
    EXPECT_EQ(narrowed(CodePage("BIG5-HKSCS"), L"\xCAz"), "\x88\x66z") << "a letter that a mark may follow";
    EXPECT_EQ(narrowed(CodePage("TCVN5712-1"), L"\xE9"), "\xC3\xA9") << "not supported";
    const CodePage ascii("C");
    EXPECT_EQ(ascii.widen("a\xC3z") + ascii.to_upper(L'z') + ascii.to_upper(L'\xE9'), L"a\xFFFDzZ\xE9");
    CodePage closed("ISO-8859-15");
    closed.close();
    EXPECT_EQ(narrowed(closed, L"\x20AC"), "\xE2\x82\xAC");
    for (const wchar_t ch : L"\x08\t\r\x0E !@AZ[`az{\xC9\x2003"s) {
        EXPECT_TRUE(closed.to_lower(ch) == ascii.to_lower(ch) && closed.to_upper(ch) == ascii.to_upper(ch));
        EXPECT_EQ(closed.is_space(ch), ascii.is_space(ch));
    }
    EXPECT_EQ(CodePage("no_SUCH.locale").to_lower(L'\x17D'), L'\x17E');
    EXPECT_EQ(uselocale(nullptr), LC_GLOBAL_LOCALE);
    std::_Exit(testing::Test::HasFailure() ? 1 : 0);
}

TEST(CodePage, single_and_double_byte_encodings_and_the_one_the_environment_names) {
    const basalt::test::ScratchFolder folder;
    setenv("LOCPATH", folder.path().c_str(),
           0);  // a death test runs the program again, in its parent's folder
    for (const std::string encoding : {"ISO-8859-15", "EUC-JP", "BIG5-HKSCS", "TCVN5712-1"}) {
        const std::string path = std::getenv("LOCPATH") + ("/" + encoding), made = path + "/LC_CTYPE";
        const std::string make = "localedef -c -i POSIX -f " + encoding + " '" + path + "' >/dev/null 2>&1";
        const auto exists = [&] { return std::filesystem::exists(made); };
        if (!exists() && (std::system(make.c_str()) == -1 || !exists())) {
            GTEST_SKIP() << "localedef cannot make a locale with " << encoding;
        }
    }
    GTEST_FLAG_SET(death_test_style, "threadsafe");  // the environment is read once in a process
    EXPECT_EXIT(check_encodings(), testing::ExitedWithCode(0), "");
    const struct {
        const char *all, *type, *lang;
        int bytes;  // of an accented letter; UTF-8 has two
    } rows[] = {{"ISO-8859-15", "", "", 1},  {"", "ISO-8859-15", "C", 1}, {"", "", "ISO-8859-15", 1},
                {"C", "ISO-8859-15", "", 2}, {"", "POSIX", "EUC-JP", 2},  {"none", "EUC-JP", "", 2}};
    for (const auto& [all, type, lang, size] : rows) {
        setenv("LC_ALL", all, 1), setenv("LC_CTYPE", type, 1), setenv("LANG", lang, 1);
        const auto convert = [] {
            char bytes[9];
            _tchar2char(L"\xE9", bytes, 8);
            std::_Exit(static_cast<int>(std::strlen(bytes)));
        };
        EXPECT_EXIT(convert(), testing::ExitedWithCode(size), "") << all << ' ' << type << ' ' << lang;
    }
    for (const char* const variable : {"LC_ALL", "LC_CTYPE", "LANG", "LOCPATH"}) {
        unsetenv(variable);
    }
}

}  // namespace
