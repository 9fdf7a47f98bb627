#include <gtest/gtest.h>

#include <cwchar>
#include <string>

#include "src/frame/environment_state.h"
#include "src/platform/file.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::test::ScratchFolder;

struct Folder {
    void (*set)(wchar_t*);
    wchar_t* (*get)();
    basalt_os code;  // determined by setting it
};

constexpr Folder FOLDERS[] = {{_setKestraRootPath, _kestraRootPath, 11},
                              {_setKestraGRDXPath, _kestraGRDXPath, 11},
                              {_setKestraExePath, _kestraExePath, 0},
                              {_setKestraApplicationVersion, _kestraApplicationVersion, 0}};

TEST(Folders, keep_259_characters_and_nothing_of_earlier_values) {
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"");
    for (const std::size_t size : {300U, 14U, 259U, 0U}) {
        for (const Folder& folder : FOLDERS) {
            std::wstring value(size, static_cast<wchar_t>(L'a' + (&folder - FOLDERS)));
            basalt::frame::environment.os_code.store(0);
            folder.set(value.data());
            EXPECT_EQ(basalt::frame::environment.os_code.load(), folder.code);
        }
        for (const Folder& folder : FOLDERS) {
            std::wstring expected(std::min<std::size_t>(size, 259),
                                  static_cast<wchar_t>(L'a' + (&folder - FOLDERS)));
            expected.resize(260);
            EXPECT_EQ(std::wstring(folder.get(), 260), expected);
        }
        EXPECT_EQ(_kestraPortulaInboxPath(), _kestraGRDXPath() + std::wstring(L"\\Inbox"))
            << "never truncated";
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
    const std::pair<std::string, std::wstring> rows[] = {
        {"", L"/tmp/"},
        {"/", L"/"},
        {"/var/tmp/", L"/var/tmp/"},
        {"/no such folder", L"/no such folder/"},
        {"/var\\tmp\\", L"/var\\tmp\\"},
        {"relative", L"relative/"},
        {"/m\xC3\xBCll\xF0\x9F\x97\x91", L"/m\u00FCll\U0001F5D1/"},
        {longest, L"/" + std::wstring(256, L'x') + L"\u00FC/"},
        {longest + "x", L""}};
    for (const auto& [value, folder] : rows) {
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
