#include "src/frame/os_detection.h"

#include <gtest/gtest.h>

namespace {

TEST(OsDetection, releases) {
    struct Row {
        DWORD platform, major, minor;
        basalt_os code;
    };
    constexpr Row ROWS[] = {
        {0, 0, 0, 1},  {0, 3, 10, 1}, {0, 0xFFFFFFFF, 0xFFFFFFFF, 1},  // Win32s: nothing else is tested
        {1, 4, 0, 2},  {1, 9, 0, 2},  {1, 4, 10, 3},                   // the 9x family goes by minor version
        {1, 4, 90, 4}, {1, 4, 1, 0},  {1, 4, 91, 0},
        {1, 4, 9, 0},  {1, 4, 11, 0}, {1, 4, 89, 0},
        {2, 3, 51, 0}, {2, 4, 0, 5},  {2, 4, 77, 5},
        {2, 5, 0, 6},  {2, 5, 1, 7},  {2, 5, 2, 7},
        {2, 5, 3, 0},  {2, 6, 0, 9},  {2, 6, 1, 10},
        {2, 6, 2, 11}, {2, 6, 3, 0},  {2, 10, 0, 0},
        {2, 0, 0, 0},  {3, 6, 2, 0},  {0xFFFFFFFF, 4, 0, 0},
    };
    for (const Row& row : ROWS) {
        OSVERSIONINFOW version{};
        version.dwPlatformId = row.platform;
        version.dwMajorVersion = row.major;
        version.dwMinorVersion = row.minor;
        EXPECT_EQ(basalt::frame::release_code(version), row.code)
            << row.platform << ' ' << row.major << '.' << row.minor;
    }
}

}  // namespace
