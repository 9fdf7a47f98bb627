#include "basalt/memory/memory_map.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <set>
#include <string>
#include <type_traits>

#include "src/platform/file.h"
#include "tests/memory/mapped_bytes.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"
#include "tests/support/with_failing_allocations.h"
#include "tests/support/with_failing_calls.h"

namespace {
thread_local bool heap_is_exhausted = false;
}

extern "C" {
void* __real_calloc(size_t, size_t);
void* __wrap_calloc(size_t count, size_t size) {
    return heap_is_exhausted ? nullptr : __real_calloc(count, size);
}
}

namespace {

using basalt::test::bytes;
using basalt::test::mapped_balance;
using basalt::test::open_descriptors;
using basalt::test::ScratchFolder;
using basalt::test::SystemFailure;
using vex_util::CMemoryMap;
using Names = std::set<std::string>;

constexpr unsigned long SIZE = 100'000;

bool is_usable(const CMemoryMap& map, std::size_t size) {
    char* const data = bytes(map);
    if (data == nullptr || std::count(data, data + size, 0) != static_cast<long>(size)) {
        return false;
    }
    std::fill_n(data, size, 'x');
    return true;
}

TEST(MemoryMap, is_a_hidden_file_while_it_lives) {
    const ScratchFolder folder;
    const long mapped = mapped_balance();
    const long descriptors = open_descriptors();
    {
        CMemoryMap map(SIZE);
        EXPECT_TRUE(is_usable(map, SIZE));
        ASSERT_EQ(folder.names().size(), 1U);
        const std::string name = *folder.names().begin();
        EXPECT_EQ(name.substr(0, 3) + name.substr(8), "~00.mem");
        EXPECT_EQ(name.substr(3, 5).find_first_not_of("0123456789"), std::string::npos) << name;
        EXPECT_EQ(std::filesystem::file_size(folder / name), SIZE);
        EXPECT_EQ(open_descriptors(), descriptors);

        EXPECT_TRUE(map.Create(2 * SIZE)) << "the first block and its file are given up";
        EXPECT_TRUE(is_usable(map, 2 * SIZE));
        EXPECT_EQ(folder.names().size(), 1U);
        EXPECT_TRUE(map.Destroy());
        EXPECT_EQ(bytes(map), nullptr);
        EXPECT_EQ(folder.names(), Names{});
        EXPECT_TRUE(map.Create(1));
    }
    EXPECT_EQ(folder.names(), Names{});
    EXPECT_EQ(mapped_balance(), mapped);
    CMemoryMap empty;
    EXPECT_EQ(bytes(empty), nullptr);
    EXPECT_TRUE(empty.Destroy());
    static_assert(!std::is_copy_constructible_v<CMemoryMap> && !std::is_copy_assignable_v<CMemoryMap>);
}

TEST(MemoryMap, without_a_file_it_is_on_the_heap) {
    const ScratchFolder folder;
    const long mapped = mapped_balance();
    for (const std::string& place :
         {folder / "missing", std::string(300, 'x'), folder / std::string(238, 'y')}) {
        ScratchFolder::set_temporary(place);
        CMemoryMap map(1024);
        EXPECT_TRUE(is_usable(map, 1024));
        CMemoryMap::CleanUp();
        EXPECT_EQ(mapped_balance(), mapped);
    }
    ScratchFolder::set_temporary(folder.path());
    CMemoryMap none(0);
    EXPECT_NE(bytes(none), nullptr);
    EXPECT_EQ(folder.names(), Names{});
    CMemoryMap map(SIZE);
    EXPECT_FALSE(map.Create(0x100000001)) << "refused, not cut to one byte";
    EXPECT_EQ(bytes(map), nullptr);
    EXPECT_EQ(folder.names(), Names{});
}

// Of a folder's 245 characters, two separators and 12 of the file's own name comes 259.
TEST(MemoryMap, the_longest_name_that_fits) {
    const ScratchFolder folder;
    for (const std::size_t length : {245U, 246U}) {
        const std::string place = folder / std::string(length - folder.path().size() - 1, 'd');
        ASSERT_EQ(place.size(), length);
        std::filesystem::create_directory(place);
        ScratchFolder::set_temporary(place);
        const CMemoryMap map(SIZE);
        EXPECT_NE(bytes(map), nullptr);
        EXPECT_EQ(std::filesystem::is_empty(place), length == 246) << length;
    }
}

TEST(MemoryMap, deletes_the_file_it_made_and_a_stale_one_of_its_name_in_the_folder_of_then) {
    const ScratchFolder folder;
    std::filesystem::create_directory(folder / "other");
    for (const bool is_held : {false, true}) {
        ScratchFolder::set_temporary(folder.path());
        CMemoryMap map(SIZE);
        const std::string name = *folder.names().rbegin();
        folder.write("other/" + name);
        const std::wstring other = folder.wide(L"other/" + std::wstring(name.begin(), name.end()));
        const HANDLE holder = is_held ? CreateFileW(other.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr,
                                                    OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE, nullptr)
                                      : INVALID_HANDLE_VALUE;
        ScratchFolder::set_temporary(folder / "other");
        map.Destroy();
        EXPECT_EQ(folder.names(), Names{"other"});
        EXPECT_EQ(std::filesystem::is_empty(folder / "other"), !is_held);
        CloseHandle(holder);
    }
}

TEST(MemoryMap, the_last_free_number_is_found) {
    const ScratchFolder folder;
    const std::string taken[] = {folder / "odd",
                                 folder / "even"};  // a file has hardly more than 65,000 names
    folder.write("odd");
    folder.write("even");
    char name[20];
    for (int number = 0; number < 65'535; ++number) {
        std::snprintf(name, sizeof name, "~%07i.mem", number);
        if (number != 54'321) {
            ASSERT_EQ(link(taken[number % 2].c_str(), (folder / name).c_str()), 0);
        }
    }
    const CMemoryMap map(SIZE);
    EXPECT_TRUE(std::filesystem::exists(folder / "~0054321.mem"));
}

TEST(MemoryMap, with_all_numbers_taken_a_block_comes_from_the_heap) {
    const ScratchFolder folder;
    CMemoryMap map;
    {
        const SystemFailure taken(1, SystemFailure::Then::STAYS, EEXIST);
        EXPECT_TRUE(map.Create(SIZE));
    }
    EXPECT_TRUE(is_usable(map, SIZE));
    EXPECT_EQ(folder.names(), Names{});
    {
        const SystemFailure taken(1, SystemFailure::Then::RECOVERS, EEXIST);
        EXPECT_TRUE(map.Create(SIZE)) << "the next number is free";
    }
    EXPECT_EQ(folder.names().size(), 1U);
}

TEST(MemoryMap, clean_up_deletes_what_nobody_holds) {
    const ScratchFolder folder;
    CMemoryMap::CleanUp();
    for (const char* name : {"~0000001.mem", "~.mem", "~other~.mem", "~\xFF.mem", "x~0000001.mem",
                             "~0000001.tmp", "~0000001.MEM", "vma1.tmp"}) {
        folder.write(name);
    }
    std::filesystem::create_directory(folder / "~folder.mem");
    // A name that would lead elsewhere if its `\` were a separator.
    std::filesystem::create_directory(folder / "~within");
    folder.write("~within/kept.mem");
    folder.write("~within\\kept.mem");
    const CMemoryMap map(SIZE);
    CMemoryMap::CleanUp();
    EXPECT_TRUE(std::filesystem::remove(folder / "~within/kept.mem"));
    EXPECT_TRUE(std::filesystem::remove(folder / "~within"));
    Names left = folder.names();
    for (const char* name : {"x~0000001.mem", "~0000001.tmp", "~0000001.MEM", "vma1.tmp", "~folder.mem"}) {
        EXPECT_EQ(left.erase(name), 1U) << name;
    }
    EXPECT_EQ(left.size(), 1U);
    bytes(map)[SIZE - 1] = 'x';
}

TEST(MemoryMap, every_failing_call_is_made_up_for_by_the_heap) {
    const ScratchFolder folder;
    const long mapped = mapped_balance();
    const long descriptors = open_descriptors();
    CMemoryMap map;
    bool is_made = false;
    basalt::test::with_failing_calls([&] { is_made = map.Create(SIZE); },
                                     [&](bool fails) {
                                         EXPECT_TRUE(is_made);
                                         EXPECT_TRUE(is_usable(map, SIZE));
                                         EXPECT_EQ(folder.names().size(), fails ? 0U : 1U);
                                         EXPECT_EQ(open_descriptors(), descriptors);
                                         map.Destroy();
                                         EXPECT_EQ(folder.names(), Names{});
                                     });
    {
        const SystemFailure failure(1);
        heap_is_exhausted = true;
        is_made = map.Create(SIZE);
        heap_is_exhausted = false;
    }
    EXPECT_FALSE(is_made);
    EXPECT_EQ(bytes(map), nullptr);
    with_failing_allocations([&] { map.Create(SIZE); },
                             [&](bool failed) {
                                 EXPECT_TRUE(is_usable(map, SIZE));
                                 EXPECT_EQ(folder.names().size(), failed ? 0U : 1U);
                                 map.Destroy();
                             });
    with_failing_allocations(
        [&] {
            map.Create(SIZE);
            CMemoryMap::CleanUp();
            map.Destroy();
        },
        [&](bool) {
            EXPECT_EQ(open_descriptors(), descriptors);
            folder.write("~stale.mem");
        });
    EXPECT_EQ(mapped_balance(), mapped);
}

}  // namespace
