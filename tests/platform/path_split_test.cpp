#include "src/platform/path_split.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <string>

namespace {

struct Buffers {
    wchar_t drive[3] = L"x", directory[5] = L"x", name[4] = L"x", extension[3] = L"x";

    errno_t split(const wchar_t* path) {
        return _wsplitpath_s(path, drive, 3, directory, 5, name, 4, extension, 3);
    }
    std::wstring all() const {
        return std::wstring(drive) + L"|" + directory + L"|" + name + L"|" + extension;
    }
};

// What it makes of every kind of path is in the tests of the path classes.
TEST(PathSplit, parts_fit_with_their_terminators_or_all_are_empty) {
    Buffers buffers;
    EXPECT_EQ(buffers.split(L"C:\\ab\\nam.x"), 0);
    EXPECT_EQ(buffers.all(), L"C:|\\ab\\|nam|.x");
    for (const wchar_t* const longer : {L"C:\\abc\\nam.x", L"C:\\ab\\name.x", L"C:\\ab\\nam.xy"}) {
        EXPECT_EQ(buffers.split(longer), ERANGE) << longer;
        EXPECT_EQ(buffers.all(), L"|||") << longer;
    }
    EXPECT_EQ(buffers.split(L"a"), 0);
    EXPECT_EQ(buffers.split(nullptr), EINVAL);
    EXPECT_EQ(buffers.all(), L"|||");
}

}  // namespace
