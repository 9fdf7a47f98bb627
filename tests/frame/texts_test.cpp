// Folders, replaced identifiers and conversions into buffers.
#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <utility>

#include "src/frame/environment_state.h"
#include "src/platform/file.h"
#include "tests/support/scratch_folder.h"

namespace {

using namespace std::string_literals;

TEST(Folders, keep_259_characters_and_nothing_of_earlier_values) {
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"");
    const std::tuple<wchar_t, void (*)(wchar_t*), wchar_t* (*)(), basalt_os> rows[] = {
        {L'r', _setKestraRootPath, _kestraRootPath, 11},  // with the system's code that it determines
        {L'e', _setKestraExePath, _kestraExePath, 0},
        {L'v', _setKestraApplicationVersion, _kestraApplicationVersion, 0},
        {L'g', _setKestraGRDXPath, _kestraGRDXPath, 11}};
    for (const std::size_t size : {300U, 14U, 259U, 0U}) {
        for (const auto& [letter, set, get, code] : rows) {
            basalt::frame::environment.os_code.store(0);
            set(std::wstring(size, letter).data());
            EXPECT_EQ(basalt::frame::environment.os_code.load(), code);
        }
        for (const auto& [letter, set, get, code] : rows) {
            std::wstring expected(std::min<std::size_t>(size, 259), letter);
            expected.resize(260);
            EXPECT_EQ(std::wstring(get(), 260), expected);
        }
        EXPECT_EQ(_kestraPortulaInboxPath(), _kestraGRDXPath() + L"\\Inbox"s) << "not truncated";
    }
    std::wstring value(259, L'q');
    _setKestraGRDXPath(value.data());
    _setKestraGRDXPath(_kestraGRDXPath());
    EXPECT_EQ(_kestraGRDXPath(), value) << "a getter's text may be set";
    _setKestraGRDXPath(_kestraGRDXPath() + 250);
    _setKestraGRDXPath(_kestraPortulaInboxPath());
    _setKestraRootPath(_kestraPortulaInboxPath());
    EXPECT_STREQ(_kestraRootPath(), L"qqqqqqqqq\\Inbox\\Inbox");
}

TEST(Folders, temporary_folder_is_the_environments_at_each_call) {
    const basalt::test::ScratchFolder restores_the_variable;
    const std::string longest = "/" + std::string(256, 'x') + "\xC3\xBC";
    const std::pair<std::string, std::wstring> rows[] = {
        {"", L"/tmp/"},
        {"/", L"/"},
        {"/var/tmp/", L"/var/tmp/"},
        {"relative", L"relative/"},
        {"/var\\tmp\\", L"/var\\tmp\\"},
        {"/m\xC3\xBCll\xF0\x9F\x97\x91", L"/m\u00FCll\U0001F5D1/"},
        {longest, L"/" + std::wstring(256, L'x') + L"\u00FC/"},
        {longest + "x", L""}};
    for (const auto& [value, folder] : rows) {
        basalt::test::ScratchFolder::set_temporary(value);
        EXPECT_EQ(_tempFilePath(), folder.c_str());
    }
    wchar_t buffer[300] = L"untouched";
    EXPECT_EQ(GetTempPathW(260, buffer), 261U) << "the size it needs";
    EXPECT_STREQ(buffer, L"untouched");
    EXPECT_TRUE(GetTempPathW(261, buffer) == 260 && buffer[259] == L'/' && buffer[260] == L'\0');
    unsetenv("TMPDIR");
    EXPECT_EQ(_tempFilePath(), L"/tmp/");
}

TEST(IdentifierReplacement, first_of_a_thousand_pairs_counts_and_chains_are_not_followed) {
    constexpr unsigned LARGEST = 0xFFFFFFFF;
    EXPECT_EQ(_REPLACE(5), 5U);
    _REPLACE_FLAG(true);
    EXPECT_EQ(_REPLACE(0), 0U) << "no table yet";
    using Row = std::pair<unsigned, unsigned>;
    for (const auto& [from, to] :
         {Row(5, 9), Row(5, 7), Row(1, 2), Row(2, 3), Row(0, LARGEST), Row(LARGEST, 0)}) {
        _REPLACE_LOAD(from, to);
    }
    for (unsigned i = 6; i < 1001; ++i) {
        _REPLACE_LOAD(i * 10, i);
    }
    for (const auto& [from, to] : {Row(5, 9), Row(1, 2), Row(0, LARGEST), Row(LARGEST, 0), Row(4, 4),
                                   Row(9990, 999), Row(10'000, 10'000)}) {  // beyond the thousandth pair
        EXPECT_EQ(_REPLACE(from), to);
        _REPLACE_FLAG(false);
        EXPECT_EQ(_REPLACE(from), from);
        _REPLACE_FLAG(true);
    }
    _REPLACE_CLEANUP();
    EXPECT_EQ(_REPLACE(5), 5U);
    _REPLACE_LOAD(5, 4);
    EXPECT_EQ(_REPLACE(5), 4U) << "a new table, and the switch stays";
    _REPLACE_CLEANUP(), _REPLACE_CLEANUP(), _REPLACE_FLAG(false);
}

// The text that a conversion leaves in a buffer for n characters. Anything written behind index n shows.
template <class Character, class Source>
std::basic_string<Character> converted(void (*convert)(Source, Character*, int),
                                       std::type_identity_t<Source> source, int n) {
    std::basic_string<Character> buffer(static_cast<std::size_t>(n) + 3, Character{'?'});
    convert(source, buffer.data(), n);
    EXPECT_TRUE(buffer.end()[-1] == '?' && buffer.end()[-2] == '?');
    return buffer.c_str();
}

TEST(TextConversion, wide_results_are_truncated_and_narrow_ones_emptied) {
    for (const int n : {0, 1, 5, 6, 10}) {
        const std::wstring part = L"ABCDEF"s.substr(0, static_cast<std::size_t>(n));
        for (const auto copy : {_tchar2wchar, _wchar2tchar, _tchar2tchar}) {
            EXPECT_EQ(converted(copy, L"ABCDEF", n), part);
        }
        EXPECT_EQ(converted(_char2tchar, "ABCDEF", n), part);
        EXPECT_EQ(converted(_tchar2char, L"ABCDEF", n), n < 6 ? "" : "ABCDEF");
    }
    EXPECT_EQ(converted(_tchar2wchar, L"\xD800\x7FFFFFFF", 2), L"\xD800\x7FFFFFFF");
    for (const std::size_t size : {65'535U, 65'536U, 65'540U}) {  // the terminator's index has 16 bits
        const int n = static_cast<int>(size);
        EXPECT_EQ(converted(_char2tchar, std::string(size, 'x').c_str(), n).size(), size % 65'536);
        EXPECT_EQ(converted(_tchar2char, std::wstring(size, L'x').c_str(), n).size(), size % 65'536);
    }
}

TEST(TextConversion, numbers_fit_with_their_terminator_or_are_empty) {
    const std::tuple<int, int, int, std::wstring> rows[] = {// value, radix, size, text
                                                            {-42, 10, 40, L"-42"},
                                                            {-1, 16, 40, L"ffffffff"},
                                                            {35, 36, 40, L"z"},
                                                            {1 << 31, 10, 40, L"-2147483648"},
                                                            {1 << 31, 2, 40, L"1" + std::wstring(31, L'0')},
                                                            {5, 1, 40, L""},
                                                            {5, 37, 40, L""},
                                                            {1234, 10, 5, L"1234"},
                                                            {1234, 10, 4, L""},
                                                            {-12, 10, 4, L"-12"},
                                                            {-123, 10, 4, L""},
                                                            {7, 10, 1, L""},
                                                            {7, 10, 0, L""}};
    for (const auto& [value, radix, size, text] : rows) {
        std::wstring buffer(static_cast<std::size_t>(size) + 2, L'?');
        _int2tchar(value, buffer.data(), size, radix);
        EXPECT_EQ(buffer.substr(static_cast<std::size_t>(size)), L"\0?"s) << "a terminator, nothing behind";
        EXPECT_EQ(buffer.c_str(), text);
    }
}

}  // namespace
