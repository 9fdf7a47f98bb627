#include "src/platform/file_search.h"

#include <fcntl.h>
#include <fnmatch.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "src/platform/disk/wildcard.h"
#include "src/platform/ticks.h"
#include "tests/platform/error_of.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::error_of;
using basalt::test::SystemFailure;
using WideNames = std::set<std::wstring>;
using basalt::platform::tick_count;
namespace fs = std::filesystem;

TEST(Wildcards, match_as_the_systems_own_do) {
    std::vector<std::string> texts = {""};  // every one of up to four of these characters
    for (std::size_t i = 0; texts[i].size() < 4; ++i) {
        for (const char ch : {'a', 'b', '.', '*', '?'}) {
            texts.push_back(texts[i] + ch);
        }
    }
    for (const std::string& name : texts) {
        for (const std::string& pattern : texts) {
            const bool expected = pattern == "*.*" || fnmatch(pattern.c_str(), name.c_str(), 0) == 0;
            const std::wstring wide_name(name.begin(), name.end()),
                wide_pattern(pattern.begin(), pattern.end());
            ASSERT_EQ(basalt::platform::matches_wildcards(wide_name, wide_pattern), expected)
                << name << ' ' << pattern;
        }
    }
    EXPECT_TRUE(basalt::platform::matches_wildcards(L"[\\]", L"[\\*"));
}

struct FileSearch : testing::Test {
    const basalt::test::ScratchFolder folder;
};

// All names found; the last error is what ended the search.
WideNames search(const std::wstring& path) {
    WideNames names;
    WIN32_FIND_DATAW entry = {};
    const HANDLE found = FindFirstFileW(path.c_str(), &entry);
    for (BOOL more = found != INVALID_HANDLE_VALUE ? 1 : 0; more != 0; more = FindNextFileW(found, &entry)) {
        EXPECT_TRUE(names.insert(entry.cFileName).second);
    }
    const DWORD error = GetLastError();
    EXPECT_EQ(FindClose(found), names.empty() ? 0 : 1);
    SetLastError(error);
    return names;
}

TEST_F(FileSearch, finds_what_matches) {
    for (const char* name : {"a.txt", "A.TXT", ".hidden", "plain", "\xC3\xA9.txt"}) {
        folder.write(name);
    }
    fs::create_directory(folder / "dir.txt");
    const std::wstring here = folder.wide(L"");
    const std::wstring far = folder.wide(L"") + std::wstring(511 - here.size() - 5, L'\\');
    const std::pair<std::wstring, WideNames> rows[] = {
        {here + L"*.txt", {L"a.txt", L"dir.txt", L"\xE9.txt"}},
        {here + L"\\?.txt", {L"a.txt", L"\xE9.txt"}},
        {here + L"*", {L".", L"..", L"a.txt", L"A.TXT", L".hidden", L"plain", L"\xE9.txt", L"dir.txt"}},
        {here + L"dir.txt\\..", {L".."}},
        {far + L"plain", {L"plain"}},
        {far + L"\\plain", {L"plain"}},
        {far + std::wstring(3500, L'/') + L"plain", {L"plain"}}};
    for (const auto& [path, names] : rows) {
        EXPECT_EQ(search(path), names) << testing::PrintToString(path);
        EXPECT_EQ(GetLastError(), ERROR_NO_MORE_FILES);
    }
    const std::pair<DWORD, WideNames> errors[] = {
        {2, {here + L"*.none", here + L"none", L"", L"/", L"C:\\", here + L"dir.txt/"}},
        {3, {here + L"none/x", here + L"none/*", here + L"a.txt/*", here + L"a.txt/x"}},
        {123, {here + L"\xD800"}}};
    for (const auto& [error, paths] : errors) {
        for (const std::wstring& path : paths) {
            EXPECT_TRUE(search(path).empty() && GetLastError() == error) << testing::PrintToString(path);
        }
    }
    WIN32_FIND_DATAW entry;
    EXPECT_EQ(error_of(FindNextFileW(nullptr, &entry)), ERROR_INVALID_HANDLE);
    const HANDLE found = FindFirstFileW((here + L"*").c_str(), &entry);
    EXPECT_EQ(CloseHandle(found), 0) << "a search is not a file";
    EXPECT_EQ(FindClose(found), 1);
}

TEST_F(FileSearch, describes_sizes_and_times) {
    folder.write("file");
    // A second before 1970 and 700 ns; from 1601 to 1970 are 116444736000000000 ticks.
    const timespec times[] = {{-1, 700}, {1'000'000'000, 0}};
    ASSERT_EQ(truncate((folder / "file").c_str(), (off_t{3} << 32) + 7), 0);
    ASSERT_EQ(utimensat(AT_FDCWD, (folder / "file").c_str(), times, 0), 0);
    WIN32_FIND_DATAW file;
    FindClose(FindFirstFileW(folder.wide(L"file").c_str(), &file));
    EXPECT_EQ(tick_count(file.ftLastAccessTime), 116'444'735'990'000'007);
    EXPECT_EQ(tick_count(file.ftLastWriteTime), 126'444'736'000'000'000);
    EXPECT_TRUE(file.nFileSizeHigh == 3 && file.nFileSizeLow == 7 &&
                file.dwReserved0 + file.dwReserved1 == 0);
}

TEST(FileTimes, are_clamped_to_the_range_of_ticks) {
    constexpr std::int64_t FIRST = -11'644'473'600;  // 1601, in seconds from 1970
    constexpr std::int64_t LAST = 910'692'730'084;   // the last one that 2^63 - 1 ticks hold whole
    EXPECT_EQ(basalt::platform::ticks_of(FIRST, 100), 1);
    EXPECT_EQ(basalt::platform::ticks_of(FIRST - 1, 999'999'999), 0);
    EXPECT_EQ(basalt::platform::ticks_of(LAST + 1, 0), 9'223'372'036'840'000'000);
    EXPECT_EQ(basalt::platform::ticks_of(INT64_MAX, 999'999'999), 9'223'372'036'849'999'999);
}

TEST_F(FileSearch, reports_being_out_of_memory_and_describes_what_it_can_otherwise) {
    fs::create_symlink("nowhere", folder / "link");
    fs::create_directory(folder / "within");
    for (const int error : {EIO, ENOMEM}) {
        for (const wchar_t* const pattern : {L"lin*", L"link", L"with*"}) {
            bool fails = true;
            for (int n = 1; fails; ++n) {
                WIN32_FIND_DATAW entry = {};
                const SystemFailure failure(n, SystemFailure::Then::RECOVERS, error);
                const HANDLE search = FindFirstFileW(folder.wide(pattern).c_str(), &entry);
                fails = SystemFailure::struck();
                const bool found = FindClose(search) != 0;
                EXPECT_TRUE(fails ? error == EIO || !found : found) << pattern << n;
                EXPECT_TRUE(!found || (entry.dwFileAttributes == 0x10) == (pattern[0] == L'w'));
            }
        }
    }
}

}  // namespace
