#include "basalt/util/version_info.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>

#include "tests/support/scratch_folder.h"
#include "tests/support/version_block.h"

namespace {

const std::wstring* program_name = nullptr;  // null: the real one

}  // namespace

// Linked in place of pread and GetModuleFileNameW (--wrap); a reading gives at most a part.
extern "C" ssize_t __real_pread(int file, void* data, size_t size, off_t offset);
extern "C" ssize_t __wrap_pread(int file, void* data, size_t size, off_t offset) {
    return __real_pread(file, data, std::min(size, size_t{7}), offset);
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
TEST(Version, is_that_of_this_program_whatever_the_instance_and_in_it_once) {
    VersionInfo info;
    EXPECT_EQ(all(info), L" 01.00.00.01|||||");
    int other_module = 0;
    ASSERT_TRUE(info.InitVersionInfo(&other_module));
    const std::string comment = "50 % of 'these' & those; (a) \"b\" \\c $<1:d> @e@ ${f}";
    EXPECT_EQ(info.GetProductName(), L"\u041Cap \x1F30D %d");
    EXPECT_EQ(all(info), info.GetProductName() + L" 04.01.02.305|||4.1.2.305||" + comment.c_str());
    EXPECT_TRUE(info.GetMajorVersion() == 4 && info.GetMinorVersion() == 1 && info.GetSchemaVersion() == 2 &&
                info.GetBuild() == 305);
    std::ifstream file("/proc/self/exe", std::ios::binary);
    const std::string program(std::istreambuf_iterator<char>(file), {});
    const Bytes units = utf16({comment.begin(), comment.end()});
    const std::string text(units.begin(), units.end());
    EXPECT_TRUE(program.find(text) < program.size() && program.find(text) == program.rfind(text));
}

TEST(Version, each_reading_replaces_what_it_finds) {
    const ScratchFolder folder;
    const std::wstring name = folder.wide(L"program");
    const wchar_t* const survey = L"Survey 04.01.02.305|survey|\xA9 \x1F30D|4.1||";
    VersionInfo info;
    const auto read = [&](const Bytes& resource) {
        write_file(folder / "program", program_file(resource));
        program_name = &name;
        EXPECT_TRUE(info.InitVersionInfo(nullptr));
        return all(info);
    };
    EXPECT_EQ(read(survey_resource()), survey);
    EXPECT_EQ(read(resource(fixed_information(4, 1, 2, 305), {}, {9, 4, 0xB0})), survey) << "no translation";
    for (const std::wstring& other : {std::wstring(), std::wstring(L"/none"), std::wstring(256, L'/')}) {
        program_name = &other;
        EXPECT_FALSE(info.InitVersionInfo(nullptr));
        EXPECT_EQ(all(info), survey);
    }
    const auto comment = [](const char16_t* text) {
        return std::vector<Bytes>{node(u"040904b0", {}, true, {text_node(u"Comment", text)})};
    };
    EXPECT_EQ(read(resource({}, comment(u"new"), {9, 4, 0xB0, 4})), L" 04.01.02.305|||||new");
    EXPECT_EQ(read(resource(fixed_information(65535, 0, 7, 100), comment(u"unread"), {})),
              L" 65535.00.07.100|||||new")
        << "without a translation the texts stay";
    program_name = nullptr;
}

}  // namespace
