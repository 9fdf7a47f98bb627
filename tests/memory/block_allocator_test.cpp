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

TEST(BlockAllocator, refuses_other_sizes_and_sizes_that_cannot_work_and_needs_a_folder) {
    const ScratchFolder folder;
    constexpr unsigned long OVER = 1UL << 32;
    constexpr unsigned long ROWS[][2] = {
        {100, 0}, {0, 0}, {100, 101}, {OVER + 100, 30}, {OVER + 100, OVER + 30}};
    for (const auto& [segment, block] : ROWS) {
        vlVmAllocator none(segment, block);
        EXPECT_TRUE(!none.Alloc(block) && !none.Alloc(block % OVER)) << segment << ' ' << block;
        none.Free(&none);
    }
    vlVmAllocator some(100, 30);
    EXPECT_TRUE(!some.Alloc(0) && !some.Alloc(29) && !some.Alloc(31) && !some.Alloc(OVER + 30));
    EXPECT_EQ(folder.names(), Names{}) << "no file before the first block";
    ScratchFolder::set_temporary(folder / "missing");
    EXPECT_EQ(some.Alloc(30), nullptr);
    ScratchFolder::set_temporary(folder.path());
    EXPECT_NE(some.Alloc(30), nullptr) << "the folder is queried again";
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

// Near 2^32 offsets in 32 bits would wrap: the second block would begin beyond the first one's end. The
// record of a segment has a pointer for every 2^14 blocks, and one more for a single block beyond.
TEST(BlockAllocator, hands_out_as_many_blocks_as_a_segment_holds) {
    constexpr unsigned long ROWS[][3] = {{0xFFFFFFFF, 0xFFFFF000, 1},
                                         {((1 << 14) + 1) * 16, 16, (1 << 14) + 1}};
    for (const auto& [segment, block, count] : ROWS) {
        const ScratchFolder folder;
        vlVmAllocator allocator(segment, block);
        std::set<char*> blocks;
        while (blocks.size() < count && blocks.insert(static_cast<char*>(allocator.Alloc(block))).second) {
        }
        if (blocks.contains(nullptr)) {
            GTEST_SKIP() << "no space for " << segment << " bytes in the temporary folder";
        }
        EXPECT_EQ(blocks.size(), count);
        (*blocks.rbegin())[block - 1] = 1;
        EXPECT_EQ(folder.names().size(), 1U) << "one segment";
        allocator.Free(*blocks.rbegin());
        EXPECT_EQ(allocator.Alloc(block), *blocks.rbegin());
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
    EXPECT_NE(vlVmAllocator(4096, 4096).Alloc(4096), nullptr);
    EXPECT_EQ(folder.names(), (Names{"vmafresh.tmp", "vmaheld.tmp", "vma1.txt", "other.tmp", "vmalink.tmp",
                                     "vmafolder.tmp"}));
    std::exit(testing::Test::HasFailure() ? 1 : 0);
}

TEST(BlockAllocator, the_first_segment_of_a_process_deletes_what_killed_ones_left) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(delete_abandoned_and_exit(), testing::ExitedWithCode(0), "");
}

}  // namespace
