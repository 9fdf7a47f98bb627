#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdint>
#include <filesystem>
#include <set>
#include <string>
#include <vector>

#include "basalt/files.h"
#include "src/platform/file_search.h"
#include "src/platform/text/utf8.h"
#include "tests/files/file_tree.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/with_failing_allocations.h"

namespace {

using basalt::platform::utf8_from_wide;
using basalt::test::open_descriptors;
using vex_util::CFilePath;
namespace fs = std::filesystem;
using FileQueries = FileTree;

TEST_F(FileQueries, files_directories_and_neither) {
    fs::create_directory(root / "dir");
    make_file("file.txt");
    fs::create_symlink("file.txt", root / "to_file");
    fs::create_symlink("dir", root / "to_dir");
    fs::create_symlink("nowhere", root / "dangling");
    fs::create_symlink("circle", root / "circle");
    ASSERT_EQ(mkfifo((root / "pipe").c_str(), 0600), 0);
    struct Row {
        const wchar_t* name;
        bool file, directory;
    };
    for (const Row& row : {
             Row{L"dir", false, true},         Row{L"file.txt", true, false},
             Row{L"to_file", true, false},     Row{L"to_dir", false, true},
             Row{L"dangling", true, false},    Row{L"circle", true, false},
             Row{L"pipe", true, false},  // opening it would wait for ever
             Row{L".", false, true},           Row{L"dir\\..\\file.txt", true, false},
             Row{L"missing", false, false},    Row{L"dir/", false, false},
             Row{L"dir\\", false, false},      Row{L"file.txt/", false, false},
             Row{L"file.txt/x", false, false}, Row{L"FILE.TXT", false, false},
             Row{L"f*", true, false},          Row{L"di?", false, true},
             Row{L"di??", false, false},       Row{L"*\\file.txt", false, false},
         }) {
        EXPECT_EQ(CFilePath::FileExists(at(row.name)), row.file) << row.name;
        EXPECT_EQ(CFilePath::IsDirectory(at(row.name)), row.directory) << row.name;
        const CFilePath path(at(row.name));
        EXPECT_EQ(path.FileExists(), row.file) << row.name;
        EXPECT_EQ(path.IsFile(), row.file) << row.name;
        EXPECT_EQ(path.IsDirectory(), row.directory) << row.name;
    }
    for (const wchar_t* const nothing : {L"", L"/", L"\\", L"C:", L"C:\\", L"C:\\x"}) {
        EXPECT_FALSE(CFilePath::FileExists(nothing)) << nothing;
        EXPECT_FALSE(CFilePath::IsDirectory(nothing)) << nothing;
    }
}

std::uint64_t ticks(const FILETIME& time) {
    return std::uint64_t{time.dwHighDateTime} << 32 | time.dwLowDateTime;
}

TEST_F(FileQueries, creation_and_last_access) {
    make_file("job.txt");
    const CString name = at(L"job.txt");
    constexpr std::uint64_t ACCESSED = 126'444'736'001'234'567;
    const timespec times[] = {{1'000'000'000, 123'456'789}, {86'400, 0}};
    ASSERT_EQ(utimensat(AT_FDCWD, (root / "job.txt").c_str(), times, 0), 0);
    WIN32_FIND_DATAW entry{};
    ASSERT_EQ(FindClose(FindFirstFileW(name, &entry)), 1);
    FILETIME time{};
    EXPECT_TRUE(CFilePath::GetLastAccessTime(name, time));
    EXPECT_EQ(ticks(time), ACCESSED);
    EXPECT_EQ(ticks(CFilePath(name).GetLastAccessTime()), ticks(time));
    EXPECT_TRUE(CFilePath::GetFileCreationTime(name, time));
    EXPECT_EQ(ticks(time), ticks(entry.ftCreationTime));
    EXPECT_GT(ticks(time), ACCESSED) << "what is old may have been made today";
    EXPECT_EQ(ticks(CFilePath(name).GetCreationTime()), ticks(time));
}

TEST_F(FileQueries, no_time_without_an_entry) {
    for (const wchar_t* const name : {L"missing", L"", L"job*"}) {
        FILETIME time{1, 2};
        EXPECT_FALSE(CFilePath::GetFileCreationTime(at(name), time));
        EXPECT_FALSE(CFilePath::GetLastAccessTime(at(name), time));
        EXPECT_EQ(ticks(time), 0x200000001U);
        EXPECT_EQ(ticks(CFilePath(at(name)).GetCreationTime()), 0U);
        EXPECT_EQ(ticks(CFilePath(at(name)).GetLastAccessTime()), 0U);
    }
}

TEST_F(FileQueries, wildcards_test_the_first_match_and_time_the_second) {
    for (int i = 0; i < 5; ++i) {
        const std::string name = "job" + std::to_string(i);
        make_file(name);
        const timespec times[] = {{1000 + i, 0}, {0, 0}};
        ASSERT_EQ(utimensat(AT_FDCWD, (root / name).c_str(), times, 0), 0);
    }
    const auto accessed = [](const CString& path) { return ticks(CFilePath(path).GetLastAccessTime()); };
    CFilePath folder(text(wide_root));
    const std::vector<CString> matches = folder.GetFilesInDirectory(L"job*");
    ASSERT_EQ(matches.size(), 5U);
    EXPECT_EQ(accessed(at(L"job*")), accessed(matches[1]));
    EXPECT_NE(accessed(at(L"job*")), accessed(matches[0]));
    EXPECT_EQ(accessed(at(L"job3*")), 116'444'736'000'000'000 + 1003 * 10'000'000ULL) << "there is no second";
}

TEST_F(FileQueries, lists_odd_names_and_finds_each_again) {
    std::multiset<std::wstring> expected = {L" leading",      L"trailing ",
                                            L"trailing.",     L"...",
                                            L"..x",           L".hidden",
                                            L"two words.txt", L"%s%n.txt",
                                            L"[a]",           L"a\nb",
                                            L"\xE9t\xE9.txt", L"\x65E5\x672C",
                                            L"\x1F30D.gz",    std::wstring(255, L'n')};
    for (const std::wstring& name : expected) {
        make_file(utf8_from_wide(name));
    }
    expected.insert({L".", L"..", L"dir.d", L"latin\xDCE9.txt", L"back\xDC5Cslash"});
    make_file("latin\xE9.txt");
    make_file("back\\slash");
    fs::create_directory(root / "dir.d");
    CFilePath folder(text(wide_root));
    ASSERT_TRUE(folder.IsDirectory());
    std::multiset<std::wstring> found;
    for (const CString& path : folder.GetFilesInDirectory(L"*")) {
        EXPECT_EQ(path.Left(folder.Directory().GetLength()), folder.Directory());
        const std::wstring name = path.Mid(folder.Directory().GetLength() + 1).GetString();
        found.insert(name);
        const bool is_directory = name == L"." || name == L".." || name == L"dir.d";
        EXPECT_EQ(CFilePath::IsDirectory(path), is_directory) << name;
        EXPECT_EQ(CFilePath(path).FileExists(), !is_directory) << name;
    }
    EXPECT_EQ(found, expected);

    CFilePath file(at(L"no such job.txt"));  // the listing is of the folder, whether the file is there or not
    EXPECT_EQ(file.GetFilesInDirectory(L"*").size(), expected.size());
    EXPECT_EQ(file.GetFilesInDirectory(L"*.txt").size(), 4U);
    for (const wchar_t* const pattern : {L"?t?.t*t", L"été.txt"}) {
        EXPECT_EQ(file.GetFilesInDirectory(pattern), std::vector{file.Directory() + L"\\été.txt"});
    }
    for (const wchar_t* const pattern : {L"", L"none.txt"}) {
        EXPECT_TRUE(file.GetFilesInDirectory(pattern).empty());
    }
    EXPECT_TRUE(CFilePath(at(L"missing/job.txt")).GetFilesInDirectory(L"*").empty());
}

TEST_F(FileQueries, folders_without_permission) {
    fs::create_directory(root / "closed");
    make_file("closed/file");
    fs::create_directory(root / "listed");
    make_file("listed/file");
    ASSERT_EQ(chmod((root / "listed").c_str(), 0444), 0);
    const auto check = [&] {
        chmod((root / "closed").c_str(), 0);
        if (geteuid() == 0 && (chmod(root.c_str(), 0755) != 0 || seteuid(65'534) != 0)) {
            std::_Exit(2);
        }
        EXPECT_TRUE(CFilePath::IsDirectory(at(L"closed")));
        EXPECT_FALSE(CFilePath::FileExists(at(L"closed/file")));
        EXPECT_TRUE(CFilePath(at(L"closed")).GetFilesInDirectory(L"*").empty());
        FILETIME time{1, 2};
        EXPECT_TRUE(CFilePath::FileExists(at(L"listed/f*")));
        EXPECT_TRUE(CFilePath::GetLastAccessTime(at(L"listed/f*"), time));
        EXPECT_EQ(ticks(time), 0U) << "a time that nobody told";
        std::_Exit(testing::Test::HasFailure() ? 1 : 0);
    };
    GTEST_FLAG_SET(death_test_style, "fast");
    EXPECT_EXIT(check(), testing::ExitedWithCode(0), "");
    fs::permissions(root / "closed", fs::perms::owner_all);
    fs::permissions(root / "listed", fs::perms::owner_all);
}

TEST_F(FileQueries, nothing_leaks_and_nothing_is_made_up_when_memory_runs_out) {
    for (int i = 0; i < 10; ++i) {
        make_file("a rather long name for a job " + std::to_string(i));
    }
    CFilePath folder(text(wide_root));
    const CString pattern = L"*job*";
    const long descriptors = open_descriptors();
    std::size_t listed = 0;
    with_failing_allocations([&] { listed = folder.GetFilesInDirectory(pattern).size(); },
                             [&](bool fired) {
                                 EXPECT_EQ(listed, fired ? 0U : 10U);
                                 EXPECT_EQ(open_descriptors(), descriptors);
                             });
    fs::create_directory(root / "d\xC3\xA9j\xC3\xA0");
    const CString name = at(L"d\xE9j\xE0");
    bool right = true;
    const auto ask = [&] {
        FILETIME time;
        right = true;
        const CFilePath path(name);
        right = path.FileNameOnly().IsEmpty() && CFilePath::IsDirectory(name) &&
                CFilePath::GetLastAccessTime(name, time);
    };
    EXPECT_GT(with_failing_allocations(ask, [&](bool) { EXPECT_TRUE(right); }), 5);
}

}  // namespace
