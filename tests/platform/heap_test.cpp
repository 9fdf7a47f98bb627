// Facts about private heaps, which fuzz/allocators compares with a model, and about ranges of pages.
#include "src/platform/heap.h"

#include <gtest/gtest.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <random>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/virtual_memory.h"
#include "tests/platform/error_of.h"
#include "tests/support/heap_inspection.h"

namespace {

using basalt::test::error_of;

constexpr std::size_t KIB = 1024, MIB = 1024 * KIB, PAGE = 4 * KIB, GRANULE = 64 * KIB;
using Blocks = std::vector<void*>;

struct Heap {
    explicit Heap(std::size_t maximum) : handle(HeapCreate(0, 0, maximum)) {}
    ~Heap() { EXPECT_EQ(HeapDestroy(handle), 1); }
    Heap(const Heap&) = delete;
    Heap& operator=(const Heap&) = delete;
    void* take(std::size_t size) const { return HeapAlloc(handle, 0, size); }
    void* resize(void* block, std::size_t size) const { return HeapReAlloc(handle, 0, block, size); }
    BOOL free(void* block) const { return HeapFree(handle, 0, block); }
    Blocks take_up_to(std::size_t count, std::size_t size) const {
        Blocks blocks;
        for (void* block = nullptr; blocks.size() < count && (block = take(size)) != nullptr;) {
            blocks.push_back(block);
        }
        return blocks;
    }
    void free_shuffled(Blocks blocks) const {
        std::shuffle(blocks.begin(), blocks.end(), std::mt19937(1));
        std::ranges::for_each(blocks, [this](void* block) { EXPECT_EQ(free(block), 1); });
    }
    basalt::platform::HeapReport report() const {
        const auto report = basalt::platform::inspect_heap(handle);
        EXPECT_STREQ(report.fault, nullptr);
        return report;
    }
    HANDLE handle;
};

TEST(Heap, maximum_bounds_what_is_mapped_and_most_of_it_is_usable) {
    for (const std::size_t maximum : {std::size_t{1}, 64 * KIB, MIB, 10 * MIB, 70 * MIB}) {
        const Heap heap(maximum);
        const std::size_t pages = (maximum + 4095) / 4096 * 4096;
        EXPECT_EQ(error_of(heap.take(pages)), ERROR_NOT_ENOUGH_MEMORY);
        const Blocks blocks = heap.take_up_to(SIZE_MAX, 100);
        EXPECT_EQ(heap.report().mapped, pages);
        EXPECT_GE(blocks.size(), pages / 130);
        heap.free_shuffled(blocks);
        void* const whole = heap.take(pages - 8 * (maximum < MIB ? 8 : KIB));
        EXPECT_NE(whole, nullptr) << "and in one piece";
        EXPECT_EQ(heap.resize(whole, 2 * pages), nullptr);
    }
    const Heap large(128 * MIB), small(64 * KIB);
    void* const block = large.take(100 * MIB);
    EXPECT_TRUE(!large.resize(block, 200 * MIB) && large.resize(block, 120 * MIB) && !large.take(10 * MIB));
    const Blocks full = small.take_up_to(SIZE_MAX, 5000);
    EXPECT_TRUE(small.free(full[3]) && !small.take(5008) && small.take(4990) == full[3]);
    for (const std::size_t size : {10U, 4000U, 10U}) {
        EXPECT_EQ(small.resize(full[3], size), full[3]) << "in place";
    }
    EXPECT_NE(small.take(4900), nullptr) << "the rest is free";
}

TEST(Heap, refuses_sizes_out_of_range) {
    const Heap heap(0);
    void* const block = heap.take(10);
    for (const std::size_t size : {SIZE_MAX, SIZE_MAX - 4096, SIZE_MAX / 2, std::size_t{1} << 47}) {
        EXPECT_EQ(error_of(heap.take(size)), ERROR_NOT_ENOUGH_MEMORY);
        EXPECT_EQ(error_of(heap.resize(block, size)), ERROR_NOT_ENOUGH_MEMORY);
    }
    EXPECT_NE(Heap(SIZE_MAX).take(5 * MIB), nullptr);
}

TEST(Heap, refuses_what_is_no_live_block) {
    const Heap heap(0), other(0);
    int local = 0;
    EXPECT_EQ(heap.free(&local), 0) << "of a heap without memory";
    auto* const first = static_cast<unsigned char*>(heap.take(100));
    const Blocks freed = {heap.take(100), heap.take(100), heap.take(4 * MIB)};
    heap.free_shuffled(freed);
    EXPECT_TRUE(heap.free(nullptr));
    // What looks like a head in a caller's data, at an address without the alignment of blocks.
    const auto copy_head = [first](int offset) __attribute__((no_sanitize("address"))) {
        for (int i = 8; i < 16; ++i) {  // no call that a sanitizer watches
            first[offset + i] = first[i - 16];
        }
        return first + 16 + offset;
    };
    Blocks wrong = {other.take(100), &local, first - 16, first + 1, first + 16};
    wrong.insert(wrong.end(), freed.begin(), freed.end());
    for (void* const block : wrong) {
        EXPECT_EQ(error_of(heap.free(block)), ERROR_INVALID_PARAMETER);
        EXPECT_EQ(error_of(heap.resize(block, 10)), ERROR_INVALID_PARAMETER);
    }
    for (const int offset : {1, 2, 4, 8}) {
        EXPECT_EQ(error_of(heap.free(copy_head(offset))), ERROR_INVALID_PARAMETER) << offset;
        EXPECT_EQ(error_of(heap.resize(copy_head(offset), 10)), ERROR_INVALID_PARAMETER) << offset;
    }
    EXPECT_EQ(heap.report().live_blocks, 1U);
}

// mremap refuses a range whose parts have different settings: whole large pages and the rest behind them, and
// pages of which a host has locked some.
TEST(Heap, large_blocks_grow_though_their_pages_differ) {
    const Heap heap(0);
    for (const std::size_t size : {2 * MIB, 6 * MIB + 100 * KIB}) {
        auto* block = static_cast<char*>(heap.take(size));
        std::memset(block, 7, size);
        block = static_cast<char*>(heap.resize(block, 2 * size));
        const std::uintptr_t page = (reinterpret_cast<std::uintptr_t>(block) + MIB) & ~(MIB - 1);
        ASSERT_EQ(madvise(reinterpret_cast<void*>(page), 64 * KIB, MADV_DONTDUMP), 0);
        block = static_cast<char*>(heap.resize(block, 3 * size));
        ASSERT_NE(block, nullptr) << size;
        EXPECT_EQ(std::count(block, block + size, 7), static_cast<long>(size));
        block[3 * size - 1] = 1;
        EXPECT_EQ(heap.free(block), 1);
    }
}

TEST(Heap, keeps_up_to_32_mebibytes_until_it_is_compacted) {
    const Heap heap(0);
    SetLastError(ERROR_ACCESS_DENIED);
    EXPECT_EQ(error_of(HeapCompact(heap.handle, 0)), ERROR_SUCCESS) << "an unused heap has no free block";
    for (const std::size_t size : {480U, 2048U}) {
        const Blocks blocks = heap.take_up_to(100 * MIB / size, size);
        EXPECT_GT(heap.report().mapped, 90 * MIB);
        heap.free_shuffled(blocks);
        EXPECT_LE(heap.report().mapped, 32 * MIB);
    }
    EXPECT_GT(HeapCompact(heap.handle, 0), 60 * KIB) << "a used heap keeps a region";
    EXPECT_EQ(heap.report().regions, 1U);
}

TEST(Heap, compacting_returns_the_pages_of_every_free_block) {
    constexpr std::size_t EACH = 100 * KIB;
    const Heap heap(0);
    const Blocks blocks = heap.take_up_to(20, EACH);
    for (std::size_t i = 0; i < 20; ++i) {
        std::memset(blocks[i], 1, EACH);
        EXPECT_TRUE(i % 2 == 1 || heap.free(blocks[i]) != 0);
    }
    HeapCompact(heap.handle, 0);
    for (std::size_t i = 0; i < 20; ++i) {
        const std::uintptr_t begin = (reinterpret_cast<std::uintptr_t>(blocks[i]) + 2 * PAGE) & ~(PAGE - 1);
        std::vector<unsigned char> pages(EACH / PAGE - 4);  // between what the heap keeps at both ends
        const int result = mincore(reinterpret_cast<void*>(begin), pages.size() * PAGE, pages.data());
        ASSERT_TRUE(result == 0 || errno == ENOMEM);
        EXPECT_EQ(std::ranges::count_if(pages, [](int page) { return page % 2 == 1; }), i % 2 * pages.size());
    }
}

#ifdef BASALT_ADDRESS_SANITIZER
TEST(Heap, the_sanitizer_finds_overruns_and_uses_after_free) {
    const Heap heap(0);
    for (const std::size_t size : {std::size_t{0}, std::size_t{13}, std::size_t{2048}, 2 * MIB}) {
        auto* const block = static_cast<char*>(heap.resize(heap.take(size + 100), size));
        EXPECT_EQ(__asan_region_is_poisoned(block, size), nullptr);
        EXPECT_TRUE(__asan_address_is_poisoned(block - 1) && __asan_address_is_poisoned(block + size));
        heap.free(block);
        EXPECT_TRUE(size >= MIB || __asan_address_is_poisoned(block)) << size;
    }
    static const HANDLE kept = HeapCreate(0, 0, 0);
    *static_cast<char**>(HeapAlloc(kept, 0, 8)) = new char[777];  // no leak: a heap block leads to it
}
#endif

char* reserve(std::size_t size, void* address = nullptr) {
    return static_cast<char*>(VirtualAlloc(address, size, MEM_RESERVE, PAGE_NOACCESS));
}
char* commit(void* address, std::size_t size) {
    return static_cast<char*>(VirtualAlloc(address, size, MEM_COMMIT, PAGE_READWRITE));
}
BOOL decommit(void* address, std::size_t size) {
    return VirtualFree(address, size, MEM_DECOMMIT);
}
BOOL release(void* base) {
    return VirtualFree(base, 0, MEM_RELEASE);
}

bool is_readable(const void* address) {
    int ends[2];
    EXPECT_EQ(pipe(ends), 0);
    const bool is_read = write(ends[1], address, 1) == 1;
    close(ends[0]), close(ends[1]);
    return is_read;
}

TEST(VirtualMemory, pages_are_usable_from_commit_to_decommit) {
    char* const base = reserve(10 * PAGE);
    EXPECT_TRUE(base != nullptr && reinterpret_cast<std::uintptr_t>(base) % GRANULE == 0);
    EXPECT_EQ(commit(base + 2 * PAGE + 5, PAGE), base + 2 * PAGE) << "two pages hold bytes of the range";
    for (std::size_t page = 0; page < 10; ++page) {
        EXPECT_EQ(is_readable(base + page * PAGE), page == 2 || page == 3) << page;
    }
    mlock(base + 2 * PAGE, 2 * PAGE);  // may fail; locked pages are zero after a decommit too
    std::fill(base + 2 * PAGE, base + 4 * PAGE, 'x');
    EXPECT_EQ(decommit(base + 3 * PAGE + 7, 1), 1);
    EXPECT_FALSE(is_readable(base + 3 * PAGE));
    EXPECT_EQ(commit(base, 10 * PAGE), base);
    EXPECT_EQ(std::count(base, base + 10 * PAGE, 'x'), static_cast<long>(PAGE)) << "the other's stay";
    EXPECT_TRUE(decommit(base, 10 * PAGE) && decommit(base, 10 * PAGE)) << "all of it, and a second time";
    EXPECT_FALSE(is_readable(base + 2 * PAGE));
    EXPECT_EQ(release(base), 1);
}

TEST(VirtualMemory, an_address_is_rounded_down_to_a_granule) {
    char* const base = reserve(4 * GRANULE);
    EXPECT_EQ(error_of(reserve(GRANULE, base + GRANULE)), ERROR_INVALID_ADDRESS) << "taken";
    EXPECT_TRUE(release(base) && reserve(PAGE, base + GRANULE + 5) == base + GRANULE);
    EXPECT_EQ(commit(base + GRANULE, 5 + PAGE), base + GRANULE) << "up to the end of the request";
    char* const committed = commit(nullptr, PAGE);
    ASSERT_NE(committed, nullptr) << "reserves first";
    committed[PAGE - 1] = 'x';
    EXPECT_TRUE(release(base + GRANULE) && release(committed));
}

TEST(VirtualMemory, refuses_addresses_that_are_not_all_in_one_range) {
    char* const base = reserve(GRANULE);
    auto* const low = reinterpret_cast<char*>(PAGE);
    for (const auto& [address, size] :
         {std::pair(base - 1, 2UL), {base + GRANULE - 1, 2}, {low, 2}, {base, SIZE_MAX}}) {
        EXPECT_EQ(error_of(commit(address, size)), ERROR_INVALID_ADDRESS);
        EXPECT_EQ(error_of(decommit(address, size)), ERROR_INVALID_ADDRESS);
    }
    EXPECT_EQ(error_of(release(base + PAGE)), ERROR_INVALID_ADDRESS);
    EXPECT_EQ(release(base), 1);
}

}  // namespace
