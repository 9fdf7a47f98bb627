// Facts about paths and files; fuzz/paths compares random paths with a model.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "basalt/files.h"
#include "tests/support/scratch_folder.h"

namespace {

using vex_util::CFilePath;
using vex_util::Path;
namespace fs = std::filesystem;

struct Files : testing::Test {
    const basalt::test::ScratchFolder folder;
    CString at(const std::wstring& name) const { return folder.wide(name).c_str(); }
};

TEST_F(Files, paths_take_their_own_parts_and_texts_up_to_a_zero) {
    CFilePath path(L"C:\\a\\job.txt");
    const auto full = [&path]() -> const CString& { return path; };
    path.SetExtension(path.FileNameOnly());
    path.Combine(path, path.Extension());
    EXPECT_EQ(full(), L"C:\\a\\job.job\\job") << "members as arguments";
    path.Combine(CString(L"C:\\a\0\\b", 7), CString(L"job\0.txt", 8));
    EXPECT_EQ(full(), L"C:\\a\\job") << "up to the first zeros";
    CString empty;
    const CString constant;
    path = empty, path = constant;
    EXPECT_EQ(full() + path.Drive() + path.DirectoryOnly() + path.FileNameOnly(), L"C:ajob") << "parts stay";
    fs::create_directory(folder / "site.2024");
    const CString here = CFilePath(at(L"x")).Directory() + L"\\site.2024\\.";
    EXPECT_EQ(CFilePath(at(L"site.2024")).GetFilesInDirectory(L"."), std::vector{here});
    const Path first(L"C:\\a.b");
    const CString& result = first.GetPath(1);
    EXPECT_TRUE(&result == &first.GetPath(12) && Path(first).GetPath(255) + result == L"C:\\a.ba.b");
}

TEST_F(Files, are_files_or_directories_or_neither) {
    fs::create_directory(folder / "dir");
    folder.write("file.txt");
    fs::create_symlink("file.txt", folder / "to_file"), fs::create_symlink("dir", folder / "to_dir");
    fs::create_symlink("nowhere", folder / "dangling"), fs::create_symlink("circle", folder / "circle");
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);
    const std::pair<int, std::vector<const wchar_t*>> kinds[] = {
        {1, {L"file.txt", L"to_file", L"dangling", L"circle", L"pipe", L"dir\\..\\file.txt", L"f*"}},
        {2, {L"dir", L"to_dir", L".", L"di?"}},
        {0,
         {L"none", L"dir/", L"dir\\", L"file.txt/", L"file.txt/x", L"FILE.TXT", L"di??", L"*\\file.txt",
          L"none/*", L"file.txt/*", L"\xD800"}}};
    for (const auto& [kind, names] : kinds) {
        for (const wchar_t* const name : names) {
            const CFilePath path(at(name));
            EXPECT_TRUE(path.FileExists() == (kind == 1) && path.IsFile() == (kind == 1)) << name;
            EXPECT_EQ(path.IsDirectory(), kind == 2) << name;
        }
    }
    EXPECT_TRUE(CFilePath::FileExists(at(std::wstring(4000, L'\\') + L"file.txt"))) << "separators join";
    for (const wchar_t* const name : {L"", L"/", L"\\", L"C:", L"C:\\", L"C:\\x"}) {
        EXPECT_FALSE(CFilePath::FileExists(name) || CFilePath::IsDirectory(name)) << name;
    }
}

std::uint64_t ticks(const FILETIME& time) {
    return std::uint64_t{time.dwHighDateTime} << 32 | time.dwLowDateTime;
}

TEST_F(Files, times_are_those_of_the_second_match_or_the_only_one) {
    for (const int second : {0, 1, 2}) {
        const std::string name = folder / ("job" + std::to_string(second));
        folder.write(fs::path(name).filename());
        const timespec times[] = {{1'000'000'000 + second, 123'456'789}, {86'400, 0}};
        ASSERT_EQ(utimensat(AT_FDCWD, name.c_str(), times, 0), 0);
    }
    const auto accessed = [](const CString& path) { return ticks(CFilePath(path).GetLastAccessTime()); };
    EXPECT_EQ(accessed(at(L"job2")), 126'444'736'021'234'567U);
    EXPECT_GT(ticks(CFilePath(at(L"job2")).GetCreationTime()), accessed(at(L"job2"))) << "created just now";
    EXPECT_EQ(accessed(at(L"job*")), accessed(CFilePath(at(L"x")).GetFilesInDirectory(L"job*")[1]));
    EXPECT_EQ(accessed(at(L"jo?1")), accessed(at(L"job1")));
    for (const wchar_t* const name : {L"missing", L"", L"none*"}) {
        FILETIME time{1, 2};
        const CFilePath path(at(name));
        EXPECT_FALSE(path.GetFileCreationTime(path, time) || path.GetLastAccessTime(path, time));
        EXPECT_TRUE(ticks(time) == 0x200000001 && ticks(path.GetCreationTime()) + accessed(path) == 0)
            << name;
    }
}

TEST_F(Files, lists_odd_names_and_finds_each_again) {
    const std::pair<std::string, std::wstring> names[] = {{" ..[x].", L" ..[x]."},
                                                          {"%s%n\xF0\x9F\x8C\x8D.txt", L"%s%n\x1F30D.txt"},
                                                          {"\xC3\xA9t\xC3\xA9.txt", L"\xE9t\xE9.txt"},
                                                          {"latin\xE9.txt", L"latin\xDCE9.txt"},
                                                          {"back\\slash", L"back\xDC5Cslash"},
                                                          {std::string(255, 'n'), std::wstring(255, L'n')}};
    std::set<std::wstring> expected, found;
    for (const auto& [on_disk, name] : names) {
        folder.write(on_disk);
        expected.insert(name);
    }
    CFilePath path(at(L"none.txt"));  // the folder is listed whether the file exists or not
    for (const CString& file : path.GetFilesInDirectory(L"*")) {
        const CString name = file.Mid(path.Directory().GetLength() + 1);
        const bool is_folder = name == L"." || name == L"..";
        EXPECT_TRUE(CFilePath::IsDirectory(file) == is_folder && CFilePath::FileExists(file) != is_folder);
        is_folder ? void() : static_cast<void>(found.insert(name.GetString()));
    }
    EXPECT_EQ(found, expected);
    EXPECT_EQ(path.GetFilesInDirectory(L"*.txt").size(), 3U);
    EXPECT_EQ(path.GetFilesInDirectory(L"?t?.t*t"), std::vector{path.Directory() + L"\\\xE9t\xE9.txt"});
    EXPECT_TRUE(path.GetFilesInDirectory(L"").empty() && path.GetFilesInDirectory(L"none/*").empty());
}

}  // namespace
