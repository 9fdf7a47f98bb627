#include <gtest/gtest.h>
#include <stdlib.h>

#include <cwchar>
#include <string>

#include "basalt/frame.h"
#include "src/frame/environment_state.h"
#include "src/platform/temporary_folder.h"

namespace {

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

TEST(Folders, each_keeps_its_own_value) {
    for (const Setting& setting : SETTINGS) {
        set(setting, std::wstring(L"X:\\") + setting.name[0] + L"\\");
    }
    for (const Setting& setting : SETTINGS) {
        EXPECT_EQ(setting.get(), std::wstring(L"X:\\") + setting.name[0] + L"\\") << setting.name;
    }
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"X:\\p\\\\Inbox");
}

TEST(Folders, a_pointer_shows_later_values_and_nothing_of_earlier_ones) {
    for (const Setting& setting : SETTINGS) {
        SCOPED_TRACE(testing::Message() << setting.name);
        wchar_t* const text = setting.get();
        const std::wstring longest(300, L'x');
        set(setting, longest);
        EXPECT_EQ(text, longest.substr(0, 259));
        set(setting, L"\\\\server\\share");
        EXPECT_STREQ(text, L"\\\\server\\share");
        EXPECT_EQ(std::wstring(text + 14, 260 - 14), std::wstring(260 - 14, L'\0'));
        set(setting, L"");
        EXPECT_STREQ(text, L"");
    }
}

TEST(Folders, the_inbox_follows_the_product_folder_whole) {
    for (const std::size_t length : {0U, 1U, 253U, 254U, 259U, 260U, 1000U}) {
        const std::wstring value(length, L'p');
        set(SETTINGS[1], value);
        EXPECT_EQ(_kestraPortulaInboxPath(), value.substr(0, 259) + L"\\Inbox");
    }
    set(SETTINGS[1], L"E:\\x");
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"E:\\x\\Inbox");
    set(SETTINGS[0], L"F:\\y");
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"E:\\x\\Inbox");
}

TEST(Folders, may_be_set_from_what_a_getter_gave) {
    set(SETTINGS[1], std::wstring(259, L'q'));
    _setKestraGRDXPath(_kestraGRDXPath());
    EXPECT_EQ(_kestraGRDXPath(), std::wstring(259, L'q'));
    _setKestraGRDXPath(_kestraGRDXPath() + 250);
    EXPECT_EQ(_kestraGRDXPath(), std::wstring(9, L'q'));
    _setKestraGRDXPath(_kestraPortulaInboxPath());
    EXPECT_STREQ(_kestraPortulaInboxPath(), L"qqqqqqqqq\\Inbox\\Inbox");
    _setKestraRootPath(_kestraPortulaInboxPath());
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

// Sets TMPDIR, or unsets it, while alive.
class TemporaryFolder : public testing::Test {
protected:
    void SetUp() override {
        const char* const value = getenv("TMPDIR");
        m_was_set = value != nullptr;
        m_before = m_was_set ? value : "";
    }
    void TearDown() override { m_was_set ? setenv("TMPDIR", m_before.c_str(), 1) : unsetenv("TMPDIR"); }

private:
    bool m_was_set = false;
    std::string m_before;
};

TEST_F(TemporaryFolder, is_the_environments_at_each_call) {
    struct Row {
        const char* value;
        const wchar_t* folder;
    };
    constexpr Row ROWS[] = {
        {"", L"/tmp/"},
        {"/", L"/"},
        {"/var/tmp", L"/var/tmp/"},
        {"/var/tmp/", L"/var/tmp/"},
        {"/no such folder", L"/no such folder/"},
        {"/var\\tmp\\", L"/var\\tmp\\"},  // either separator
        {"relative", L"relative/"},
        {"/m\xC3\xBCll\xF0\x9F\x97\x91", L"/m\u00FCll\U0001F5D1/"},
    };
    for (const Row& row : ROWS) {
        setenv("TMPDIR", row.value, 1);
        EXPECT_STREQ(_tempFilePath(), row.folder);
        EXPECT_EQ(_tempFilePath().GetLength(), static_cast<int>(std::wcslen(row.folder)));
    }
    unsetenv("TMPDIR");
    EXPECT_STREQ(_tempFilePath(), L"/tmp/");
}

TEST_F(TemporaryFolder, is_counted_in_characters_up_to_259_with_its_separator) {
    std::string bytes = "/";
    for (int i = 0; i < 257; ++i) {
        bytes += "\xC3\xBC";
    }
    setenv("TMPDIR", bytes.c_str(), 1);
    EXPECT_EQ(_tempFilePath(), (L"/" + std::wstring(257, L'\u00FC') + L"/").c_str());
    setenv("TMPDIR", (bytes + "x").c_str(), 1);
    EXPECT_STREQ(_tempFilePath(), L"");

    wchar_t buffer[300] = L"untouched";
    EXPECT_EQ(GetTempPathW(260, buffer), 261U) << "the room it needs";
    EXPECT_STREQ(buffer, L"untouched");
    EXPECT_EQ(GetTempPathW(261, buffer), 260U);
    EXPECT_EQ(std::wcslen(buffer), 260U);
}

}  // namespace
