#include "src/platform/file.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <filesystem>
#include <string>

#include "basalt/platform/error.h"
#include "basalt/util/file_logger.h"
#include "src/platform/file_search.h"
#include "src/platform/text/file_name.h"
#include "tests/support/child.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::in_child;
using basalt::test::SystemFailure;
using Names = std::set<std::string>;
namespace fs = std::filesystem;

constexpr DWORD BOTH = GENERIC_READ | GENERIC_WRITE;
const HANDLE NONE = INVALID_HANDLE_VALUE;

struct File : testing::Test {
    const basalt::test::ScratchFolder folder;
};

HANDLE open(const std::wstring& name, DWORD disposition, DWORD flags = FILE_FLAG_DELETE_ON_CLOSE) {
    SetLastError(0);
    return CreateFileW(name.c_str(), BOTH, 0, nullptr, disposition, flags, nullptr);
}
DWORD open_error(const std::wstring& name, DWORD disposition) {
    return open(name, disposition) == NONE ? GetLastError() : 0;
}
DWORD delete_error(const std::wstring& name) {
    return DeleteFileW(name.c_str()) == 0 ? GetLastError() : 0;
}

TEST_F(File, is_held_alone_and_deleted_on_close) {
    const std::wstring name = folder.wide(L"~\x00E9\x4E2D\x1F600.mem");
    const std::string on_disk = "~\xC3\xA9\xE4\xB8\xAD\xF0\x9F\x98\x80.mem";
    const long descriptors = basalt::test::open_descriptors();
    const SystemFailure interrupted(1, SystemFailure::Then::RECOVERS, EINTR);
    const HANDLE file = open(name, CREATE_NEW, FILE_ATTRIBUTE_HIDDEN | FILE_FLAG_DELETE_ON_CLOSE);
    EXPECT_EQ(GetLastError(), 0U) << "success leaves it alone";
    struct stat status = {};
    ASSERT_EQ(stat((folder / on_disk).c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777U, 0600U);
    EXPECT_EQ(open_error(name, CREATE_NEW), ERROR_FILE_EXISTS);
    EXPECT_EQ(open_error(name, OPEN_EXISTING), ERROR_SHARING_VIOLATION) << "not even in this process";
    EXPECT_EQ(delete_error(name), ERROR_SHARING_VIOLATION);
    EXPECT_EQ(in_child([&] { std::exit(delete_error(name) == ERROR_SHARING_VIOLATION ? 0 : 1); }), 0);
    EXPECT_EQ(folder.names(), Names{on_disk}) << "a child's end leaves its parent's files";
    EXPECT_EQ(CloseHandle(file), 1);
    EXPECT_EQ(folder.names(), Names{});
    EXPECT_EQ(basalt::test::open_descriptors(), descriptors);
    EXPECT_EQ(CloseHandle(file), 0);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
}

TEST_F(File, without_delete_on_close_it_stays) {
    fs::create_directories(folder / "a/b");
    const HANDLE file = open(folder.wide(L"\\a\\/b\\x"), CREATE_NEW, FILE_ATTRIBUTE_NORMAL);
    EXPECT_EQ(CloseHandle(file), 1);
    EXPECT_TRUE(fs::exists(folder / "a/b/x")) << "both separators work";
    const HANDLE again = open(folder.wide(L"a\\b\\x"), OPEN_EXISTING, 0x0C000102);
    EXPECT_NE(again, file) << "a handle is not reused";
    EXPECT_EQ(CloseHandle(again), 1);
    EXPECT_FALSE(fs::exists(folder / "a/b/x"));
}

TEST_F(File, failures_have_their_win32_codes) {
    folder.write("file");
    fs::create_directory(folder / "folder");
    fs::create_symlink("nowhere", folder / "link");
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);
    struct Row {
        std::wstring name;
        DWORD create, open, remove;
    };
    const std::wstring here = folder.wide(L"");
    for (const Row& row :
         {Row{L"", 3, 3, 3}, Row{here + L"missing/x", 3, 3, 3}, Row{here + L"file/x", 3, 3, 3},
          Row{here + L"folder", 80, 5, 5}, Row{here + L"pipe", 80, 5, 0},
          Row{here + L"\xD800", 123, 123, 123}, Row{here + L"link", 80, 2, 0},
          Row{here + std::wstring(300, L'x'), 206, 206, 206}}) {
        SCOPED_TRACE(testing::PrintToString(row.name));
        EXPECT_EQ(open_error(row.name, CREATE_NEW), row.create);
        EXPECT_EQ(open_error(row.name, OPEN_EXISTING), row.open);
        EXPECT_EQ(delete_error(row.name), row.remove);
    }
    EXPECT_EQ(open_error(here + L"none", OPEN_EXISTING), 2U);
    EXPECT_EQ(delete_error(here + L"none"), 2U);
    const auto refuses = [&](const wchar_t* name, DWORD access, DWORD sharing, DWORD disposition,
                             DWORD flags) {
        return CreateFileW(name, access, sharing, nullptr, disposition, flags, nullptr) == NONE;
    };
    const wchar_t* const name = L"/tmp/new";
    EXPECT_TRUE(refuses(nullptr, BOTH, 0, 1, 0) && DeleteFileW(nullptr) == 0);
    EXPECT_TRUE(refuses(name, GENERIC_READ, 0, 1, 0) && refuses(name, BOTH, 1, 1, 0) &&
                refuses(name, BOTH, 0, 2, 0) && refuses(name, BOTH, 0, 1, 1));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(folder.names(), (Names{"file", "folder"}));
}

TEST_F(File, names_that_are_not_utf8_come_back) {
    using namespace basalt::platform;
    std::string name;
    for (const char* bytes :
         {"plain", "\xC3\xA9", "\xEF\xBF\xBD", "a\xFFz", "\xC3\xA9\x80", "\xED\xA0\x80"}) {
        EXPECT_TRUE(file_name_from_wide(wide_from_file_name(bytes), name) && name == bytes) << bytes;
    }
    EXPECT_EQ(wide_from_file_name("a\xFFz"), L"a\xDCFFz");
}

TEST_F(File, deletes_what_it_opened_and_nothing_else) {
    const fs::path before = fs::current_path();
    fs::create_directory(folder / "gone");
    fs::current_path(folder / "gone");
    const HANDLE relative = open(L"relative", CREATE_NEW);
    fs::current_path(before);
    EXPECT_EQ(CloseHandle(relative), 1);
    fs::current_path(folder / "gone");
    fs::remove(folder / "gone");
    EXPECT_EQ(open_error(L"relative", CREATE_NEW), ERROR_PATH_NOT_FOUND);
    fs::current_path(before);
    const HANDLE replaced = open(folder.wide(L"replaced"), CREATE_NEW);
    fs::remove(folder / "replaced");
    folder.write("replaced", "another's");
    EXPECT_EQ(CloseHandle(replaced), 1);
    EXPECT_EQ(folder.names(), Names{"replaced"});
}

TEST_F(File, left_open_it_is_deleted_at_exit_but_not_by_a_kill) {
    for (const bool is_killed : {false, true}) {
        in_child([&] {
            open(folder.wide(L"left"), CREATE_NEW);
            is_killed ? static_cast<void>(raise(SIGKILL)) : std::exit(0);
        });
        EXPECT_EQ(folder.names(), is_killed ? Names{"left"} : Names{});
    }
    EXPECT_EQ(delete_error(folder.wide(L"left")), 0U);
}

TEST_F(File, temporary_files_are_new_and_named_as_in_win32) {
    const std::wstring plain = folder.wide(L"").substr(0, folder.path().size());
    const std::wstring longest = std::wstring(MAX_PATH - 14 - plain.size(), L'/') + plain;
    wchar_t name[MAX_PATH] = {};
    for (const wchar_t* const prefix : {L"vma", L"vmax", L"v", L""}) {
        for (const std::wstring& place : {plain, plain + L"\\", longest}) {
            const UINT number = GetTempFileNameW(place.c_str(), prefix, 0, name);
            wchar_t text[40];
            std::swprintf(text, 40, L"%.3ls%X.tmp", prefix, number);
            EXPECT_EQ(name, place + (place.back() == L'\\' ? L"" : L"/") + text);
            EXPECT_TRUE(number >= 1 && number <= 0xFFFF && delete_error(folder.wide(text)) == 0);
        }
    }
    const std::wstring last = name;
    const auto error = [&](const std::wstring& place, const wchar_t* prefix, UINT unique) {
        return GetTempFileNameW(place.c_str(), prefix, unique, name) == 0 ? GetLastError() : 0;
    };
    EXPECT_EQ(error(folder.wide(L"missing"), L"vma", 0), ERROR_PATH_NOT_FOUND);
    EXPECT_EQ(error(L"/" + longest, L"vma", 0), ERROR_FILENAME_EXCED_RANGE);
    EXPECT_EQ(error(plain, L"\xD800", 0), ERROR_INVALID_NAME);
    EXPECT_EQ(error(plain, L"vma", 7), ERROR_INVALID_PARAMETER);
    const SystemFailure taken(1, SystemFailure::Then::STAYS, EEXIST);
    EXPECT_EQ(error(plain, L"vma", 0), ERROR_FILE_EXISTS);
    EXPECT_EQ(name, last) << "unchanged";
    EXPECT_EQ(folder.names(), Names{});
}

// Another user of the folder may put a link or a file of their own in the place of a new temporary file.
TEST_F(File, a_new_temporary_file_is_reopened_or_nothing) {
    folder.write("victim", "kept");
    for (const int kind : {0, 1, 2}) {
        wchar_t name[MAX_PATH] = {};
        ASSERT_NE(GetTempFileNameW(folder.wide(L"").c_str(), L"vma", 0, name), 0U);
        const fs::path made = std::wstring(name);
        if (kind > 0) {
            fs::remove(made);
            kind == 1 ? fs::create_symlink("victim", made) : fs::create_hard_link(folder / "victim", made);
        }
        EXPECT_EQ(open_error(name, OPEN_EXISTING), kind == 0 ? 0U : kind == 1 ? 1921U : 5U);
        EXPECT_EQ(open_error(folder.wide(L"none"), OPEN_EXISTING), 2U);
        EXPECT_EQ(delete_error(name), kind == 0 ? 32U : 0U);
        EXPECT_EQ(folder.read("victim"), "kept");
    }
}

// Whatever the library opens stays away from the numbers of standard input, output and error.
TEST_F(File, descriptors_are_above_standard_error) {
    EXPECT_EQ(in_child([&] {
                  for (const int standard : {0, 1, 2}) {
                      close(standard);
                  }
                  const HANDLE file = open(folder.wide(L"file"), CREATE_NEW);
                  WIN32_FIND_DATAW entry;
                  const HANDLE search = FindFirstFileW(folder.wide(L"*").c_str(), &entry);
                  const vex_util::FileLogger log((folder / "log").c_str());
                  OutputDebugStringW(L"lost");
                  EXPECT_TRUE(file != NONE && search != NONE && folder.names().size() == 2);
                  for (const int standard : {0, 1, 2}) {
                      EXPECT_EQ(fcntl(standard, F_GETFD), -1);
                  }
                  FindClose(search);
                  CloseHandle(file);
              }),
              0);
}

// Standard error may be a full pipe, one without a reader, or a file at the limit on sizes.
TEST_F(File, reports_raise_no_signal_and_do_not_block) {
    const auto report = [](int error) {
        dup2(error, STDERR_FILENO);
        SetLastError(7);
        for (int i = 0; i < 2000; ++i) {
            OutputDebugStringW(std::wstring(100, L'x').c_str());
        }
        EXPECT_EQ(GetLastError(), 7U);
    };
    EXPECT_EQ(in_child([&] {
                  int ends[2];
                  ASSERT_EQ(pipe(ends), 0);
                  report(ends[1]);
                  close(ends[0]);
                  sigset_t blocked, pending;
                  sigemptyset(&blocked);
                  sigaddset(&blocked, SIGPIPE);
                  for (const bool was_pending : {false, true}) {
                      if (was_pending) {
                          sigprocmask(SIG_BLOCK, &blocked, nullptr);
                          raise(SIGPIPE);
                      }
                      report(ends[1]);
                      sigpending(&pending);
                      EXPECT_EQ(sigismember(&pending, SIGPIPE), was_pending ? 1 : 0);
                  }
                  const rlimit limit = {1000, RLIM_INFINITY};
                  setrlimit(RLIMIT_FSIZE, &limit);
                  report(::open((folder / "errors").c_str(), O_CREAT | O_WRONLY, 0600));
              }),
              0);
    EXPECT_EQ(folder.read("errors"), std::string(1000, 'x'));
}

}  // namespace
