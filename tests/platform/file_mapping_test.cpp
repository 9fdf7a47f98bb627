#include "src/platform/file_mapping.h"

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>

#include "tests/platform/error_of.h"
#include "tests/support/child.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::error_of;
using basalt::test::mapped_balance;
using basalt::test::open_descriptors;

constexpr std::size_t SIZE = 100'000;  // not a multiple of a page

struct FileMapping : testing::Test {
    const basalt::test::ScratchFolder folder;
    const std::wstring name = folder.wide(L"file");
    HANDLE make_file(DWORD flags) const {
        return CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, CREATE_NEW, flags,
                           nullptr);
    }
};

HANDLE make_mapping(HANDLE file, std::size_t size = SIZE, DWORD protection = PAGE_READWRITE) {
    return CreateFileMappingW(file, nullptr, protection, static_cast<DWORD>(size >> 32),
                              static_cast<DWORD>(size & 0xFFFFFFFF), nullptr);
}
char* map(HANDLE mapping, std::size_t size = SIZE, DWORD access = FILE_MAP_ALL_ACCESS, DWORD offset = 0) {
    return static_cast<char*>(MapViewOfFile(mapping, access, 0, offset, size));
}

TEST_F(FileMapping, has_disk_space_and_keeps_its_lock_without_a_descriptor) {
    const long descriptors = open_descriptors();
    const long mapped = mapped_balance();
    for (const bool view_first : {true, false}) {
        const HANDLE file = make_file(view_first ? FILE_FLAG_DELETE_ON_CLOSE : 0);
        const HANDLE mapping = make_mapping(file);
        const HANDLE second = make_mapping(file);
        struct stat status = {};
        ASSERT_EQ(stat((folder / "file").c_str(), &status), 0);
        EXPECT_EQ(status.st_size, static_cast<off_t>(SIZE));
        EXPECT_GE(static_cast<std::size_t>(status.st_blocks) * 512, SIZE);
        char* const view = map(mapping, view_first ? SIZE : 0);
        ASSERT_NE(view, nullptr);
        EXPECT_EQ(open_descriptors(), descriptors);
        EXPECT_EQ(std::count(view, view + SIZE, 0), static_cast<long>(SIZE));
        view[SIZE - 1] = 'x';
        EXPECT_EQ(error_of(map(mapping)), ERROR_NOT_SUPPORTED) << "a mapping has one view";
        EXPECT_EQ(error_of(map(second)), ERROR_FILE_INVALID) << "and so has a file";
        EXPECT_EQ(error_of(make_mapping(file)), ERROR_FILE_INVALID);
        for (const bool is_view : {view_first, !view_first}) {
            EXPECT_EQ(error_of(DeleteFileW(name.c_str())), ERROR_SHARING_VIOLATION);
            EXPECT_TRUE(is_view ? UnmapViewOfFile(view)
                                : CloseHandle(mapping) + CloseHandle(second) + CloseHandle(file));
        }
        EXPECT_EQ(UnmapViewOfFile(view), 0);
        EXPECT_EQ(mapped_balance(), mapped);
        EXPECT_EQ(folder.names().size(), view_first ? 0U : 1U);
    }
    EXPECT_EQ(folder.read("file").back(), 'x');
}

TEST_F(FileMapping, other_uses_are_refused) {
    const HANDLE file = make_file(FILE_FLAG_DELETE_ON_CLOSE), mapping = make_mapping(file);
    char* const view = map(make_mapping(INVALID_HANDLE_VALUE));
    const std::pair<DWORD, DWORD> refusals[] = {
        {error_of(make_mapping(INVALID_HANDLE_VALUE, 0)), 87},
        {error_of(make_mapping(file, 0)), 1006},
        {error_of(make_mapping(nullptr)), 6},
        {error_of(make_mapping(file, SIZE_MAX)), 223},
        {error_of(make_mapping(file, 1, PAGE_NOACCESS)), 87},
        {error_of(make_mapping(mapping)), 6},
        {error_of(CreateFileMappingW(file, nullptr, 4, 0, 1, L"n")), 87},
        {error_of(map(file)), 6},
        {error_of(map(mapping, SIZE + 1)), 87},
        {error_of(map(mapping, SIZE, 4)), 87},
        {error_of(map(mapping, SIZE, FILE_MAP_ALL_ACCESS, 4096)), 87},
        {error_of(UnmapViewOfFile(view + 1)), 487}};
    for (const auto& [error, expected] : refusals) {
        EXPECT_EQ(error, expected) << &error - &refusals[0].first;
    }
    {
        const basalt::test::SystemFailure failure(1);
        EXPECT_EQ(error_of(UnmapViewOfFile(view)), ERROR_NOT_ENOUGH_MEMORY);
    }
    EXPECT_TRUE(UnmapViewOfFile(view) && CloseHandle(mapping) && CloseHandle(file)) << "it stayed";
}

TEST_F(FileMapping, a_limit_on_file_sizes_is_a_failed_call) {
    basalt::test::in_child([&] {
        const rlimit limit = {4096, RLIM_INFINITY};
        setrlimit(RLIMIT_FSIZE, &limit);
        const HANDLE file = make_file(FILE_FLAG_DELETE_ON_CLOSE);
        EXPECT_EQ(error_of(make_mapping(file)), ERROR_FILE_TOO_LARGE);
        EXPECT_NE(make_mapping(file, 4096), nullptr);
        CloseHandle(file);
    });
}

}  // namespace
