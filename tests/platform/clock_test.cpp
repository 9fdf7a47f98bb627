#include "src/platform/clock.h"

#include <gtest/gtest.h>
#include <time.h>

#include <thread>

#include "basalt/platform/error.h"
#include "src/platform/system_info.h"

namespace {

std::uint64_t monotonic_milliseconds() {
    timespec now{};
    clock_gettime(CLOCK_MONOTONIC, &now);
    return static_cast<std::uint64_t>(now.tv_sec) * 1000 +
           static_cast<std::uint64_t>(now.tv_nsec) / 1'000'000;
}

TEST(Clock, tick_count_is_the_machines_monotonic_clock) {
    for (int i = 0; i < 3; ++i) {
        const auto before = static_cast<DWORD>(monotonic_milliseconds());
        const DWORD tick = GetTickCount();
        const auto after = static_cast<DWORD>(monotonic_milliseconds());
        EXPECT_LE(tick - before, after - before);
        std::this_thread::sleep_for(std::chrono::milliseconds(3));
    }
}

TEST(VersionQuery, answers_6_2_of_the_nt_family_to_a_record_of_the_published_size) {
    OSVERSIONINFOW version{};
    version.dwOSVersionInfoSize = 276;
    version.szCSDVersion[0] = u'x';
    EXPECT_NE(GetVersionExW(&version), 0);
    EXPECT_EQ(version.dwPlatformId, 2U);
    EXPECT_EQ(version.dwMajorVersion, 6U);
    EXPECT_EQ(version.dwMinorVersion, 2U);
    EXPECT_EQ(version.dwOSVersionInfoSize, 276U);
    EXPECT_EQ(version.szCSDVersion[0], u'\0');
}

TEST(VersionQuery, other_sizes_are_refused) {
    for (const DWORD size : {0U, 148U, 275U, 284U}) {
        OSVERSIONINFOW version{};
        version.dwOSVersionInfoSize = size;
        SetLastError(0);
        EXPECT_EQ(GetVersionExW(&version), 0);
        EXPECT_EQ(GetLastError(), 87U);
        EXPECT_EQ(version.dwMajorVersion, 0U);
    }
    EXPECT_EQ(GetVersionExW(nullptr), 0);
}

}  // namespace
