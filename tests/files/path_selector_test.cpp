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
    const std::wstring path = L"C:\\data\\survey\\job.tar.gz";
    EXPECT_EQ(selected(path, 12), L"job.tar.gz");
    EXPECT_EQ(selected(path, 16), L"");
    EXPECT_EQ(selected(path, 255), path);
    EXPECT_EQ(selected(L"::x:y", 1), L"::");
    EXPECT_EQ(selected(L"..", 8), L".");
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
