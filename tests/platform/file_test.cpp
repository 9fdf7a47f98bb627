#include "src/platform/file.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <cerrno>
#include <csignal>
#include <filesystem>

#include "basalt/platform/error.h"
#include "basalt/util/file_logger.h"
#include "src/platform/file_search.h"
#include "tests/support/child.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::in_child;
using basalt::test::SystemFailure;
using Names = std::set<std::string>;
namespace fs = std::filesystem;

struct File : testing::Test {
    const basalt::test::ScratchFolder folder;
    const std::wstring here = folder.wide(L"");
};

HANDLE open(const std::wstring& name, DWORD disposition, DWORD flags = FILE_FLAG_DELETE_ON_CLOSE) {
    return CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, disposition, flags, nullptr);
}
// 0 when it opens, and is closed again.
DWORD open_error(const std::wstring& name, DWORD disposition) {
    return CloseHandle(open(name, disposition, 0)) != 0 ? 0 : (open(name, disposition, 0), GetLastError());
}
DWORD delete_error(const std::wstring& name) {
    return DeleteFileW(name.c_str()) == 0 ? GetLastError() : 0;
}

TEST_F(File, is_held_alone_and_deleted_on_close) {
    const std::wstring name = here + L"~\xE9\x1F600.mem";
    const long descriptors = basalt::test::open_descriptors();
    const SystemFailure interrupted(1, SystemFailure::Then::RECOVERS, EINTR);
    const HANDLE file = open(name, CREATE_NEW, FILE_ATTRIBUTE_HIDDEN | FILE_FLAG_DELETE_ON_CLOSE);
    struct stat status = {};
    ASSERT_EQ(stat((folder / "~\xC3\xA9\xF0\x9F\x98\x80.mem").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777U, 0600U);
    EXPECT_EQ(open_error(name, CREATE_NEW), ERROR_FILE_EXISTS);
    EXPECT_EQ(open_error(name, OPEN_EXISTING), ERROR_SHARING_VIOLATION) << "not even in this process";
    in_child([&] {
        open(here + L"child's", CREATE_NEW);
        const DWORD error = delete_error(name);
        CloseHandle(file);
        std::exit(error == ERROR_SHARING_VIOLATION ? 0 : 1);
    });
    EXPECT_EQ(folder.names().size(), 1U) << "a child's end leaves its parent's files";
    EXPECT_TRUE(CloseHandle(file) == 1 && CloseHandle(file) == 0 && GetLastError() == ERROR_INVALID_HANDLE);
    EXPECT_TRUE(folder.names().empty() && basalt::test::open_descriptors() == descriptors);
    fs::create_directories(folder / "a/b");
    EXPECT_EQ(CloseHandle(open(here + L"\\a\\/b\\x", CREATE_NEW, FILE_ATTRIBUTE_NORMAL)), 1);
    EXPECT_TRUE(fs::exists(folder / "a/b/x")) << "stays; both separators work";
    EXPECT_EQ(CloseHandle(open(here + L"a\\b\\x", OPEN_EXISTING, 0x0C000102)), 1);
    EXPECT_FALSE(fs::exists(folder / "a/b/x"));
}

TEST_F(File, failures_have_their_win32_codes) {
    folder.write("file");
    fs::create_directory(folder / "folder");
    fs::create_symlink("nowhere", folder / "link");
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);
    const std::tuple<std::wstring, DWORD, DWORD, DWORD> rows[] = {
        {L"", 3, 3, 3},
        {here + L"missing/x", 3, 3, 3},
        {here + L"file/x", 3, 3, 3},
        {here + L"folder", 80, 5, 5},
        {here + L"pipe", 80, 5, 0},
        {here + L"link", 80, 2, 0},
        {here + L"\xD800", 123, 123, 123},
        {here + std::wstring(300, L'x'), 206, 206, 206}};
    for (const auto& [name, create, existing, remove] : rows) {
        const DWORD errors[] = {open_error(name, CREATE_NEW), open_error(name, OPEN_EXISTING),
                                delete_error(name)};
        EXPECT_TRUE(errors[0] == create && errors[1] == existing && errors[2] == remove)
            << create << errors[1];
    }
    EXPECT_TRUE(open_error(here + L"none", OPEN_EXISTING) == 2 && delete_error(here + L"none") == 2);
    const DWORD wrong[][4] = {
        {0x80000000, 0, 1, 0}, {0xC0000000, 1, 1, 0}, {0xC0000000, 0, 2, 0}, {0xC0000000, 0, 1, 1}};
    for (const auto& [access, sharing, disposition, flags] : wrong) {
        EXPECT_EQ(CreateFileW(L"/tmp/x", access, sharing, nullptr, disposition, flags, nullptr),
                  INVALID_HANDLE_VALUE);
        EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    }
    EXPECT_EQ(folder.names(), (Names{"file", "folder"}));
}

TEST_F(File, deletes_what_it_opened_and_nothing_else_unless_killed) {
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
    const HANDLE replaced = open(here + L"replaced", CREATE_NEW);
    fs::remove(folder / "replaced");
    folder.write("replaced", "another's");
    EXPECT_EQ(CloseHandle(replaced), 1);
    EXPECT_EQ(delete_error(here + L"replaced"), 0U);
    for (const bool is_killed : {false, true}) {
        in_child(
            [&] {
                open(here + L"left", CREATE_NEW);
                is_killed ? static_cast<void>(raise(SIGKILL)) : std::exit(0);
            },
            is_killed ? SIGKILL : 0);
        EXPECT_EQ(folder.names(), is_killed ? Names{"left"} : Names{});
    }
}

TEST_F(File, temporary_ones_are_new_and_named_as_in_win32) {
    const std::wstring plain = here.substr(0, here.size() - 1);
    const std::wstring longest = std::wstring(MAX_PATH - 14 - plain.size(), L'/') + plain;
    wchar_t name[MAX_PATH] = {};
    for (const wchar_t* const prefix : {L"vma", L"vmax", L""}) {
        for (const std::wstring& place : {plain, plain + L"\\", longest}) {
            const UINT number = GetTempFileNameW(place.c_str(), prefix, 0, name);
            wchar_t text[40];
            std::swprintf(text, 40, L"%.3ls%X.tmp", prefix, number);
            EXPECT_EQ(name, place + (place.back() == L'\\' ? L"" : L"/") + text);
            EXPECT_TRUE(number >= 1 && number <= 0xFFFF && delete_error(here + text) == 0);
        }
    }
    const std::wstring last = name;
    const SystemFailure taken(1, SystemFailure::Then::STAYS, EEXIST);
    const std::tuple<std::wstring, const wchar_t*, UINT, DWORD> errors[] = {{L"/" + longest, L"vma", 0, 206},
                                                                            {plain, L"\xD800", 0, 123},
                                                                            {plain, L"vma", 7, 87},
                                                                            {plain, L"vma", 0, 80}};
    for (const auto& [place, prefix, unique, error] : errors) {
        EXPECT_TRUE(GetTempFileNameW(place.c_str(), prefix, unique, name) == 0 && GetLastError() == error)
            << error;
    }
    EXPECT_TRUE(name == last && folder.names().empty());
}

// Another user of the folder may put a link or a file of their own in the place of a new temporary file.
TEST_F(File, a_new_temporary_one_is_reopened_or_nothing) {
    folder.write("victim", "kept");
    for (const DWORD error : {0U, 1921U, 5U}) {
        wchar_t name[MAX_PATH] = {};
        ASSERT_NE(GetTempFileNameW(here.c_str(), L"vma", 0, name), 0U);
        fs::path made = std::wstring(name);
        if (error != 0) {
            fs::remove(made);
            error == 5 ? fs::create_hard_link(folder / "victim", made) : fs::create_symlink("victim", made);
        }
        const HANDLE file = open(name, OPEN_EXISTING);
        EXPECT_EQ(file == INVALID_HANDLE_VALUE ? GetLastError() : 0U, error);
        CloseHandle(file);
        EXPECT_EQ(folder.read("victim"), "kept");
        EXPECT_EQ(open_error(name, OPEN_EXISTING), error == 0 ? 2U : 0U) << "only the first time";
    }
}

// Nothing that the library opens gets the number of standard input, output or error.
TEST_F(File, descriptors_are_above_standard_error) {
    in_child([&] {
        for (const int standard : {0, 1, 2}) {
            close(standard);
        }
        WIN32_FIND_DATAW entry;
        EXPECT_NE(open(here + L"file", CREATE_NEW), INVALID_HANDLE_VALUE);
        EXPECT_NE(FindFirstFileW((here + L"*").c_str(), &entry), INVALID_HANDLE_VALUE);
        const vex_util::FileLogger log((folder / "log").c_str());
        OutputDebugStringW(L"lost");
        EXPECT_EQ(folder.names().size(), 2U);
        EXPECT_TRUE(fcntl(0, F_GETFD) == -1 && fcntl(1, F_GETFD) == -1 && fcntl(2, F_GETFD) == -1);
    });
}

// Standard error may be a full pipe, one without a reader, or a file at the limit on sizes.
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
        report(ends[1]);
        close(ends[0]);
        report(ends[1]);
        sigset_t signals;
        sigemptyset(&signals);
        sigaddset(&signals, SIGPIPE);
        sigprocmask(SIG_BLOCK, &signals, nullptr);
        raise(SIGPIPE);
        report(ends[1]);
        sigpending(&signals);
        EXPECT_EQ(sigismember(&signals, SIGPIPE), 1) << "pending before, so still pending";
        const rlimit limit = {1000, RLIM_INFINITY};
        setrlimit(RLIMIT_FSIZE, &limit);
        report(::open((folder / "errors").c_str(), O_CREAT | O_WRONLY, 0600));
    });
    EXPECT_EQ(folder.read("errors"), std::string(1000, 'x'));
}

}  // namespace
