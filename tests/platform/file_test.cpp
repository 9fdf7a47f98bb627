// Wildcards, and what files of the library's own promise beyond what the tests of mapped blocks, allocators
// and logs see.
#include "src/platform/file.h"

#include <fcntl.h>
#include <fnmatch.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <csignal>

#include "basalt/util/file_logger.h"
#include "src/platform/disk/wildcard.h"
#include "src/platform/file_mapping.h"
#include "src/platform/file_search.h"
#include "src/platform/ticks.h"
#include "tests/platform/error_of.h"
#include "tests/support/child.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using namespace basalt::platform;
using namespace basalt::test;
namespace fs = std::filesystem;

struct File : testing::Test {
    const ScratchFolder folder;
    const std::wstring here = folder.wide(L"");
    wchar_t name[MAX_PATH] = {};
    UINT make_temporary(const std::wstring& place) {
        return GetTempFileNameW(place.c_str(), L"vmax", 0, name);
    }
};

HANDLE open(const std::wstring& name, DWORD disposition, DWORD flags = FILE_FLAG_DELETE_ON_CLOSE) {
    return CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, disposition, flags, nullptr);
}
// 0 for success; the file is closed again.
DWORD open_error(const std::wstring& name, DWORD disposition, DWORD flags = 0) {
    const HANDLE file = open(name, disposition, flags);
    return file == INVALID_HANDLE_VALUE ? GetLastError() : (CloseHandle(file), 0);
}
HANDLE make_mapping(HANDLE file, DWORD size) {
    return CreateFileMappingW(file, nullptr, PAGE_READWRITE, 0, size, nullptr);
}
char* map(HANDLE mapping, std::size_t size) {
    return static_cast<char*>(MapViewOfFile(mapping, FILE_MAP_ALL_ACCESS, 0, 0, size));
}

TEST_F(File, is_private_held_alone_and_deleted_on_close_with_nothing_else) {
    const std::wstring unicode = here + L"~\xE9\x1F600.mem";
    const fs::path before = fs::current_path();
    fs::create_directory(folder / "gone");
    fs::current_path(folder / "gone");
    const SystemFailure interrupted(1, SystemFailure::Then::RECOVERS, EINTR);
    const HANDLE file = open(unicode, CREATE_NEW);
    const HANDLE relative = open(L"relative", CREATE_NEW), replaced = open(here + L"replaced", CREATE_NEW);
    fs::current_path(before);
    EXPECT_EQ(fs::status(folder / "~\xC3\xA9\xF0\x9F\x98\x80.mem").permissions(), fs::perms{0600});
    EXPECT_TRUE(open_error(unicode, CREATE_NEW) == 80 && open_error(unicode, OPEN_EXISTING) == 32);
    EXPECT_EQ(error_of(DeleteFileW(unicode.c_str())), ERROR_SHARING_VIOLATION);
    fs::remove(folder / "replaced");
    folder.write("replaced", "another's");
    EXPECT_TRUE(CloseHandle(file) && CloseHandle(relative) && CloseHandle(replaced));
    EXPECT_TRUE(fs::is_empty(folder / "gone") && folder.read("replaced") == "another's");
    EXPECT_EQ(folder.names().size(), 2U);
}

TEST_F(File, temporary_ones_are_new_and_named_as_in_win32) {
    const std::wstring plain = here.substr(0, here.size() - 1);
    const std::wstring longest = std::wstring(MAX_PATH - 14 - plain.size(), L'/') + plain;
    for (const std::wstring& place : {plain, plain + L"\\", longest}) {
        wchar_t text[40];
        std::swprintf(text, 40, L"vma%X.tmp", make_temporary(place));
        EXPECT_EQ(name, place + (place.back() == L'\\' ? L"" : L"/") + text);
        EXPECT_NE(DeleteFileW(name), 0);
    }
    const SystemFailure taken(1, SystemFailure::Then::STAYS, EEXIST);
    EXPECT_EQ(error_of(make_temporary(L"/" + longest)), 206U);
    EXPECT_EQ(error_of(make_temporary(plain)), 80U);
    EXPECT_TRUE(folder.names().empty());
}

// Another user of the folder may put a link or a file of their own in the place of a new temporary file.
TEST_F(File, a_new_temporary_file_is_reopened_or_nothing) {
    folder.write("victim", "kept");
    for (const DWORD error : {0U, 1921U, 5U}) {
        ASSERT_NE(make_temporary(here), 0U);
        const fs::path made = std::wstring(name);
        if (error != 0) {
            fs::remove(made);
            error == 5 ? fs::create_hard_link(folder / "victim", made) : fs::create_symlink("victim", made);
        }
        EXPECT_EQ(open_error(name, OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE), error);
        EXPECT_EQ(folder.read("victim"), "kept");
        EXPECT_EQ(open_error(name, OPEN_EXISTING), error == 0 ? 2U : 0U) << "only the first time";
    }
    ASSERT_NE(make_temporary(here), 0U);
    fs::rename(name, folder / "old");
    EXPECT_EQ(open_error(name, CREATE_NEW), 0U);
    EXPECT_EQ(open_error(name, OPEN_EXISTING), 0U) << "a new file of that name";
}

TEST_F(File, mappings_have_disk_space_and_keep_the_files_lock_without_a_descriptor) {
    constexpr DWORD SIZE = 100'000;  // not a multiple of a page
    const long mapped = bytes_mapped, descriptors = open_descriptors();
    for (const bool view_first : {true, false}) {
        const HANDLE file = open(here + L"file", CREATE_NEW, view_first ? FILE_FLAG_DELETE_ON_CLOSE : 0);
        const HANDLE mapping = make_mapping(file, SIZE);
        struct stat status = {};
        EXPECT_EQ(stat((folder / "file").c_str(), &status), 0);
        EXPECT_TRUE(status.st_size == off_t{SIZE} && status.st_blocks * 512 >= status.st_size);
        char* const view = map(mapping, SIZE);
        EXPECT_EQ(open_descriptors(), descriptors);
        EXPECT_EQ(std::count(view, view + SIZE, 0), static_cast<long>(SIZE));
        view[SIZE - 1] = 'x';
        for (const bool is_view : {view_first, !view_first}) {
            EXPECT_EQ(error_of(DeleteFileW((here + L"file").c_str())), ERROR_SHARING_VIOLATION);
            EXPECT_TRUE(is_view ? UnmapViewOfFile(view) : CloseHandle(mapping) + CloseHandle(file));
        }
        EXPECT_TRUE(UnmapViewOfFile(view) == 0 && bytes_mapped == mapped);
        EXPECT_EQ(folder.names().size(), view_first ? 0U : 1U);
    }
    EXPECT_EQ(folder.read("file").back(), 'x');
}

// Nothing that the library opens gets the number of standard input, output or error.
TEST_F(File, descriptors_are_above_standard_error) {
    in_child([&] {
        close(0), close(1), close(2);
        WIN32_FIND_DATAW entry;
        EXPECT_NE(open(here + L"file", CREATE_NEW), INVALID_HANDLE_VALUE);
        EXPECT_NE(FindFirstFileW((here + L"*").c_str(), &entry), INVALID_HANDLE_VALUE);
        const vex_util::FileLogger log((folder / "log").c_str());
        OutputDebugStringW(L"lost");
        EXPECT_EQ(folder.names().size(), 2U);
        EXPECT_EQ(fcntl(0, F_GETFD) + fcntl(1, F_GETFD) + fcntl(2, F_GETFD), -3);
    });
}

// Standard error may be a full pipe, or one without a reader.
TEST_F(File, reports_raise_no_signal_and_do_not_block) {
    const auto report = [](int error) {
        dup2(error, STDERR_FILENO);
        for (int i = 0; i < 2000; ++i) {
            OutputDebugStringW(std::wstring(100, L'x').c_str());
        }
    };
    in_child([&] {
        int ends[2];
        ASSERT_EQ(pipe(ends), 0);
        report(ends[1]), close(ends[0]), report(ends[1]);
        ASSERT_EQ(pipe(ends), 0);
        close(ends[0]), report(ends[1]);
        sigset_t signals;
        sigemptyset(&signals), sigaddset(&signals, SIGPIPE);
        sigprocmask(SIG_BLOCK, &signals, nullptr), raise(SIGPIPE);
        report(ends[1]);
        EXPECT_TRUE(sigpending(&signals) == 0 && sigismember(&signals, SIGPIPE) == 1) << "as before";
    });
}

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

TEST_F(File, searches_describe_times) {
    folder.write("file");
    // A second before 1970 and 700 ns; from 1601 to 1970 are 116444736000000000 ticks.
    const timespec times[] = {{-1, 700}, {1'000'000'000, 0}};
    ASSERT_EQ(utimensat(AT_FDCWD, (folder / "file").c_str(), times, 0), 0);
    WIN32_FIND_DATAW file;
    FindClose(FindFirstFileW(folder.wide(L"file").c_str(), &file));
    EXPECT_EQ(tick_count(file.ftLastAccessTime), 116'444'735'990'000'007);
    constexpr std::int64_t FIRST = -11'644'473'600;  // 1601, in seconds from 1970
    constexpr std::int64_t LAST = 910'692'730'084;   // the last one that 2^63 - 1 ticks hold whole
    EXPECT_TRUE(ticks_of(FIRST, 100) == 1 && ticks_of(FIRST - 1, 999'999'999) == 0);
    EXPECT_EQ(ticks_of(LAST + 1, 0), 9'223'372'036'840'000'000);
    EXPECT_EQ(ticks_of(INT64_MAX, 999'999'999), 9'223'372'036'849'999'999);
}

}  // namespace
