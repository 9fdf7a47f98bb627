#include <gtest/gtest.h>
#include <stdlib.h>

#include <cwchar>
#include <map>
#include <string>

#include "basalt/frame.h"
#include "src/frame/environment_state.h"
#include "src/platform/file.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::test::ScratchFolder;

struct Setting {
    const wchar_t* name;
    void (*set)(wchar_t*);
    wchar_t* (*get)();
    bool detects_the_system;
};

constexpr Setting SETTINGS[] = {
    {L"root", _setKestraRootPath, _kestraRootPath, true},
    {L"product", _setKestraGRDXPath, _kestraGRDXPath, true},
    {L"executable", _setKestraExePath, _kestraExePath, false},
    {L"version", _setKestraApplicationVersion, _kestraApplicationVersion, false},
};

void set(const Setting& setting, std::wstring value) {
    setting.set(value.data());
}

// Before any other test of this process sets one.
const bool ALL_ARE_EMPTY_AT_START = [] {
    bool empty = *_kestraPortulaInboxPath() == L'\0';
    for (const Setting& setting : SETTINGS) {
        empty = empty && *setting.get() == L'\0';
    }
    return empty;
}();

TEST(Folders, are_empty_until_set) {
    EXPECT_TRUE(ALL_ARE_EMPTY_AT_START);
}

TEST(Folders, each_pointer_shows_its_own_value_and_nothing_of_earlier_ones) {
    std::map<const wchar_t*, const wchar_t*> texts;
    for (const Setting& setting : SETTINGS) {
        texts[setting.name] = setting.get();
    }
    for (const std::wstring& value :
         {std::wstring(300, L'x'), std::wstring(L"\\\\server\\share"), std::wstring()}) {
        for (const Setting& setting : SETTINGS) {
            set(setting, value.empty() ? value : setting.name + value);
        }
        for (const auto& [name, text] : texts) {
            const std::wstring expected = value.empty() ? value : (name + value).substr(0, 259);
            EXPECT_EQ(std::wstring(text, 260), expected + std::wstring(260 - expected.size(), L'\0')) << name;
        }
        EXPECT_EQ(_kestraPortulaInboxPath(), _kestraGRDXPath() + std::wstring(L"\\Inbox")) << "never cut";
    }
}

TEST(Folders, may_be_set_from_what_a_getter_gave) {
    set(SETTINGS[1], std::wstring(259, L'q'));
    _setKestraGRDXPath(_kestraGRDXPath());
    EXPECT_EQ(_kestraGRDXPath(), std::wstring(259, L'q'));
    _setKestraGRDXPath(_kestraGRDXPath() + 250);
    EXPECT_EQ(_kestraGRDXPath(), std::wstring(9, L'q'));
    _setKestraGRDXPath(_kestraPortulaInboxPath());
    _setKestraRootPath(_kestraPortulaInboxPath());
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"qqqqqqqqq\\Inbox\\Inbox");
    EXPECT_STREQ(_kestraRootPath(), L"qqqqqqqqq\\Inbox\\Inbox");
}

TEST(Folders, root_and_product_determine_the_operating_system) {
    auto& code = basalt::frame::environment.os_code;
    for (const Setting& setting : SETTINGS) {
        code.store(0);
        set(setting, L"a");
        EXPECT_EQ(code.load(), setting.detects_the_system ? 11U : 0U) << setting.name;
    }
}

TEST(TempFilePath, is_the_environments_at_each_call) {
    const ScratchFolder puts_the_variable_back;
    struct Row {
        const char* value;
        const wchar_t* folder;
    };
    constexpr Row ROWS[] = {
        {"", L"/tmp/"},
        {"/", L"/"},
        {"/var/tmp/", L"/var/tmp/"},
        {"/no such folder", L"/no such folder/"},
        {"/var\\tmp\\", L"/var\\tmp\\"},  // either separator
        {"relative", L"relative/"},
        {"/m\xC3\xBCll\xF0\x9F\x97\x91", L"/m\u00FCll\U0001F5D1/"},
    };
    for (const Row& row : ROWS) {
        ScratchFolder::set_temporary(row.value);
        EXPECT_STREQ(_tempFilePath(), row.folder);
        EXPECT_EQ(_tempFilePath().GetLength(), static_cast<int>(std::wcslen(row.folder)));
    }
    unsetenv("TMPDIR");
    EXPECT_STREQ(_tempFilePath(), L"/tmp/");
}

TEST(TempFilePath, is_counted_in_characters_up_to_259_with_its_separator) {
    const ScratchFolder puts_the_variable_back;
    std::string bytes = "/";
    for (int i = 0; i < 257; ++i) {
        bytes += "\xC3\xBC";
    }
    ScratchFolder::set_temporary(bytes);
    EXPECT_EQ(_tempFilePath(), (L"/" + std::wstring(257, L'\u00FC') + L"/").c_str());
    ScratchFolder::set_temporary(bytes + "x");
    EXPECT_STREQ(_tempFilePath(), L"");

    wchar_t buffer[300] = L"untouched";
    EXPECT_EQ(GetTempPathW(260, buffer), 261U) << "the room it needs";
    EXPECT_STREQ(buffer, L"untouched");
    EXPECT_EQ(GetTempPathW(261, buffer), 260U);
    EXPECT_EQ(std::wcslen(buffer), 260U);
}

}  // namespace
