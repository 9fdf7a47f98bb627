#include <gtest/gtest.h>

#include <random>
#include <string>

#include "basalt/files.h"
#include "tests/files/path_model.h"

namespace {

using vex_util::Path;

std::wstring selected(const std::wstring& path, unsigned selector) {
    return Path::GetPath(path.c_str(), static_cast<unsigned char>(selector)).GetString();
}

TEST(PathSelector, parts_in_their_order) {
    const Path path(L"C:\\data\\survey\\job.tar.gz");
    for (const auto& [selector, text] : {
             std::pair{0, L""},
             {1, L"C:"},
             {2, L"\\data\\survey\\"},
             {3, L"C:\\data\\survey\\"},
             {4, L"job.tar"},
             {8, L".gz"},
             {12, L"job.tar.gz"},
             {6, L"\\data\\survey\\job.tar"},
             {15, L"C:\\data\\survey\\job.tar.gz"},
             {16, L""},
             {255, L"C:\\data\\survey\\job.tar.gz"},
         }) {
        EXPECT_EQ(path.GetPath(static_cast<unsigned char>(selector)), text) << selector;
    }
}

TEST(PathSelector, odd_paths) {
    struct Row {
        const wchar_t *path, *drive, *directory, *name, *extension;
    };
    for (const Row& row : {
             Row{L"", L"", L"", L"", L""},
             Row{L"job", L"", L"", L"job", L""},
             Row{L"\\\\server\\share\\a.txt", L"", L"\\\\server\\share\\", L"a", L".txt"},
             Row{L"C:", L"C:", L"", L"", L""},
             Row{L"C:\\data\\", L"C:", L"\\data\\", L"", L""},
             Row{L"C:job", L"C:", L"", L"job", L""},
             Row{L"a.b\\c", L"", L"a.b\\", L"c", L""},
             Row{L"/.profile", L"", L"/", L"", L".profile"},
             Row{L"a.", L"", L"", L"a", L"."},
             Row{L"..", L"", L"", L".", L"."},
             Row{L"::x:y", L"::", L"", L"x:y", L""},
             Row{L"/:/x", L"/:", L"/", L"x", L""},
             Row{L":", L"", L"", L":", L""},
             Row{L"é:\\ß.ж", L"é:", L"\\", L"ß", L".ж"},
             Row{L"%s\\%n.%d", L"", L"%s\\", L"%n", L".%d"},
         }) {
        EXPECT_EQ(selected(row.path, 1), row.drive) << row.path;
        EXPECT_EQ(selected(row.path, 2), row.directory) << row.path;
        EXPECT_EQ(selected(row.path, 4), row.name) << row.path;
        EXPECT_EQ(selected(row.path, 8), row.extension) << row.path;
    }
}

TEST(PathSelector, each_part_has_255_characters_or_the_path_has_none) {
    const std::wstring directory = L"\\" + std::wstring(253, L'd') + L"/";
    const std::wstring name(255, L'n');
    const std::wstring extension = L"." + std::wstring(254, L'x');
    const std::wstring path = L"C:" + directory + name + extension;
    EXPECT_EQ(path.size(), 767U);
    EXPECT_EQ(selected(path, 15), path);
    for (const std::wstring& longer :
         {L"C:\\" + directory + name + extension, L"C:" + directory + L"n" + name + extension, path + L"x",
          L"C:" + directory + L"." + name + L"n"}) {
        EXPECT_EQ(selected(longer, 15), L"") << longer.size();
    }
}

TEST(PathSelector, result_belongs_to_the_object) {
    Path path(L"C:\\a.b");
    const CString& first = path.GetPath(1);
    const CString& second = path.GetPath(4);
    EXPECT_EQ(&first, &second);
    EXPECT_EQ(first, L"a");

    const Path copy(path);
    EXPECT_EQ(copy.GetPath(15), L"C:\\a.b");
    path = Path(path.GetPath(8));
    EXPECT_EQ(path.GetPath(15), L".b");
    path = Path(L"");
    EXPECT_EQ(path.GetPath(15), L"");
    EXPECT_EQ(copy.GetPath(15), L"C:\\a.b");
}

TEST(PathSelector, agrees_with_the_model) {
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    constexpr std::wstring_view CHARACTERS = L"\\/.:ab \x416";
    for (int round = 0; round < 20'000; ++round) {
        std::wstring path;
        for (auto left = random() % 16; left > 0; --left) {
            path.append(random() % 500 == 0 ? 250 + random() % 10 : 1,
                        CHARACTERS[random() % CHARACTERS.size()]);
        }
        const path_model::Parts parts = path_model::split(path);
        for (unsigned selector = 0; selector < 16; ++selector) {
            ASSERT_EQ(selected(path, selector), path_model::select(parts, selector)) << selector;
        }
        ASSERT_EQ(selected(path, 15), parts.valid ? path : L"");
    }
}

}  // namespace
