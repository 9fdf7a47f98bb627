#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <random>
#include <string>

#include "basalt/files.h"
#include "src/platform/text/utf8.h"
#include "tests/files/file_tree.h"
#include "tests/files/path_model.h"

namespace {

using vex_util::CFilePath;
namespace fs = std::filesystem;

void expect_parts(const CFilePath& path, const path_model::FilePath& model) {
    EXPECT_EQ(static_cast<const CString&>(path), text(model.full));
    EXPECT_EQ(path.Drive(), text(model.drive)) << model.full;
    EXPECT_EQ(path.DirectoryOnly(), text(model.directory)) << model.full;
    EXPECT_EQ(path.FileNameOnly(), text(model.name)) << model.full;
    EXPECT_EQ(path.Extension(), text(model.extension)) << model.full;
    EXPECT_EQ(path.Directory(), text(model.drive + L"\\" + model.directory)) << model.full;
    const bool has_both = !model.name.empty() && !model.extension.empty();
    EXPECT_EQ(path.FileName(), text(has_both ? model.name + L"." + model.extension : L"")) << model.full;
}

TEST(FilePath, extension_is_set_by_composing_anew) {
    struct Row {
        const wchar_t *path, *extension, *result;
    };
    for (const Row& row : {
             Row{L"C:\\a\\job.txt", L"csv", L"C:\\a\\job.csv"},
             Row{L"C:\\a\\job.txt", L".csv", L"C:\\a\\job..csv"},
             Row{L"C:\\a\\job.txt", L"", L"C:\\a\\"},
             Row{L"C:\\a\\", L"csv", L"C:\\a\\"},
             Row{L"job.txt", L"csv", L"\\\\job.csv"},
             Row{L"a/%s.%n", L"%d", L"\\a\\%s.%d"},
         }) {
        CFilePath path(row.path);
        path.SetExtension(row.extension);
        EXPECT_EQ(static_cast<const CString&>(path), row.result);
    }
    CFilePath path(L"C:\\a\\job.txt");
    path.SetExtension(L".csv");
    EXPECT_EQ(path.FileNameOnly(), L"job.");
    EXPECT_EQ(path.Extension(), L"csv");
}

TEST(FilePath, arguments_may_be_its_own_members) {
    CFilePath path(L"C:\\a\\job.txt");
    path.SetExtension(path.FileNameOnly());
    EXPECT_EQ(static_cast<const CString&>(path), L"C:\\a\\job.job");
    path.Combine(path, path.Extension());
    EXPECT_EQ(static_cast<const CString&>(path), L"C:\\a\\job.job\\job");
    path.Combine(path.DirectoryOnly(), path);
    EXPECT_EQ(static_cast<const CString&>(path), L"a\\job.job\\C:\\a\\job.job\\job");
    path = path.Directory();
    EXPECT_EQ(static_cast<const CString&>(path), L"\\a\\job.job\\C:\\a\\job.job");
    path.Combine(CString(L"C:\\a\0\\b", 7), CString(L"job\0.txt", 8));
    EXPECT_EQ(static_cast<const CString&>(path), L"C:\\a\\job") << "up to the first zeros";
}

TEST(FilePath, empty_path_leaves_the_parts_and_an_overlong_one_empties_them) {
    CFilePath path(L"C:\\a\\b.txt");
    CString empty;
    path = empty;
    EXPECT_EQ(static_cast<const CString&>(path), L"");
    EXPECT_EQ(path.Directory(), L"C:\\a");
    EXPECT_EQ(path.FileName(), L"b.txt");

    CString longer = text(L"C:\\a\\" + std::wstring(256, L'n') + L".txt");
    path = longer;
    EXPECT_EQ(static_cast<const CString&>(path), longer);
    expect_parts(path, {longer.GetString(), L"", L"", L"", L""});
}

using FilePathOnDisk = FileTree;

TEST_F(FilePathOnDisk, directory_name_belongs_to_the_directory) {
    fs::create_directories(root / "dir" / "dir");
    fs::create_directory(root / "a.old");
    make_file("file.txt");
    fs::create_directory_symlink("dir", root / "link");
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    const wchar_t* const PIECES[] = {L"/", L"\\", L"dir",   L"/dir",    L"\\a.old", L"/file.txt",
                                     L".", L"..", L"/link", L"missing", L"x:"};
    CFilePath path;
    path_model::FilePath model;
    for (int round = 0; round < 3'000; ++round) {
        std::wstring name = random() % 8 == 0 ? L"" : wide_root;
        for (auto left = random() % 5; left > 0; --left) {
            name += PIECES[random() % std::size(PIECES)];
        }
        std::string narrow = basalt::platform::utf8_from_wide(name);
        std::replace(narrow.begin(), narrow.end(), '\\', '/');
        std::error_code ignored;
        const bool is_directory =
            !narrow.empty() && narrow.back() != '/' && fs::is_directory(narrow, ignored);
        model.set(name, is_directory);
        CString wide = text(name);
        path = wide;
        expect_parts(path, model);
        ASSERT_EQ(path.IsDirectory(), is_directory) << name;
    }
}

}  // namespace
