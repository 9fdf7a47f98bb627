// Files held alone, temporary files and mappings of files.
#include "src/platform/file.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <csignal>

#include "basalt/util/file_logger.h"
#include "src/platform/file_mapping.h"
#include "src/platform/file_search.h"
#include "tests/platform/error_of.h"
#include "tests/support/child.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using namespace basalt::test;
namespace fs = std::filesystem;

constexpr std::size_t SIZE = 100'000;  // not a multiple of a page

struct File : testing::Test {
    const ScratchFolder folder;
    const std::wstring here = folder.wide(L"");
    const long descriptors = open_descriptors();
};

HANDLE open(const std::wstring& name, DWORD disposition, DWORD flags = FILE_FLAG_DELETE_ON_CLOSE) {
    return CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, disposition, flags, nullptr);
}
// 0 for success; the file is closed again.
DWORD open_error(const std::wstring& name, DWORD disposition, DWORD flags = 0) {
    const HANDLE file = open(name, disposition, flags);
    return file == INVALID_HANDLE_VALUE ? GetLastError() : (CloseHandle(file), 0);
}
DWORD delete_error(const std::wstring& name) {
    return DeleteFileW(name.c_str()) == 0 ? GetLastError() : 0;
}
UINT make_temporary(const std::wstring& place, const wchar_t* prefix, wchar_t* name, UINT unique = 0) {
    return GetTempFileNameW(place.c_str(), prefix, unique, name);
}
HANDLE make_mapping(HANDLE file, std::size_t size = SIZE, DWORD protection = PAGE_READWRITE) {
    return CreateFileMappingW(file, nullptr, protection, static_cast<DWORD>(size >> 32),
                              static_cast<DWORD>(size & 0xFFFFFFFF), nullptr);
}
char* map(HANDLE mapping, std::size_t size = SIZE, DWORD offset = 0) {
    return static_cast<char*>(MapViewOfFile(mapping, FILE_MAP_ALL_ACCESS, 0, offset, size));
}
using Errors = std::vector<DWORD>;

TEST_F(File, is_held_alone_and_deleted_on_close_or_exit) {
    const std::wstring name = here + L"~\xE9\x1F600.mem", childs = here + L"child's";
    const SystemFailure interrupted(1, SystemFailure::Then::RECOVERS, EINTR);
    const HANDLE file = open(name, CREATE_NEW, FILE_ATTRIBUTE_HIDDEN | FILE_FLAG_DELETE_ON_CLOSE);
    EXPECT_EQ(fs::status(folder / "~\xC3\xA9\xF0\x9F\x98\x80.mem").permissions(), fs::perms{0600});
    EXPECT_EQ((Errors{open_error(name, CREATE_NEW), open_error(name, OPEN_EXISTING)}), (Errors{80, 32}));
    for (const int signal : {0, SIGKILL}) {
        const auto work = [&] {
            open(childs, CREATE_NEW);
            const bool is_held = delete_error(name) == ERROR_SHARING_VIOLATION;
            CloseHandle(file);
            is_held&& signal != 0 ? static_cast<void>(raise(signal)) : std::exit(is_held ? 0 : 1);
        };
        in_child(work, signal);
        EXPECT_EQ(delete_error(childs), signal == 0 ? 2U : 0U);
    }
    EXPECT_EQ(folder.names().size(), 1U) << "a child leaves its parent's files";
    EXPECT_TRUE(CloseHandle(file) == 1 && error_of(CloseHandle(file)) == ERROR_INVALID_HANDLE);
    EXPECT_TRUE(folder.names().empty() && open_descriptors() == descriptors);
    folder.write("x");
    EXPECT_EQ(open_error(here + L"\\x", OPEN_EXISTING, 0x0C000102), 0U) << "both separators work";
    EXPECT_EQ(delete_error(here + L"x"), 2U);
}

TEST_F(File, failures_have_their_win32_codes) {
    folder.write("file");
    fs::create_directory(folder / "folder");
    fs::create_symlink("nowhere", folder / "link");
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);
    const std::pair<std::wstring, Errors> rows[] = {{L"", {3, 3, 3}},
                                                    {here + L"missing/x", {3, 3, 3}},
                                                    {here + L"file/x", {3, 3, 3}},
                                                    {here + L"folder", {80, 5, 5}},
                                                    {here + L"pipe", {80, 5, 0}},
                                                    {here + L"link", {80, 2, 0}},
                                                    {here + L"\xD800", {123, 123, 123}},
                                                    {here + std::wstring(300, L'x'), {206, 206, 206}}};
    for (const auto& [name, errors] : rows) {
        EXPECT_EQ((Errors{open_error(name, 1), open_error(name, 3), delete_error(name)}), errors);
    }
    const std::wstring none = here + L"none";
    EXPECT_EQ((Errors{open_error(none, 3), delete_error(none), open_error(none, 2), open_error(none, 1, 1)}),
              (Errors{2, 2, 87, 87}));
    EXPECT_EQ(folder.names(), (std::set<std::string>{"file", "folder"}));
}

TEST_F(File, deletes_what_it_opened_and_nothing_else) {
    const fs::path before = fs::current_path();
    fs::create_directory(folder / "gone");
    fs::current_path(folder / "gone");
    const HANDLE relative = open(L"relative", CREATE_NEW), replaced = open(here + L"replaced", CREATE_NEW);
    fs::current_path(before);
    fs::remove(folder / "replaced");
    folder.write("replaced", "another's");
    EXPECT_TRUE(CloseHandle(relative) == 1 && CloseHandle(replaced) == 1);
    EXPECT_TRUE(fs::is_empty(folder / "gone") && folder.names().contains("replaced"));
}

TEST_F(File, temporary_ones_are_new_and_named_as_in_win32) {
    const std::wstring plain = here.substr(0, here.size() - 1);
    const std::wstring longest = std::wstring(MAX_PATH - 14 - plain.size(), L'/') + plain;
    wchar_t name[MAX_PATH] = {}, text[40];
    for (const std::wstring& place : {plain, plain + L"\\", longest}) {
        const UINT number = make_temporary(place, place == longest ? L"" : L"vmax", name);
        std::swprintf(text, 40, L"%ls%X.tmp", place == longest ? L"" : L"vma", number);
        EXPECT_EQ(name, place + (place.back() == L'\\' ? L"" : L"/") + text);
        EXPECT_TRUE(number >= 1 && number <= 0xFFFF && delete_error(here + text) == 0);
    }
    const std::wstring last = name;
    const SystemFailure taken(1, SystemFailure::Then::STAYS, EEXIST);
    EXPECT_EQ((Errors{error_of(make_temporary(L"/" + longest, L"vma", name)),
                      error_of(make_temporary(plain, L"\xD800", name)),
                      error_of(make_temporary(plain, L"vma", name, 7)),
                      error_of(make_temporary(plain, L"vma", name))}),
              (Errors{206, 123, 87, 80}));
    EXPECT_TRUE(name == last && folder.names().empty());
}

// Another user of the folder may put a link or a file of their own in the place of a new temporary file.
TEST_F(File, a_new_temporary_file_is_reopened_or_nothing) {
    folder.write("victim", "kept");
    for (const DWORD error : {0U, 1921U, 5U}) {
        wchar_t name[MAX_PATH] = {};
        ASSERT_NE(make_temporary(here, L"vma", name), 0U);
        const fs::path made = std::wstring(name);
        if (error != 0) {
            fs::remove(made);
            error == 5 ? fs::create_hard_link(folder / "victim", made) : fs::create_symlink("victim", made);
        }
        EXPECT_EQ(open_error(name, OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE), error);
        EXPECT_EQ(folder.read("victim"), "kept");
        EXPECT_EQ(open_error(name, OPEN_EXISTING), error == 0 ? 2U : 0U) << "only the first time";
    }
}

TEST_F(File, mappings_have_disk_space_and_keep_the_files_lock_without_a_descriptor) {
    const std::wstring name = here + L"file";
    const long mapped = mapped_balance();
    for (const bool view_first : {true, false}) {
        const HANDLE file = open(name, CREATE_NEW, view_first ? FILE_FLAG_DELETE_ON_CLOSE : 0);
        const HANDLE mapping = make_mapping(file), second = make_mapping(file);
        struct stat status = {};
        EXPECT_EQ(stat((folder / "file").c_str(), &status), 0);
        EXPECT_TRUE(status.st_size == off_t{SIZE} && status.st_blocks * 512 >= status.st_size);
        char* const view = map(mapping, view_first ? SIZE : 0);
        EXPECT_EQ(open_descriptors(), descriptors);
        EXPECT_EQ(std::count(view, view + SIZE, 0), static_cast<long>(SIZE));
        view[SIZE - 1] = 'x';
        EXPECT_EQ(error_of(map(mapping)), ERROR_NOT_SUPPORTED) << "a mapping has one view";
        EXPECT_EQ(error_of(map(second)), ERROR_FILE_INVALID) << "and so has a file";
        EXPECT_EQ(error_of(make_mapping(file)), ERROR_FILE_INVALID);
        for (const bool is_view : {view_first, !view_first}) {
            EXPECT_EQ(delete_error(name), ERROR_SHARING_VIOLATION);
            EXPECT_TRUE(is_view ? UnmapViewOfFile(view)
                                : CloseHandle(mapping) + CloseHandle(second) + CloseHandle(file));
        }
        EXPECT_TRUE(UnmapViewOfFile(view) == 0 && mapped_balance() == mapped);
        EXPECT_EQ(folder.names().size(), view_first ? 0U : 1U);
    }
    EXPECT_EQ(folder.read("file").back(), 'x');
}

TEST_F(File, other_uses_of_mappings_are_refused) {
    const HANDLE file = open(here + L"file", CREATE_NEW), mapping = make_mapping(file);
    char* const view = map(make_mapping(INVALID_HANDLE_VALUE));
    EXPECT_EQ((Errors{error_of(make_mapping(INVALID_HANDLE_VALUE, 0)), error_of(make_mapping(file, 0)),
                      error_of(make_mapping(nullptr)), error_of(make_mapping(file, SIZE_MAX)),
                      error_of(make_mapping(file, 1, PAGE_NOACCESS)), error_of(map(file)),
                      error_of(map(mapping, SIZE + 1)), error_of(map(mapping, SIZE, 4096)),
                      error_of(UnmapViewOfFile(view + 1))}),
              (Errors{87, 1006, 6, 223, 87, 6, 87, 87, 487}));
    EXPECT_EQ((SystemFailure(1), error_of(UnmapViewOfFile(view))), ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_TRUE(UnmapViewOfFile(view) && CloseHandle(mapping) && CloseHandle(file)) << "it stayed";
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
        EXPECT_TRUE(sigpending(&signals) == 0 && sigismember(&signals, SIGPIPE) == 1) << "as before";
        const rlimit limit = {1000, RLIM_INFINITY};
        setrlimit(RLIMIT_FSIZE, &limit);
        report(::open((folder / "errors").c_str(), O_CREAT | O_WRONLY, 0600));
    });
    EXPECT_EQ(folder.read("errors"), std::string(1000, 'x'));
}

}  // namespace
