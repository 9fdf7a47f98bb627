#include "basalt/util/version_info.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <fstream>

#include "tests/support/scratch_folder.h"
#include "tests/support/version_block.h"

namespace {

const std::wstring* program_name = nullptr;  // null: the real one
int readings_until_failure = 0;              // 0: none fails

}  // namespace

// Linked in place of pread and GetModuleFileNameW (--wrap); a reading gives at most a part.
extern "C" ssize_t __real_pread(int file, void* data, size_t size, off_t offset);
extern "C" ssize_t __wrap_pread(int file, void* data, size_t size, off_t offset) {
    errno = EIO;
    return readings_until_failure > 0 && --readings_until_failure == 0
               ? -1
               : __real_pread(file, data, std::min(size, size_t{7}), offset);
}
extern "C" DWORD __real__Z18GetModuleFileNameWPvPwj(HINSTANCE module, wchar_t* name, DWORD size);
extern "C" DWORD __wrap__Z18GetModuleFileNameWPvPwj(HINSTANCE module, wchar_t* name, DWORD size) {
    if (program_name == nullptr) {
        return __real__Z18GetModuleFileNameWPvPwj(module, name, size);
    }
    const auto length = std::min(static_cast<DWORD>(program_name->size()), size - 1);
    name[program_name->copy(name, length)] = L'\0';
    return length < program_name->size() ? size : length;
}

namespace {

using namespace basalt::test;

CString all(VersionInfo& info) {
    return info.GetVersionString() + L"|" + info.GetInternalName() + L"|" + info.GetCopyright() + L"|" +
           info.GetProductVersion() + L"|" + info.GetFileDescription() + L"|" + info.GetComment();
}

// This test program got its resource by basalt_add_version_resource().
TEST(Version, is_that_of_this_program_whatever_the_instance) {
    VersionInfo info;
    EXPECT_EQ(all(info), L" 01.00.00.01|||||");
    int other_module = 0;
    ASSERT_TRUE(info.InitVersionInfo(&other_module));
    EXPECT_EQ(all(info),
              L"\x41C"
              L"ap \x1F30D %d 04.01.02.305|||4.1.2.305||"
              L"50 % of 'these' & those; (a) \"b\" \\c $<1:d> @e@ ${f}");
    const int numbers[] = {info.GetMajorVersion(), info.GetMinorVersion(), info.GetSchemaVersion(),
                           info.GetBuild()};
    EXPECT_EQ(std::vector<int>(numbers, numbers + 4), (std::vector{4, 1, 2, 305}));
    EXPECT_EQ(info.GetProductName(),
              L"\x41C"
              L"ap \x1F30D %d");
}

TEST(Version, is_in_the_program_once) {
    std::ifstream file("/proc/self/exe", std::ios::binary);
    const std::string program(std::istreambuf_iterator<char>(file), {});
    std::string text;  // in UTF-16
    for (const char ch : std::string("50 % of 'these'")) {
        text += {ch, '\0'};
    }
    const std::size_t first = program.find(text);
    EXPECT_TRUE(first != std::string::npos && program.find(text, first + 1) == std::string::npos);
}

TEST(Version, each_reading_replaces_what_it_finds) {
    const ScratchFolder folder;
    const std::wstring name = folder.wide(L"program");
    const wchar_t* const survey = L"Survey 04.01.02.305|survey|\xA9 \x1F30D|4.1||";
    VersionInfo info;
    const auto read = [&](const VersionNode& resource) {
        ProgramFile(block_of(resource)).write(folder / "program");
        program_name = &name;
        EXPECT_TRUE(info.InitVersionInfo(nullptr));
        return all(info);
    };
    EXPECT_EQ(read(survey_resource()), survey);
    VersionNode next = survey_resource();
    next.children[0].children.clear();
    next.children[1].children[0].value.resize(3);
    EXPECT_EQ(read(next), survey) << "a truncated translation is none";
    for (const std::wstring& other : {std::wstring(), std::wstring(L"/none"), std::wstring(256, L'/')}) {
        program_name = &other;
        EXPECT_FALSE(info.InitVersionInfo(nullptr));
        EXPECT_EQ(all(info), survey);
    }
    next = survey_resource();
    next.value.clear();
    next.children[0].children = {{u"040904b0", {}, true, {text_node(u"Comment", u"new")}}};
    EXPECT_EQ(read(next), L" 04.01.02.305|||||new") << "without fixed information the numbers stay";
    next.value = fixed_information(65535, 0, 7, 100);
    next.children.pop_back();
    next.children[0].children[0].children[0] = text_node(u"Comment", u"unread");
    EXPECT_EQ(read(next), L" 65535.00.07.100|||||new") << "without a translation the texts stay";

    ProgramFile(block_of(survey_resource())).write(folder / "program");
    bool failed = true;
    for (int nth = 1; failed; ++nth) {
        readings_until_failure = nth;
        VersionInfo fresh;
        failed = !fresh.InitVersionInfo(nullptr);
        EXPECT_EQ(all(fresh), failed ? L" 01.00.00.01|||||" : survey) << nth;
        EXPECT_EQ(failed, readings_until_failure == 0) << nth;
    }
    program_name = nullptr;
}

}  // namespace
