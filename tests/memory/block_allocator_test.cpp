#include "basalt/memory/block_allocator.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <set>
#include <string>

#include "src/platform/file.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::test::ScratchFolder;
using vex_lib::vlVmAllocator;
using Names = std::set<std::string>;

TEST(BlockAllocator, refuses_other_sizes_and_sizes_that_cannot_work) {
    const ScratchFolder folder;
    constexpr unsigned long OVER = 1UL << 32;
    vlVmAllocator allocator(100, 30);
    for (const std::uint64_t size : {0UL, 29UL, 31UL, OVER + 30}) {
        EXPECT_EQ(allocator.Alloc(size), nullptr) << size;
    }
    EXPECT_EQ(folder.names(), Names{}) << "no file before the first block";
    EXPECT_NE(allocator.Alloc(30), nullptr);
    constexpr unsigned long SIZES[][2] = {
        {100, 0}, {0, 0}, {100, 101}, {OVER + 100, 30}, {OVER + 100, OVER + 30}};
    for (const auto& [segment, block] : SIZES) {
        vlVmAllocator none(segment, block);
        EXPECT_EQ(none.Alloc(block), nullptr) << segment << ' ' << block;
        EXPECT_EQ(none.Alloc(block % OVER), nullptr) << segment << ' ' << block;
        none.Free(&none);
    }
}

TEST(BlockAllocator, keeps_files_that_fall_empty_and_no_descriptor) {
    const ScratchFolder folder;
    const long descriptors = basalt::test::open_descriptors();
    {
        vlVmAllocator allocator(2 * 4096, 4096);
        void* const blocks[] = {allocator.Alloc(4096), allocator.Alloc(4096), allocator.Alloc(4096)};
        const Names names = folder.names();
        EXPECT_EQ(names.size(), 2U);
        EXPECT_EQ(names.begin()->substr(0, 3), "vma");
        EXPECT_EQ(std::filesystem::file_size(folder / *names.begin()), 2 * 4096U);
        EXPECT_EQ(basalt::test::open_descriptors(), descriptors);
        std::ranges::for_each(blocks, [&](void* block) { allocator.Free(block); });
        EXPECT_TRUE(allocator.Alloc(4096) && allocator.Alloc(4096) && allocator.Alloc(4096));
        EXPECT_EQ(folder.names(), names);
    }
    EXPECT_EQ(folder.names(), Names{});
}

// Near 2^32 offsets in 32 bits would wrap: the second block would begin beyond the first one's end.
TEST(BlockAllocator, hands_out_nothing_beyond_a_view_of_nearly_4_gigabytes) {
    const ScratchFolder folder;
    constexpr unsigned long BLOCK = 0xFFFFF000;
    vlVmAllocator allocator(0xFFFFFFFF, BLOCK);
    auto* const first = static_cast<char*>(allocator.Alloc(BLOCK));
    if (first == nullptr) {
        GTEST_SKIP() << "no space for 4 GiB in the temporary folder";
    }
    first[BLOCK - 1] = 1;
    EXPECT_EQ(folder.names().size(), 1U);
    allocator.Free(first);
    EXPECT_EQ(allocator.Alloc(BLOCK), first);
}

// The record of a segment has a pointer for every 2^14 blocks, and one more for a single block beyond.
TEST(BlockAllocator, a_segment_of_one_block_more_than_a_chunk) {
    const ScratchFolder folder;
    constexpr int BLOCKS = (1 << 14) + 1;
    vlVmAllocator allocator(BLOCKS * 16, 16);
    std::set<void*> blocks;
    for (int i = 0; i < BLOCKS; ++i) {
        blocks.insert(allocator.Alloc(16));
    }
    EXPECT_EQ(blocks.size(), static_cast<std::size_t>(BLOCKS));
    EXPECT_EQ(blocks.count(nullptr) + folder.names().size(), 1U) << "one segment";
    allocator.Free(*blocks.rbegin());
    EXPECT_EQ(allocator.Alloc(16), *blocks.rbegin());
}

TEST(BlockAllocator, without_a_temporary_folder_gives_null) {
    const ScratchFolder folder;
    for (const std::string& name : {folder / "missing", "/" + std::string(300, 'x')}) {
        ScratchFolder::set_temporary(name);
        vlVmAllocator allocator(4096, 4096);
        EXPECT_EQ(allocator.Alloc(4096), nullptr);
        allocator.Free(&allocator);
        ScratchFolder::set_temporary(folder.path());
        EXPECT_NE(allocator.Alloc(4096), nullptr) << "the folder is queried again";
    }
}

// In a process of its own: only the first segment of a process deletes.
void delete_abandoned_and_exit() {
    const ScratchFolder folder;
    for (const char* name :
         {"vmaDEAD.tmp", "vma1.tmp", "vmafresh.tmp", "vmaheld.tmp", "vma1.txt", "other.tmp"}) {
        folder.write(name);
        const timespec old[2] = {{0, 0}, {std::time(nullptr) - (name[3] == 'f' ? 50 : 70), 0}};
        utimensat(AT_FDCWD, (folder / name).c_str(), old, 0);
    }
    std::filesystem::create_symlink("vma1.txt", folder / "vmalink.tmp");
    std::filesystem::create_directory(folder / "vmafolder.tmp");
    CreateFileW(folder.wide(L"vmaheld.tmp").c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, OPEN_EXISTING,
                0, nullptr);
    Names left = {"vmafresh.tmp", "vmaheld.tmp", "vma1.txt", "other.tmp", "vmalink.tmp", "vmafolder.tmp"};
    {
        vlVmAllocator allocator(4096, 4096);
        EXPECT_NE(allocator.Alloc(4096), nullptr);
        EXPECT_EQ(folder.names().size(), left.size() + 1);
    }
    EXPECT_EQ(folder.names(), left);
    std::exit(testing::Test::HasFailure() ? 1 : 0);
}

TEST(BlockAllocator, the_first_segment_of_a_process_deletes_what_killed_ones_left) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(delete_abandoned_and_exit(), testing::ExitedWithCode(0), "");
}

}  // namespace
