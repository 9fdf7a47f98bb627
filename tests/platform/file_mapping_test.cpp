#include "src/platform/file_mapping.h"

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <algorithm>
#include <csignal>
#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/file.h"
#include "tests/platform/error_of.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"
#include "tests/support/with_failing_calls.h"

namespace {

using basalt::test::error_of;
using basalt::test::mapped_balance;
using basalt::test::open_descriptors;
using basalt::test::ScratchFolder;
using basalt::test::SystemFailure;

constexpr std::size_t SIZE = 100'000;  // no multiple of a page

HANDLE make_file(const std::wstring& name) {
    return CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, CREATE_NEW,
                       FILE_FLAG_DELETE_ON_CLOSE, nullptr);
}

HANDLE make_mapping(HANDLE file, std::size_t size = SIZE) {
    return CreateFileMappingW(file, nullptr, PAGE_READWRITE, static_cast<DWORD>(size >> 32),
                              static_cast<DWORD>(size & 0xFFFFFFFF), nullptr);
}

char* map(HANDLE mapping, std::size_t size = SIZE) {
    return static_cast<char*>(MapViewOfFile(mapping, FILE_MAP_ALL_ACCESS, 0, 0, size));
}

TEST(FileMapping, holds_its_space_and_its_lock_without_a_descriptor) {
    const ScratchFolder folder;
    const std::wstring name = folder.wide(L"file");
    const long descriptors = open_descriptors();
    const long mapped = mapped_balance();
    const HANDLE file = make_file(name);
    const HANDLE mapping = make_mapping(file);
    const HANDLE second = make_mapping(file);
    ASSERT_NE(mapping, nullptr);
    struct stat status = {};
    ASSERT_EQ(stat((folder / "file").c_str(), &status), 0);
    EXPECT_EQ(status.st_size, static_cast<off_t>(SIZE));
    EXPECT_GE(static_cast<std::size_t>(status.st_blocks) * 512, SIZE) << "on the disk, all of it";

    char* const view = map(mapping);
    ASSERT_NE(view, nullptr);
    EXPECT_EQ(open_descriptors(), descriptors);
    EXPECT_EQ(std::count(view, view + SIZE, 0), static_cast<long>(SIZE));
    std::fill_n(view, SIZE, 'x');
    EXPECT_EQ(error_of(DeleteFileW(name.c_str())), ERROR_SHARING_VIOLATION);

    EXPECT_EQ(error_of(map(mapping)), ERROR_NOT_SUPPORTED) << "a mapping has one view";
    EXPECT_EQ(error_of(map(second)), ERROR_FILE_INVALID) << "and so has a file";
    EXPECT_EQ(CloseHandle(second), 1);
    EXPECT_EQ(error_of(make_mapping(file)), ERROR_FILE_INVALID);

    EXPECT_EQ(error_of(UnmapViewOfFile(view + 1)), ERROR_INVALID_ADDRESS);
    EXPECT_EQ(UnmapViewOfFile(view), 1);
    EXPECT_EQ(UnmapViewOfFile(view), 0);
    EXPECT_EQ(error_of(DeleteFileW(name.c_str())), ERROR_SHARING_VIOLATION)
        << "held until the handle is closed";
    EXPECT_EQ(CloseHandle(mapping), 1);
    EXPECT_EQ(CloseHandle(file), 1);
    EXPECT_TRUE(folder.names().empty());
    EXPECT_EQ(mapped_balance(), mapped);
    EXPECT_EQ(open_descriptors(), descriptors);
}

TEST(FileMapping, a_view_outlives_its_handles_and_keeps_the_lock) {
    const ScratchFolder folder;
    folder.write("kept");
    const std::wstring name = folder.wide(L"kept");
    const long mapped = mapped_balance();
    const HANDLE file =
        CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, OPEN_EXISTING, 0, nullptr);
    const HANDLE mapping = make_mapping(file);
    char* const view = map(mapping, 0);
    EXPECT_EQ(CloseHandle(file), 1);
    EXPECT_EQ(CloseHandle(mapping), 1);
    view[SIZE - 1] = 'x';
    EXPECT_EQ(DeleteFileW(name.c_str()), 0);
    EXPECT_EQ(UnmapViewOfFile(view), 1);
    EXPECT_EQ(mapped_balance(), mapped);
    EXPECT_EQ(std::filesystem::file_size(folder / "kept"), SIZE);
    EXPECT_EQ(DeleteFileW(name.c_str()), 1);
}

TEST(FileMapping, other_uses_are_refused) {
    const ScratchFolder folder;
    const HANDLE file = make_file(folder.wide(L"file"));
    EXPECT_EQ(error_of(make_mapping(INVALID_HANDLE_VALUE, 0)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(make_mapping(file, 0)), ERROR_FILE_INVALID) << "an empty file";
    EXPECT_EQ(error_of(make_mapping(nullptr)), ERROR_INVALID_HANDLE);
    EXPECT_EQ(error_of(make_mapping(file, SIZE_MAX)), ERROR_FILE_TOO_LARGE);
    EXPECT_EQ(error_of(CreateFileMappingW(file, nullptr, PAGE_NOACCESS, 0, 1, nullptr)),
              ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(CreateFileMappingW(file, nullptr, PAGE_READWRITE, 0, 1, L"n")),
              ERROR_INVALID_PARAMETER);
    const HANDLE mapping = make_mapping(file);
    EXPECT_EQ(error_of(make_mapping(mapping)), ERROR_INVALID_HANDLE) << "a mapping is no file";
    EXPECT_EQ(error_of(map(file)), ERROR_INVALID_HANDLE) << "a file is no mapping";
    EXPECT_EQ(error_of(map(mapping, SIZE + 1)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(MapViewOfFile(mapping, 4, 0, 0, SIZE)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(MapViewOfFile(mapping, FILE_MAP_ALL_ACCESS, 0, 4096, SIZE)), ERROR_INVALID_PARAMETER);
    CloseHandle(mapping);
    CloseHandle(file);
}

TEST(FileMapping, every_failing_call_leaves_nothing_behind) {
    const ScratchFolder folder;
    const long descriptors = open_descriptors();
    const long mapped = mapped_balance();
    HANDLE file = make_file(folder.wide(L"file"));
    HANDLE mapping = nullptr;
    char* view = nullptr;
    basalt::test::with_failing_calls(
        [&] {
            mapping = make_mapping(file);
            view = mapping != nullptr ? map(mapping) : nullptr;
        },
        [&](bool fails) {
            EXPECT_EQ(view == nullptr, fails);
            if (view != nullptr) {
                const SystemFailure failure(1);
                EXPECT_EQ(error_of(UnmapViewOfFile(view)), ERROR_NOT_ENOUGH_MEMORY);
            }
            EXPECT_EQ(view == nullptr ? 1 : UnmapViewOfFile(view), 1) << "it stayed when that was refused";
            CloseHandle(mapping);
            EXPECT_EQ(CloseHandle(file), 1);
            EXPECT_EQ(mapped_balance(), mapped);
            EXPECT_EQ(open_descriptors(), descriptors);
            EXPECT_TRUE(folder.names().empty());
            file = make_file(folder.wide(L"file"));
        });
    CloseHandle(file);
}

// The signal of the limit would end the process; the host's arrangements for it stay as they are.
TEST(FileMapping, a_limit_on_file_sizes_is_a_failed_call) {
    const ScratchFolder folder;
    rlimit before = {};
    getrlimit(RLIMIT_FSIZE, &before);
    static volatile std::sig_atomic_t received;
    received = 0;
    struct sigaction counting = {};
    counting.sa_handler = [](int) { received = received + 1; };
    struct sigaction usual = {};
    sigaction(SIGXFSZ, &counting, &usual);
    sigset_t signal;
    sigemptyset(&signal);
    sigaddset(&signal, SIGXFSZ);
    for (const bool is_waiting : {false, true}) {
        if (is_waiting) {
            sigprocmask(SIG_BLOCK, &signal, nullptr);
            raise(SIGXFSZ);
        }
        const rlimit limit = {4096, before.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limit);
        const HANDLE file = make_file(folder.wide(L"file"));
        EXPECT_EQ(error_of(make_mapping(file)), ERROR_FILE_TOO_LARGE);
        const HANDLE small = make_mapping(file, 4096);
        EXPECT_NE(small, nullptr);
        setrlimit(RLIMIT_FSIZE, &before);
        CloseHandle(small);
        CloseHandle(file);
        EXPECT_EQ(received, 0);
    }
    sigprocmask(SIG_UNBLOCK, &signal, nullptr);
    EXPECT_EQ(received, 1) << "the one that was waiting";
    sigaction(SIGXFSZ, &usual, &counting);
}

}  // namespace
