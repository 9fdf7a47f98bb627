#include "basalt/util/version_info.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <optional>

#include "tests/support/scratch_folder.h"
#include "tests/support/version_block.h"
#include "tests/support/with_failing_allocations.h"

namespace {

using namespace basalt::test;

const std::wstring* program_name = nullptr;  // null: the real one

// The n-th reading fails, or all give one byte at most; 0 and false: none does.
int readings_until_failure = 0;
bool readings_are_short = false;
size_t rest = 0;  // of what a short reading was to fill
bool asked_for_another_rest = false;

}  // namespace

// The names the linker's --wrap makes of GetModuleFileNameW and pread.
extern "C" {
ssize_t __real_pread(int file, void* data, size_t size, off_t offset);
ssize_t __wrap_pread(int file, void* data, size_t size, off_t offset) {
    if (readings_until_failure > 0 && --readings_until_failure == 0) {
        errno = EIO;
        return -1;
    }
    if (readings_are_short) {
        asked_for_another_rest |= rest > 0 && size != rest;
        rest = size - 1;
        size = 1;
    }
    return __real_pread(file, data, size, offset);
}
DWORD __real__Z18GetModuleFileNameWPvPwj(HINSTANCE module, wchar_t* name, DWORD size);
DWORD __wrap__Z18GetModuleFileNameWPvPwj(HINSTANCE module, wchar_t* name, DWORD size) {
    if (program_name == nullptr) {
        return __real__Z18GetModuleFileNameWPvPwj(module, name, size);
    }
    const auto length = std::min(static_cast<DWORD>(program_name->size()), size - 1);
    program_name->copy(name, length);
    name[length] = L'\0';
    return length < program_name->size() ? size : length;
}
}

namespace {

class Version : public testing::Test {
protected:
    ~Version() override { program_name = nullptr; }

    void run_as(const VersionNode& resource) {
        ProgramFile(block_of(resource)).write(m_path);
        program_name = &m_name;
    }

    static void expect_survey(VersionInfo& info) {
        EXPECT_STREQ(info.GetVersionString(), L"Survey 04.01.02.305");
        EXPECT_STREQ(info.GetInternalName(), L"survey");
        EXPECT_STREQ(info.GetCopyright(), L"\xA9 \x1F30D");
        EXPECT_STREQ(info.GetProductVersion(), L"4.1");
        EXPECT_STREQ(info.GetFileDescription(), L"");
        EXPECT_STREQ(info.GetComment(), L"");
    }

    VersionInfo m_info;

private:
    const ScratchFolder m_folder;
    const std::string m_path = m_folder / "program";
    const std::wstring m_name = std::wstring(m_path.begin(), m_path.end());
};

// This test program got its resource by basalt_add_version_resource().
TEST_F(Version, resource_of_this_program) {
    int other_module = 0;
    ASSERT_TRUE(m_info.InitVersionInfo(&other_module)) << "whose instance is given does not matter";
    EXPECT_EQ(m_info.GetMajorVersion(), 4);
    EXPECT_EQ(m_info.GetMinorVersion(), 1);
    EXPECT_EQ(m_info.GetSchemaVersion(), 2);
    EXPECT_EQ(m_info.GetBuild(), 305);
    EXPECT_STREQ(m_info.GetProductName(),
                 L"\x41C"
                 L"ap \x1F30D %d");
    EXPECT_STREQ(m_info.GetProductVersion(), L"4.1.2.305");
    EXPECT_STREQ(m_info.GetComment(), L"50 % of 'these' & those; (a) \"b\" \\c $<1:d> @e@ ${f}");
    EXPECT_STREQ(m_info.GetInternalName(), L"");
    EXPECT_STREQ(m_info.GetVersionString(),
                 L"\x41C"
                 L"ap \x1F30D %d 04.01.02.305");
}

TEST_F(Version, each_reading_replaces_what_it_finds) {
    run_as(survey_resource());
    EXPECT_TRUE(m_info.InitVersionInfo(nullptr));
    expect_survey(m_info);
    VersionInfo copy = m_info;
    EXPECT_STREQ(copy.GetProductName(), L"Survey");

    VersionNode next = survey_resource();
    next.children[0].children.clear();
    next.children[1].children[0].value.resize(3);
    run_as(next);
    EXPECT_TRUE(m_info.InitVersionInfo(nullptr));
    expect_survey(m_info);  // a translation that is cut is none

    next = survey_resource();
    next.value.clear();
    next.children[0].children = {{u"040904b0", {}, true, {text_node(u"Comment", u"new")}}};
    run_as(next);
    EXPECT_TRUE(m_info.InitVersionInfo(nullptr));
    EXPECT_STREQ(m_info.GetVersionString(), L" 04.01.02.305") << "without fixed information the numbers stay";
    EXPECT_STREQ(m_info.GetComment(), L"new");
    EXPECT_STREQ(m_info.GetCopyright(), L"") << "a missing text becomes empty";

    next.value = fixed_information(65535, 0, 7, 100);
    next.children.pop_back();
    next.children[0].children[0].children[0] = text_node(u"Comment", u"unread");
    run_as(next);
    EXPECT_TRUE(m_info.InitVersionInfo(nullptr));
    EXPECT_STREQ(m_info.GetVersionString(), L" 65535.00.07.100");
    EXPECT_STREQ(m_info.GetComment(), L"new") << "without a translation the texts stay";
}

TEST_F(Version, program_without_a_name_that_fits_has_no_resource) {
    run_as(survey_resource());
    m_info.InitVersionInfo(nullptr);
    for (const std::wstring& name :
         {std::wstring(), std::wstring(L"/no such program"), std::wstring(256, L'/')}) {
        program_name = &name;
        EXPECT_FALSE(m_info.InitVersionInfo(nullptr));
        expect_survey(m_info);
    }
}

TEST_F(Version, file_that_cannot_be_read_leaves_everything_as_it_was) {
    run_as(survey_resource());
    bool failed = true;
    for (int nth = 1; failed; ++nth) {
        ASSERT_LT(nth, 100);
        readings_until_failure = nth;
        const bool result = m_info.InitVersionInfo(nullptr);
        failed = readings_until_failure == 0;
        readings_until_failure = 0;
        ASSERT_EQ(result, !failed) << nth;
        ASSERT_STREQ(m_info.GetVersionString(), failed ? L" 01.00.00.01" : L"Survey 04.01.02.305");
    }
}

TEST_F(Version, file_that_is_read_bit_by_bit_is_whole) {
    run_as(survey_resource());
    readings_are_short = true;
    EXPECT_TRUE(m_info.InitVersionInfo(nullptr));
    readings_are_short = false;
    EXPECT_FALSE(asked_for_another_rest);
    expect_survey(m_info);
}

TEST_F(Version, lack_of_memory_leaves_everything_as_it_was) {
    run_as(survey_resource());
    std::optional<VersionInfo> info(std::in_place);
    bool result = false;
    with_failing_allocations([&] { result = info->InitVersionInfo(nullptr); },
                             [&](bool failed) {
                                 EXPECT_EQ(result, !failed);
                                 EXPECT_STREQ(info->GetVersionString(),
                                              failed ? L" 01.00.00.01" : L"Survey 04.01.02.305");
                                 info.emplace();
                             });
}

}  // namespace
