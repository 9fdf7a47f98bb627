#include <gtest/gtest.h>

#include <cwchar>
#include <string>
#include <tuple>

#include "src/frame/environment_state.h"
#include "src/platform/file.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::test::ScratchFolder;

TEST(Folders, keep_259_characters_and_nothing_of_earlier_values) {
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"");
    using Row =
        std::tuple<wchar_t, void (*)(wchar_t*), wchar_t* (*)(), basalt_os>;  // with the code it determines
    const Row rows[] = {Row(L'r', _setKestraRootPath, _kestraRootPath, 11),
                        Row(L'e', _setKestraExePath, _kestraExePath, 0),
                        Row(L'v', _setKestraApplicationVersion, _kestraApplicationVersion, 0),
                        Row(L'g', _setKestraGRDXPath, _kestraGRDXPath, 11)};
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
        EXPECT_EQ(_kestraPortulaInboxPath(), _kestraGRDXPath() + std::wstring(L"\\Inbox")) << "not truncated";
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
    const ScratchFolder restores_the_variable;
    const std::string longest = "/" + std::string(256, 'x') + "\xC3\xBC";
    using Row = std::pair<std::string, std::wstring>;
    for (const auto& [value, folder] :
         {Row("", L"/tmp/"), Row("/", L"/"), Row("/var/tmp/", L"/var/tmp/"), Row("relative", L"relative/"),
          Row("/no such folder", L"/no such folder/"), Row("/var\\tmp\\", L"/var\\tmp\\"),
          Row("/m\xC3\xBCll\xF0\x9F\x97\x91", L"/m\u00FCll\U0001F5D1/"),
          Row(longest, L"/" + std::wstring(256, L'x') + L"\u00FC/"), Row(longest + "x", L"")}) {
        ScratchFolder::set_temporary(value);
        EXPECT_EQ(_tempFilePath(), folder.c_str());
    }
    wchar_t buffer[300] = L"untouched";
    EXPECT_EQ(GetTempPathW(260, buffer), 261U) << "the size it needs";
    EXPECT_STREQ(buffer, L"untouched");
    EXPECT_EQ(GetTempPathW(261, buffer), 260U);
    EXPECT_EQ(std::wcslen(buffer), 260U);
    unsetenv("TMPDIR");
    EXPECT_EQ(_tempFilePath(), L"/tmp/");
}

}  // namespace
