#include "src/platform/file_search.h"

#include <fcntl.h>
#include <fnmatch.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "basalt/platform/error.h"
#include "src/platform/disk/wildcard.h"
#include "src/platform/ticks.h"
#include "tests/support/scratch_folder.h"

namespace {

using namespace basalt::platform;
using WideNames = std::set<std::wstring>;

struct FileSearch : testing::Test {
    const basalt::test::ScratchFolder folder;
};

TEST(Wildcards, match_as_the_systems_own_do) {
    std::vector<std::string> texts = {""};  // every one of up to four of these characters
    for (std::size_t i = 0; texts[i].size() < 4; ++i) {
        for (const char ch : {'a', 'b', '.', '*', '?'}) {
            texts.push_back(texts[i] + ch);
        }
    }
    const auto wide = [](const std::string& text) { return std::wstring(text.begin(), text.end()); };
    for (const std::string& name : texts) {
        for (const std::string& pattern : texts) {
            const bool expected = pattern == "*.*" || fnmatch(pattern.c_str(), name.c_str(), 0) == 0;
            ASSERT_EQ(matches_wildcards(wide(name), wide(pattern)), expected) << name << ' ' << pattern;
        }
    }
    EXPECT_TRUE(matches_wildcards(L"[\\]", L"[\\*"));
}

// All names found, and what ended the search.
std::pair<WideNames, DWORD> search(const std::wstring& path) {
    WideNames names;
    WIN32_FIND_DATAW entry = {};
    const HANDLE found = FindFirstFileW(path.c_str(), &entry);
    for (BOOL more = found != INVALID_HANDLE_VALUE ? 1 : 0; more != 0; more = FindNextFileW(found, &entry)) {
        EXPECT_TRUE(names.insert(entry.cFileName).second);
    }
    const DWORD error = GetLastError();
    EXPECT_TRUE(CloseHandle(found) == 0 && FindClose(found) == (names.empty() ? 0 : 1));
    return {names, error};
}

TEST_F(FileSearch, finds_what_matches) {
    for (const char* name : {"a.txt", "A.TXT", ".hidden", "plain", "\xC3\xA9.txt"}) {
        folder.write(name);
    }
    std::filesystem::create_directory(folder / "dir.txt");
    const std::wstring here = folder.wide(L""), far = here + std::wstring(506 - here.size(), L'\\');
    const WideNames all = {L".", L"..", L"a.txt", L"A.TXT", L".hidden", L"plain", L"\xE9.txt", L"dir.txt"};
    const std::tuple<DWORD, WideNames, WideNames> rows[] = {
        {18, {L"a.txt", L"dir.txt", L"\xE9.txt"}, {here + L"*.txt"}},
        {18, {L"a.txt", L"\xE9.txt"}, {here + L"\\?.txt"}},
        {18, all, {here + L"*", here + L"*.*"}},
        {18, {L".."}, {here + L"dir.txt\\.."}},
        {18, {L"plain"}, {far + L"plain", far + L"\\plain", far + std::wstring(3500, L'/') + L"plain"}},
        {2, {}, {here + L"*.none", L"", L"/", L"C:\\", here + L"dir.txt/"}},
        {3, {}, {here + L"none/x", here + L"none/*", here + L"a.txt/*", here + L"a.txt/x"}},
        {123, {}, {here + L"\xD800"}}};
    for (const auto& [error, names, paths] : rows) {
        for (const std::wstring& path : paths) {
            EXPECT_EQ(search(path), std::pair(names, error)) << testing::PrintToString(path);
        }
    }
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
    constexpr std::int64_t FIRST = -11'644'473'600;  // 1601, in seconds from 1970
    constexpr std::int64_t LAST = 910'692'730'084;   // the last one that 2^63 - 1 ticks hold whole
    EXPECT_TRUE(ticks_of(FIRST, 100) == 1 && ticks_of(FIRST - 1, 999'999'999) == 0);
    EXPECT_EQ(ticks_of(LAST + 1, 0), 9'223'372'036'840'000'000);
    EXPECT_EQ(ticks_of(INT64_MAX, 999'999'999), 9'223'372'036'849'999'999);
}

}  // namespace
