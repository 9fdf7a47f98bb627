#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <filesystem>
#include <set>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "basalt/memory.h"
#include "tests/support/heap_calls.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::HeapFailure;
using basalt::test::ScratchFolder;
using basalt::test::SystemFailure;
using vex_lib::vlVmAllocator;

TEST(VmAllocator, refuses_what_it_does_not_serve) {
    const ScratchFolder folder;
    vlVmAllocator allocator(100, 30);
    EXPECT_TRUE(folder.names().empty()) << "no file before the first block";
    for (const std::uint64_t size : {0UL, 29UL, 31UL, (1UL << 32) + 30}) {
        EXPECT_EQ(allocator.Alloc(size), nullptr) << size;
    }
    EXPECT_TRUE(folder.names().empty());
    EXPECT_NE(allocator.Alloc(30), nullptr);

    constexpr unsigned long OVERFLOW_32 = 1UL << 32;
    for (const auto& [segment, block] :
         {std::pair(100UL, 0UL), std::pair(0UL, 0UL), std::pair(100UL, 101UL),
          std::pair(OVERFLOW_32 + 100, 30UL), std::pair(OVERFLOW_32 + 100, OVERFLOW_32 + 30)}) {
        vlVmAllocator none(segment, block);
        EXPECT_EQ(none.Alloc(block), nullptr) << segment << ' ' << block;
        EXPECT_EQ(none.Alloc(block % OVERFLOW_32), nullptr) << segment << ' ' << block;
        none.Free(&none);
    }
}

TEST(VmAllocator, keeps_files_that_fall_empty_and_no_descriptor) {
    const ScratchFolder folder;
    const long descriptors = basalt::test::open_descriptors();
    const long mapped = basalt::test::mapped_balance();
    const long blocks = basalt::test::live_heap_blocks();
    {
        vlVmAllocator allocator(2 * 4096, 4096);
        std::vector<void*> taken;
        for (int i = 0; i < 5; ++i) {
            taken.push_back(allocator.Alloc(4096));
        }
        const std::set<std::string> names = folder.names();
        EXPECT_EQ(names.size(), 3U);
        for (const std::string& name : names) {
            EXPECT_EQ(name.substr(0, 3), "vma");
            EXPECT_EQ(std::filesystem::file_size(folder / name), 2 * 4096U);
        }
        EXPECT_EQ(basalt::test::open_descriptors(), descriptors);
        for (int round = 0; round < 3; ++round) {
            for (void* const block : taken) {
                allocator.Free(block);
            }
            for (void*& block : taken) {
                block = allocator.Alloc(4096);
            }
            EXPECT_EQ(folder.names(), names);
        }
    }
    EXPECT_TRUE(folder.names().empty());
    EXPECT_EQ(basalt::test::open_descriptors(), descriptors);
    EXPECT_EQ(basalt::test::mapped_balance(), mapped);
    EXPECT_EQ(basalt::test::live_heap_blocks(), blocks);
}

// Deletes the files that were made but could not be opened, which stay behind, empty; answers their number.
std::size_t delete_unopened(const ScratchFolder& folder) {
    std::size_t count = 0;
    for (const std::string& name : folder.names()) {
        if (std::filesystem::file_size(folder / name) == 0) {
            count += std::filesystem::remove(folder / name) ? 1 : 0;
        }
    }
    return count;
}

// A segment size close to 2^32, where offsets in 32 bits would wrap: the second block would start beyond the
// first one's end.
TEST(VmAllocator, hands_out_nothing_beyond_a_view_of_nearly_4_gigabytes) {
    const ScratchFolder folder;
    constexpr unsigned long BLOCK = 0xFFFFF000;
    vlVmAllocator allocator(0xFFFFFFFF, BLOCK);
    {
        const SystemFailure failure(1);
        EXPECT_EQ(allocator.Alloc(BLOCK), nullptr);
        EXPECT_TRUE(SystemFailure::struck()) << "the size itself is served";
    }
    delete_unopened(folder);
    auto* const first = static_cast<char*>(allocator.Alloc(BLOCK));
    if (first == nullptr) {
        GTEST_SKIP() << "no room for 4 GiB in the temporary folder";
    }
    first[BLOCK - 1] = 1;
    EXPECT_EQ(folder.names().size(), 1U);
    allocator.Free(first);
    EXPECT_EQ(allocator.Alloc(BLOCK), first);
}

// Takes a block whose every step can fail: a new file, a larger index and a first chunk of state.
template <class Failure>
void fail_each_call_in_turn() {
    const ScratchFolder folder;
    constexpr std::size_t FILES_BEFORE = 16;  // with as many the index is full
    for (int nth = 1; nth < 100; ++nth) {
        SCOPED_TRACE(nth);
        const long mapped = basalt::test::mapped_balance();
        const long descriptors = basalt::test::open_descriptors();
        {
            vlVmAllocator allocator(4096, 4096);
            std::vector<void*> blocks;
            for (std::size_t i = 0; i < FILES_BEFORE; ++i) {
                blocks.push_back(allocator.Alloc(4096));
            }
            const auto fail = [&] {
                const Failure failure(nth);
                void* const made = allocator.Alloc(4096);
                return std::pair(made, Failure::struck());
            };
            const auto [block, has_struck] = fail();
            EXPECT_LE(delete_unopened(folder), block == nullptr ? 1U : 0U);
            if (block == nullptr) {
                EXPECT_EQ(folder.names().size(), FILES_BEFORE);
                EXPECT_NE(allocator.Alloc(4096), nullptr) << "usable afterwards";
            } else if (!has_struck) {
                EXPECT_GT(nth, 4) << "several calls were made to fail";
                return;
            }
            EXPECT_EQ(folder.names().size(), FILES_BEFORE + 1);
            allocator.Free(blocks[7]);
            EXPECT_EQ(allocator.Alloc(4096), blocks[7]);
        }
        EXPECT_TRUE(folder.names().empty());
        EXPECT_EQ(basalt::test::mapped_balance(), mapped);
        EXPECT_EQ(basalt::test::open_descriptors(), descriptors);
    }
    FAIL() << "some call failed for ever";
}

TEST(VmAllocator, gives_back_everything_when_memory_or_the_system_fails) {
    fail_each_call_in_turn<HeapFailure>();
    fail_each_call_in_turn<SystemFailure>();
}

TEST(VmAllocator, without_memory_for_more_state_takes_back_and_reuses) {
    const ScratchFolder folder;
    vlVmAllocator allocator(70'000, 4);
    std::vector<void*> blocks;
    for (int i = 0; i < 1 << 14; ++i) {
        blocks.push_back(allocator.Alloc(4));
    }
    const auto alloc_without_memory = [&] {
        const HeapFailure failure(1);
        return allocator.Alloc(4);
    };
    EXPECT_EQ(alloc_without_memory(), nullptr);
    allocator.Free(blocks[5]);
    EXPECT_EQ(alloc_without_memory(), blocks[5]) << "a freed block needs none";
    EXPECT_EQ(allocator.Alloc(4), static_cast<char*>(blocks.back()) + 4);
}

// The record of a segment has a pointer for every 2^14 blocks, and one more for a single block beyond.
TEST(VmAllocator, serves_one_block_more_than_a_chunk_of_records_holds) {
    const ScratchFolder folder;
    constexpr int BLOCKS = (1 << 14) + 1;
    constexpr std::uint32_t EACH = 16;
    vlVmAllocator allocator(BLOCKS * EACH, EACH);
    std::set<void*> blocks;
    for (int i = 0; i < BLOCKS; ++i) {
        blocks.insert(allocator.Alloc(EACH));
    }
    EXPECT_EQ(blocks.size(), static_cast<std::size_t>(BLOCKS));
    EXPECT_EQ(blocks.count(nullptr), 0U);
    EXPECT_EQ(folder.names().size(), 1U) << "one segment";
    allocator.Free(*blocks.rbegin());
    EXPECT_EQ(allocator.Alloc(EACH), *blocks.rbegin());
}

TEST(VmAllocator, without_a_temporary_folder_or_bookkeeping_gives_null) {
    const ScratchFolder folder;
    for (const std::string& name : {folder / "missing", "/" + std::string(300, 'x')}) {
        ScratchFolder::set_temporary(name);
        vlVmAllocator allocator(4096, 4096);
        EXPECT_EQ(allocator.Alloc(4096), nullptr);
        void* as_in_fresh_memory = nullptr;
        std::memset(&as_in_fresh_memory, basalt::test::FRESH_BYTE, sizeof as_in_fresh_memory);
        allocator.Free(as_in_fresh_memory);  // compared with no entry of the index, which is empty
        ScratchFolder::set_temporary(folder.path());
        EXPECT_NE(allocator.Alloc(4096), nullptr) << "the folder is asked for anew";
    }
    // Bookkeeping that could not be made is missing for good.
    const auto made_without_memory = [] {
        const HeapFailure failure(1);
        return vlVmAllocator(4096, 4096);
    };
    vlVmAllocator none = made_without_memory();
    EXPECT_EQ(none.Alloc(4096), nullptr);
    none.Free(&none);
}

// Virtual slots and size as hosts compiled against them expect: two slots for the destructor, then the
// operations.
TEST(VmAllocator, keeps_its_virtual_slots) {
    const ScratchFolder folder;
    vlVmAllocator allocator(4096, 64);
    void** const slots = *reinterpret_cast<void***>(&allocator);
    const auto alloc = reinterpret_cast<void* (*)(void*, std::uint64_t)>(slots[2]);
    const auto free = reinterpret_cast<void (*)(void*, void*)>(slots[3]);
    void* const block = alloc(&allocator, 64);
    ASSERT_NE(block, nullptr);
    free(&allocator, block);
    EXPECT_EQ(allocator.Alloc(64), block);
    static_assert(std::is_base_of_v<vex_lib::vlAllocator, vlVmAllocator>);
    static_assert(!std::is_copy_constructible_v<vlVmAllocator> && !std::is_copy_assignable_v<vlVmAllocator>);
    static_assert(sizeof(vlVmAllocator) == 5 * sizeof(void*) + 2 * sizeof(std::uint32_t));
}

}  // namespace
