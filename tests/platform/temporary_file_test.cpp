#include "src/platform/temporary_file.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdio>
#include <cwchar>
#include <iterator>
#include <set>
#include <string>
#include <string_view>

#include "basalt/platform/error.h"
#include "tests/platform/error_of.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::error_of;
using basalt::test::ScratchFolder;
using basalt::test::SystemFailure;
using Names = std::set<std::string>;

TEST(TemporaryFile, is_new_and_empty_and_named_as_published) {
    const ScratchFolder folder;
    wchar_t name[MAX_PATH] = {};
    Names expected;
    for (const wchar_t* prefix : {L"vma", L"vmax", L"v", L""}) {
        for (const std::wstring& place :
             {folder.wide(L""), folder.wide(L"\\").substr(0, folder.path().size())}) {
            const UINT number = GetTempFileNameW(place.c_str(), prefix, 0, name);
            ASSERT_GE(number, 1U);
            ASSERT_LE(number, 0xFFFFU);
            char text[40];
            std::snprintf(text, sizeof text, "%.3ls%X.tmp", prefix, number);
            EXPECT_EQ(name, folder.wide(std::wstring(text, std::end(text)).c_str()));
            EXPECT_TRUE(expected.insert(text).second);
        }
    }
    // The longest folder leaves room for the name, and is told by its length from one that is not there.
    const std::wstring longest = std::wstring(MAX_PATH - 14 - folder.path().size(), L'/') +
                                 folder.wide(L"").substr(0, folder.path().size());
    ASSERT_NE(GetTempFileNameW(longest.c_str(), L"vma", 0, name), 0U);
    const std::wstring_view last = std::wstring_view(name).substr(longest.size() + 1);
    expected.emplace(last.begin(), last.end());
    EXPECT_EQ(folder.names(), expected);

    const wchar_t untouched[] = L"untouched";
    std::wmemcpy(name, untouched, std::size(untouched));
    EXPECT_EQ(error_of(GetTempFileNameW(folder.wide(L"missing").c_str(), L"vma", 0, name)),
              ERROR_PATH_NOT_FOUND);
    EXPECT_EQ(error_of(GetTempFileNameW(std::wstring(MAX_PATH - 13, L'x').c_str(), L"vma", 0, name)),
              ERROR_FILENAME_EXCED_RANGE);
    EXPECT_EQ(error_of(GetTempFileNameW(L"/tmp", L"\xD800", 0, name)), ERROR_INVALID_NAME);
    EXPECT_EQ(error_of(GetTempFileNameW(L"/tmp", L"vma", 7, name)), ERROR_INVALID_PARAMETER);
    {
        const SystemFailure taken(1, SystemFailure::Then::STAYS, EEXIST);
        EXPECT_EQ(GetTempFileNameW(L"/tmp", L"vma", 0, name), 0U);
    }
    EXPECT_EQ(GetLastError(), ERROR_FILE_EXISTS);
    EXPECT_STREQ(name, untouched);
    EXPECT_EQ(folder.names(), expected);
}

}  // namespace
