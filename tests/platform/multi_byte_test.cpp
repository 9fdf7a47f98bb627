#include "src/platform/multi_byte.h"

#include <gtest/gtest.h>

#include <string>

#include "basalt/platform/error.h"
#include "tests/platform/error_of.h"

namespace {

using basalt::test::error_of;

// In UTF-8, the environment's encoding under test runs.
TEST(MultiByte, room_is_told_kept_or_found_too_small) {
    const char narrow[] = "a\xC3\xA9z";
    const wchar_t wide[] = L"aéz";
    wchar_t to_wide[8] = L"";
    char to_narrow[8] = "";
    EXPECT_EQ(MultiByteToWideChar(CP_ACP, MB_PRECOMPOSED, narrow, 4, nullptr, 0), 3);
    EXPECT_EQ(MultiByteToWideChar(CP_ACP, 0, narrow, 4, to_wide, 3), 3);
    EXPECT_EQ(std::wstring(to_wide, 3), wide);
    EXPECT_EQ(MultiByteToWideChar(CP_ACP, 0, narrow, -1, to_wide, 8), 4) << "with the terminator";
    EXPECT_EQ(WideCharToMultiByte(CP_ACP, 0, wide, 3, nullptr, 0, nullptr, nullptr), 4);
    EXPECT_EQ(WideCharToMultiByte(CP_ACP, 0, wide, -1, to_narrow, 8, nullptr, nullptr), 5);
    EXPECT_STREQ(to_narrow, narrow);

    to_wide[2] = L'|';
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 0, narrow, 4, to_wide, 2)), ERROR_INSUFFICIENT_BUFFER);
    EXPECT_EQ(to_wide[2], L'|');
    to_narrow[3] = '|';
    EXPECT_EQ(error_of(WideCharToMultiByte(CP_ACP, 0, wide, 3, to_narrow, 3, nullptr, nullptr)),
              ERROR_INSUFFICIENT_BUFFER);
    EXPECT_EQ(to_narrow[3], '|');
}

TEST(MultiByte, refuses_what_it_does_not_know) {
    constexpr UINT OTHER = 1252;
    wchar_t wide[4] = L"";
    char narrow[4] = "";
    EXPECT_EQ(error_of(MultiByteToWideChar(OTHER, 0, "a", 1, wide, 4)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 8, "a", 1, wide, 4)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 0, nullptr, 1, wide, 4)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 0, "a", 0, wide, 4)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(MultiByteToWideChar(CP_ACP, 0, "a", 1, nullptr, 4)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(WideCharToMultiByte(OTHER, 0, L"a", 1, narrow, 4, nullptr, nullptr)),
              ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(WideCharToMultiByte(CP_ACP, 1, L"a", 1, narrow, 4, nullptr, nullptr)),
              ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(WideCharToMultiByte(CP_ACP, 0, L"a", -2, narrow, 4, nullptr, nullptr)),
              ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(WideCharToMultiByte(CP_ACP, 0, L"a", 1, narrow, -1, nullptr, nullptr)),
              ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(WideCharToMultiByte(CP_ACP, 0, L"a", 1, narrow, 4, "!", nullptr)),
              ERROR_INVALID_PARAMETER);
}

}  // namespace
