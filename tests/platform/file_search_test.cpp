#include "src/platform/file_search.h"

#include <fcntl.h>
#include <fnmatch.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <ctime>
#include <filesystem>
#include <set>
#include <string>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/disk/wildcard.h"
#include "src/platform/file.h"
#include "src/platform/ticks.h"
#include "tests/platform/error_of.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::platform::tick_count;
using basalt::test::error_of;
using basalt::test::open_descriptors;
using basalt::test::ScratchFolder;
using basalt::test::SystemFailure;
using WideNames = std::set<std::wstring>;

// All entries a search names; the last error is what ended it.
WideNames search(const std::wstring& path) {
    WideNames names;
    WIN32_FIND_DATAW entry = {};
    const HANDLE found = FindFirstFileW(path.c_str(), &entry);
    if (found == INVALID_HANDLE_VALUE) {
        return names;
    }
    do {
        EXPECT_TRUE(names.insert(entry.cFileName).second);
        EXPECT_EQ(entry.dwReserved0 + entry.dwReserved1 + static_cast<DWORD>(entry.cAlternateFileName[0]),
                  0U);
    } while (FindNextFileW(found, &entry) != 0);
    const DWORD error = GetLastError();
    EXPECT_EQ(FindClose(found), 1);
    EXPECT_EQ(error_of(FindClose(found)), ERROR_INVALID_HANDLE);
    SetLastError(error);
    return names;
}

DWORD search_error(const std::wstring& path) {
    EXPECT_EQ(search(path), WideNames{});
    return GetLastError();
}

WIN32_FIND_DATAW entry_of(const std::wstring& path) {
    WIN32_FIND_DATAW entry = {};
    EXPECT_EQ(FindClose(FindFirstFileW(path.c_str(), &entry)), 1);
    return entry;
}

TEST(Wildcards, match_as_the_systems_own_do) {
    // Every name of up to five and every pattern of up to four characters.
    const auto texts = [](const std::string& characters, std::size_t longest) {
        std::vector<std::string> all = {""};
        for (std::size_t i = 0; i < all.size() && all[i].size() < longest; ++i) {
            for (const char ch : characters) {
                all.push_back(all[i] + ch);
            }
        }
        return all;
    };
    const std::vector<std::string> patterns = texts("ab.*?", 4);
    for (const std::string& name : texts("ab.", 5)) {
        for (const std::string& pattern : patterns) {
            const bool expected = pattern == "*.*" || fnmatch(pattern.c_str(), name.c_str(), 0) == 0;
            ASSERT_EQ(basalt::platform::matches_wildcards(std::wstring(name.begin(), name.end()),
                                                          std::wstring(pattern.begin(), pattern.end())),
                      expected)
                << name << ' ' << pattern;
        }
    }
    EXPECT_TRUE(basalt::platform::matches_wildcards(L"[\\]", L"[\\*"));
}

// Short names are kept without asking for memory; what is short ends somewhere.
TEST(FileSearch, finds_names_of_any_length) {
    const ScratchFolder folder;
    folder.write("file");
    const std::wstring name = folder.wide(L"file");
    const std::size_t end = name.size() - 4;
    for (const std::size_t length : {510U, 511U, 512U, 513U, 4095U}) {
        const std::wstring longer = name.substr(0, end) + std::wstring(length - name.size(), L'\\') + L"file";
        EXPECT_EQ(search(longer), WideNames{L"file"}) << length;
    }
}

TEST(FileSearch, names_what_matches) {
    const ScratchFolder folder;
    for (const char* name : {"a.txt", "b.txt", "A.TXT", ".hidden", "plain", "~0004711.mem", "\xC3\xA9.txt"}) {
        folder.write(name);
    }
    std::filesystem::create_directory(folder / "folder.txt");
    const long descriptors = open_descriptors();
    const WideNames texts = {L"a.txt", L"b.txt", L"folder.txt", L"\x00E9.txt"};
    EXPECT_EQ(search(folder.wide(L"*.txt")), texts);
    EXPECT_EQ(GetLastError(), ERROR_NO_MORE_FILES);
    EXPECT_EQ(search(folder.wide(L"\\?.txt")), (WideNames{L"a.txt", L"b.txt", L"\x00E9.txt"}));
    EXPECT_EQ(search(folder.wide(L"\\~*.mem")), WideNames{L"~0004711.mem"});
    WideNames all = texts;
    all.merge(WideNames{L".", L"..", L"A.TXT", L".hidden", L"plain", L"~0004711.mem"});
    EXPECT_EQ(search(folder.wide(L"*")), all);

    EXPECT_EQ(search(folder.wide(L"a.txt")), WideNames{L"a.txt"});
    EXPECT_EQ(GetLastError(), ERROR_NO_MORE_FILES);
    EXPECT_EQ(search(folder.wide(L"folder.txt\\..")), WideNames{L".."});
    const auto before = std::filesystem::current_path();
    std::filesystem::current_path(folder.path());
    EXPECT_EQ(search(L"pl*"), WideNames{L"plain"});
    std::filesystem::current_path(before);

    EXPECT_EQ(search_error(folder.wide(L"*.none")), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(search_error(folder.wide(L"none")), ERROR_FILE_NOT_FOUND);
    for (const wchar_t* path : {L"", L"/", L"\\", L"C:", L"C:\\"}) {
        EXPECT_EQ(search_error(path), ERROR_FILE_NOT_FOUND) << path;
    }
    EXPECT_EQ(search_error(folder.wide(L"folder.txt/")), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(search_error(folder.wide(L"none/x")), ERROR_PATH_NOT_FOUND);
    EXPECT_EQ(search_error(folder.wide(L"none/*")), ERROR_PATH_NOT_FOUND);
    EXPECT_EQ(search_error(folder.wide(L"a.txt/*")), ERROR_PATH_NOT_FOUND);
    EXPECT_EQ(search_error(folder.wide(L"a.txt/x")), ERROR_PATH_NOT_FOUND);
    EXPECT_EQ(search_error(folder.wide(L"\xD800")), ERROR_INVALID_NAME);
    EXPECT_EQ(open_descriptors(), descriptors);
}

TEST(FileSearch, tells_kinds_sizes_and_times) {
    const ScratchFolder folder;
    folder.write("file", "12345");
    std::filesystem::create_directory(folder / "folder");
    std::filesystem::create_symlink("folder", folder / "to_folder");
    std::filesystem::create_symlink("nowhere", folder / "to_nowhere");
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);
    for (const wchar_t* name : {L"file", L"to_nowhere", L"pipe"}) {
        EXPECT_EQ(entry_of(folder.wide(name)).dwFileAttributes, FILE_ATTRIBUTE_NORMAL);
    }
    for (const wchar_t* name : {L"folder", L"to_folder", L"."}) {
        EXPECT_EQ(entry_of(folder.wide(name)).dwFileAttributes, FILE_ATTRIBUTE_DIRECTORY);
    }
    // A second before 1970 and 700 ns, as `date -d @-1` and 116444736000000000 ticks from 1601 to 1970 say;
    // and 2001-09-09 01:46:40, 10^9 seconds after 1970.
    const timespec times[] = {{-1, 700}, {1'000'000'000, 0}};
    ASSERT_EQ(utimensat(AT_FDCWD, (folder / "file").c_str(), times, 0), 0);
    const WIN32_FIND_DATAW file = entry_of(folder.wide(L"file"));
    EXPECT_EQ(tick_count(file.ftLastAccessTime), 116'444'735'990'000'007);
    EXPECT_EQ(tick_count(file.ftLastWriteTime), 126'444'736'000'000'000);
    timespec clock = {};
    clock_gettime(CLOCK_REALTIME, &clock);
    const std::int64_t now = basalt::platform::ticks_of(clock);
    EXPECT_LE(tick_count(file.ftCreationTime), now) << "created here and now, whatever the other times say";
    EXPECT_GT(tick_count(file.ftCreationTime), now - 600'000'000);
    EXPECT_EQ(file.nFileSizeLow, 5U);
    ASSERT_EQ(truncate((folder / "file").c_str(), (off_t{3} << 32) + 7), 0);
    EXPECT_EQ(entry_of(folder.wide(L"file")).nFileSizeHigh, 3U);
    EXPECT_EQ(entry_of(folder.wide(L"file")).nFileSizeLow, 7U);
}

TEST(FileSearch, brings_times_beyond_the_count_to_its_ends) {
    using basalt::platform::ticks_of;
    constexpr std::int64_t FIRST = -11'644'473'600;  // 1601, in seconds from 1970
    constexpr std::int64_t LAST = 910'692'730'084;   // the last one that 2^63 - 1 ticks hold whole
    EXPECT_EQ(ticks_of(FIRST, 100), 1);
    EXPECT_EQ(ticks_of(FIRST - 1, 999'999'999), 0);
    EXPECT_EQ(ticks_of(INT64_MIN, 0), 0);
    EXPECT_EQ(ticks_of(LAST, 999'999'999), 9'223'372'036'849'999'999);
    EXPECT_EQ(ticks_of(LAST + 1, 0), 9'223'372'036'840'000'000);
    EXPECT_EQ(ticks_of(INT64_MAX, 999'999'999), 9'223'372'036'849'999'999);
}

TEST(FileSearch, every_failing_call_is_told_and_leaves_nothing_open) {
    const ScratchFolder folder;
    folder.write("a");
    folder.write("b");
    const long descriptors = open_descriptors();
    for (const std::wstring& path : {folder.wide(L"*"), folder.wide(L"a")}) {
        const std::size_t expected = path.back() == L'*' ? 4 : 1;
        bool fails = true;
        for (int n = 1; fails; ++n) {
            std::size_t count = 0;
            {
                const SystemFailure failure(n, SystemFailure::Then::STAYS);
                count = search(path).size();
                fails = SystemFailure::struck();
            }
            EXPECT_EQ(GetLastError() == ERROR_NO_MORE_FILES && count == expected, !fails) << n;
            EXPECT_EQ(open_descriptors(), descriptors);
        }
    }
    // Want of memory is told as such, of whatever the search had found.
    std::filesystem::create_symlink("a", folder / "link");
    bool is_short = true;
    for (int n = 1; is_short; ++n) {
        WIN32_FIND_DATAW found = {};
        const SystemFailure failure(n, SystemFailure::Then::RECOVERS, ENOMEM);
        const HANDLE begun = FindFirstFileW(folder.wide(L"lin*").c_str(), &found);
        is_short = SystemFailure::struck();
        EXPECT_EQ(begun == INVALID_HANDLE_VALUE && GetLastError() == ERROR_NOT_ENOUGH_MEMORY, is_short) << n;
        FindClose(begun);
    }
    // Folders alone, told as such even where the system says no more of them.
    std::filesystem::create_directory(folder / "within");
    WIN32_FIND_DATAW entry = {};
    bool fails = true;
    for (int n = 1; fails; ++n) {
        const SystemFailure failure(n);
        const HANDLE found = FindFirstFileW(folder.wide(L"within/*").c_str(), &entry);
        fails = SystemFailure::struck();
        EXPECT_TRUE(FindClose(found) == 0 || entry.dwFileAttributes == FILE_ATTRIBUTE_DIRECTORY) << n;
    }
    EXPECT_EQ(error_of(FindNextFileW(nullptr, &entry)), ERROR_INVALID_HANDLE);
    const HANDLE found = FindFirstFileW(folder.wide(L"*").c_str(), &entry);
    EXPECT_EQ(CloseHandle(found), 0) << "a search is no file";
    EXPECT_EQ(FindClose(found), 1);
}

}  // namespace
