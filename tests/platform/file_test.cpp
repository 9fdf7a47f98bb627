#include "src/platform/file.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <thread>

#include "basalt/platform/error.h"
#include "src/platform/text/file_name.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"
#include "tests/support/threads.h"
#include "tests/support/with_failing_allocations.h"
#include "tests/support/with_failing_calls.h"

namespace {

using basalt::test::open_descriptors;
using basalt::test::ScratchFolder;
using basalt::test::SystemFailure;

constexpr DWORD BOTH = GENERIC_READ | GENERIC_WRITE;
using Names = std::set<std::string>;

HANDLE open(const std::wstring& name, DWORD disposition, DWORD flags = FILE_FLAG_DELETE_ON_CLOSE) {
    SetLastError(0);
    return CreateFileW(name.c_str(), BOTH, 0, nullptr, disposition, flags, nullptr);
}

DWORD open_error(const std::wstring& name, DWORD disposition) {
    EXPECT_EQ(open(name, disposition), INVALID_HANDLE_VALUE);
    return GetLastError();
}

DWORD delete_error(const std::wstring& name) {
    SetLastError(0);
    EXPECT_EQ(DeleteFileW(name.c_str()), 0);
    return GetLastError();
}

TEST(File, is_held_alone_and_deleted_on_close) {
    const ScratchFolder folder;
    const std::wstring name = folder.wide(L"~\x00E9\x4E2D\x1F600.mem");
    const long descriptors = open_descriptors();
    const HANDLE file = open(name, CREATE_NEW, FILE_ATTRIBUTE_HIDDEN | FILE_FLAG_DELETE_ON_CLOSE);
    ASSERT_NE(file, INVALID_HANDLE_VALUE);
    EXPECT_EQ(GetLastError(), 0U) << "success leaves it alone";
    const std::string on_disk = "~\xC3\xA9\xE4\xB8\xAD\xF0\x9F\x98\x80.mem";
    EXPECT_EQ(folder.names(), Names{on_disk});
    struct stat status = {};
    ASSERT_EQ(stat((folder / on_disk).c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777U, 0600U);

    EXPECT_EQ(open_error(name, CREATE_NEW), ERROR_FILE_EXISTS);
    EXPECT_EQ(open_error(name, OPEN_EXISTING), ERROR_SHARING_VIOLATION) << "not even in this process";
    EXPECT_EQ(delete_error(name), ERROR_SHARING_VIOLATION);
    const pid_t child = fork();
    if (child == 0) {
        const bool refused = delete_error(name) == ERROR_SHARING_VIOLATION;
        std::exit(refused ? 0 : 1);  // by exit: a child's end must leave its parent's files
    }
    int result = -1;
    waitpid(child, &result, 0);
    EXPECT_EQ(result, 0);
    EXPECT_EQ(folder.names(), Names{on_disk});

    EXPECT_EQ(CloseHandle(file), 1);
    EXPECT_EQ(folder.names(), Names{});
    EXPECT_EQ(open_descriptors(), descriptors);
    EXPECT_EQ(CloseHandle(file), 0);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
}

// A host that runs without a console may have no standard input.
TEST(File, may_get_descriptor_0) {
    const ScratchFolder folder;
    const int input = dup(STDIN_FILENO);
    close(STDIN_FILENO);
    const HANDLE file = open(folder.wide(L"first"), CREATE_NEW, FILE_FLAG_DELETE_ON_CLOSE);
    EXPECT_NE(file, INVALID_HANDLE_VALUE);
    EXPECT_NE(fcntl(STDIN_FILENO, F_GETFD), -1) << "the lowest free number is the file's";
    CloseHandle(file);
    EXPECT_EQ(folder.names(), Names{});
    if (input >= 0) {
        dup2(input, STDIN_FILENO);
        close(input);
    }
}

TEST(File, without_delete_on_close_it_stays) {
    const ScratchFolder folder;
    std::filesystem::create_directories(folder / "a/b");
    const HANDLE file = open(folder.wide(L"\\a\\/b\\x"), CREATE_NEW, FILE_ATTRIBUTE_NORMAL);
    EXPECT_EQ(CloseHandle(file), 1);
    EXPECT_TRUE(std::filesystem::exists(folder / "a/b/x")) << "both separators lead to folders";
    const HANDLE again = open(folder.wide(L"a\\b\\x"), OPEN_EXISTING, 0x0C000102);
    ASSERT_NE(again, INVALID_HANDLE_VALUE);
    EXPECT_NE(again, file) << "a handle is not given out again";
    EXPECT_EQ(CloseHandle(again), 1);
    EXPECT_FALSE(std::filesystem::exists(folder / "a/b/x"));
}

TEST(File, failures_have_their_published_codes) {
    const ScratchFolder folder;
    folder.write("file");
    std::filesystem::create_directory(folder / "folder");
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);
    const std::wstring no_character = folder.wide(L"\xD800");
    struct Row {
        std::wstring name;
        DWORD create, open, remove;
    };
    for (const Row& row :
         {Row{L"", 3, 3, 3}, Row{folder.wide(L"missing/x"), 3, 3, 3}, Row{folder.wide(L"file/x"), 3, 3, 3},
          Row{folder.wide(L"folder"), 80, 5, 5}, Row{folder.wide(L"pipe"), 80, 5, 0},
          Row{no_character, 123, 123, 123}, Row{folder.wide(std::wstring(300, L'x')), 206, 206, 206}}) {
        SCOPED_TRACE(::testing::PrintToString(row.name));
        EXPECT_EQ(open_error(row.name, CREATE_NEW), row.create);
        EXPECT_EQ(open_error(row.name, OPEN_EXISTING), row.open);
        if (row.remove != 0) {
            EXPECT_EQ(delete_error(row.name), row.remove);
        }
    }
    EXPECT_EQ(DeleteFileW(folder.wide(L"\\pipe").c_str()), 1) << "deleted, never opened";
    EXPECT_EQ(open_error(folder.wide(L"none"), OPEN_EXISTING), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(delete_error(folder.wide(L"none")), ERROR_FILE_NOT_FOUND);
    std::filesystem::create_symlink("nowhere", folder / "link");
    EXPECT_EQ(DeleteFileW(folder.wide(L"link").c_str()), 1);
    EXPECT_EQ(CreateFileW(nullptr, BOTH, 0, nullptr, CREATE_NEW, 0, nullptr), INVALID_HANDLE_VALUE);
    EXPECT_EQ(DeleteFileW(nullptr), 0);

    const std::wstring name = folder.wide(L"new");
    EXPECT_EQ(CreateFileW(name.c_str(), GENERIC_READ, 0, nullptr, CREATE_NEW, 0, nullptr),
              INVALID_HANDLE_VALUE);
    EXPECT_EQ(CreateFileW(name.c_str(), BOTH, 1, nullptr, CREATE_NEW, 0, nullptr), INVALID_HANDLE_VALUE);
    EXPECT_EQ(CreateFileW(name.c_str(), BOTH, 0, nullptr, 2, 0, nullptr), INVALID_HANDLE_VALUE);
    EXPECT_EQ(CreateFileW(name.c_str(), BOTH, 0, nullptr, CREATE_NEW, 1, nullptr), INVALID_HANDLE_VALUE);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(folder.names(), (Names{"file", "folder"}));
}

TEST(File, names_that_are_no_utf8_come_back) {
    using basalt::platform::file_name_from_wide;
    using basalt::platform::wide_from_file_name;
    std::string name;
    for (const char* bytes :
         {"plain", "\xC3\xA9", "\xEF\xBF\xBD", "a\xFFz", "\xC3\xA9\x80", "\xED\xA0\x80"}) {
        ASSERT_TRUE(file_name_from_wide(wide_from_file_name(bytes), name)) << bytes;
        EXPECT_EQ(name, bytes);
    }
    EXPECT_EQ(wide_from_file_name("a\xFFz"), L"a\xDCFFz");
}

TEST(File, deletes_what_it_opened_and_nothing_else) {
    const ScratchFolder folder;
    const auto before = std::filesystem::current_path();
    std::filesystem::current_path(folder.path());
    const HANDLE relative = open(L"relative", CREATE_NEW);
    std::filesystem::current_path(before);
    EXPECT_EQ(CloseHandle(relative), 1);
    EXPECT_EQ(folder.names(), Names{});

    const auto gone = folder / "gone";
    std::filesystem::create_directory(gone);
    std::filesystem::current_path(gone);
    std::filesystem::remove(gone);
    const DWORD error = open_error(L"relative", CREATE_NEW);
    std::filesystem::current_path(before);
    EXPECT_EQ(error, ERROR_PATH_NOT_FOUND) << "its folder is no more";

    const HANDLE replaced = open(folder.wide(L"replaced"), CREATE_NEW);
    std::filesystem::remove(folder / "replaced");
    folder.write("replaced", "somebody else's");
    EXPECT_EQ(CloseHandle(replaced), 1);
    EXPECT_EQ(folder.names(), Names{"replaced"});
}

TEST(File, what_is_left_open_is_deleted_at_exit_but_not_when_killed) {
    const ScratchFolder folder;
    for (const bool is_killed : {false, true}) {
        const pid_t child = fork();
        if (child == 0) {
            open(folder.wide(L"left"), CREATE_NEW);
            is_killed ? static_cast<void>(raise(SIGKILL)) : std::exit(0);
        }
        waitpid(child, nullptr, 0);
        EXPECT_EQ(folder.names(), is_killed ? Names{"left"} : Names{});
    }
    EXPECT_EQ(DeleteFileW(folder.wide(L"left").c_str()), 1);
}

// Whoever deletes must never hit a file that has just been made under the name, nor the maker lose it.
TEST(File, making_and_deleting_at_once_keep_out_of_each_others_way) {
    const ScratchFolder folder;
    std::atomic<bool> stops = false;
    std::thread deleter([&] {
        for (int i = 0; !stops; ++i) {
            DeleteFileW(folder.wide(std::to_wstring(i % 2)).c_str());
        }
    });
    std::atomic<int> lost = 0;
    basalt::test::run_threads(2, [&](int thread) {
        for (int i = 0; i < 2000; ++i) {
            const std::wstring name = folder.wide(std::to_wstring((i + thread) % 2));
            const HANDLE file = open(name, CREATE_NEW);
            if (file != INVALID_HANDLE_VALUE) {
                std::this_thread::yield();
                lost += std::filesystem::exists(name) ? 0 : 1;
                CloseHandle(file);
            } else if (GetLastError() != ERROR_FILE_EXISTS) {
                ++lost;
            }
        }
    });
    stops = true;
    deleter.join();
    EXPECT_EQ(lost, 0);
    EXPECT_EQ(folder.names(), Names{});
}

TEST(File, every_failing_call_leaves_nothing_behind) {
    const ScratchFolder folder;
    folder.write("existing");
    const std::wstring existing = folder.wide(L"existing");
    const long descriptors = open_descriptors();
    HANDLE file = nullptr;
    for (const DWORD disposition : {CREATE_NEW, OPEN_EXISTING}) {
        const std::wstring name = disposition == CREATE_NEW ? folder.wide(L"new") : existing;
        basalt::test::with_failing_calls([&] { file = open(name, disposition, 0); },
                                         [&](bool fails) {
                                             EXPECT_EQ(file == INVALID_HANDLE_VALUE, fails);
                                             EXPECT_EQ(GetLastError() != 0, fails);
                                             EXPECT_EQ(folder.names().contains("new"),
                                                       disposition == CREATE_NEW && !fails);
                                             CloseHandle(file);
                                             EXPECT_EQ(open_descriptors(), descriptors);
                                             DeleteFileW(folder.wide(L"new").c_str());
                                         });
    }
    basalt::test::with_failing_calls([&] { DeleteFileW(existing.c_str()); },
                                     [&](bool fails) {
                                         EXPECT_EQ(folder.names().size(), fails ? 1U : 0U);
                                         EXPECT_EQ(open_descriptors(), descriptors);
                                         folder.write("existing");
                                     });
    std::filesystem::remove(folder / "existing");
    {
        const SystemFailure interrupted(1, SystemFailure::Then::RECOVERS, EINTR);
        file = open(existing, CREATE_NEW);
        EXPECT_NE(file, INVALID_HANDLE_VALUE) << "a signal only makes the call begin anew";
        EXPECT_EQ(CloseHandle(file), 1);
    }
    with_failing_allocations([&] { file = open(existing, CREATE_NEW); },
                             [&](bool fails) {
                                 EXPECT_EQ(file == INVALID_HANDLE_VALUE, fails);
                                 EXPECT_EQ(CloseHandle(file), fails ? 0 : 1);
                                 EXPECT_EQ(folder.names(), Names{});
                             });
}

}  // namespace
