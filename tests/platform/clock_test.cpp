#include "src/platform/clock.h"

#include <gtest/gtest.h>
#include <time.h>

#include "src/platform/system_info.h"

TEST(Clock, counts_the_machines_monotonic_time) {
    timespec before{};
    timespec after{};
    LARGE_INTEGER count{};
    clock_gettime(CLOCK_MONOTONIC, &before);
    const DWORD tick = GetTickCount();
    EXPECT_NE(QueryPerformanceCounter(&count), 0);
    clock_gettime(CLOCK_MONOTONIC, &after);
    const auto nanoseconds = [](const timespec& time) { return time.tv_sec * 1'000'000'000 + time.tv_nsec; };
    EXPECT_TRUE(count.QuadPart >= nanoseconds(before) && count.QuadPart <= nanoseconds(after));
    EXPECT_LE(tick - static_cast<DWORD>(nanoseconds(before) / 1'000'000), 1'000U);
}

TEST(VersionQuery, reports_6_2_of_the_nt_family) {
    for (const DWORD size : {0U, 148U, 275U, 276U, 284U}) {
        OSVERSIONINFOW version{size, 0, 0, 0, 0, {u'x'}};
        EXPECT_EQ(GetVersionExW(&version) != 0, size == 276);
        EXPECT_EQ(version.dwPlatformId * 100 + version.dwMajorVersion * 10 + version.dwMinorVersion,
                  size == 276 ? 262U : 0U);
        EXPECT_EQ(version.szCSDVersion[0], size == 276 ? u'\0' : u'x');
    }
    EXPECT_EQ(GetVersionExW(nullptr), 0);
}
