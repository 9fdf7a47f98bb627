#include "src/platform/heap.h"

#include <gtest/gtest.h>
#include <sys/mman.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <random>
#include <vector>

#include "basalt/platform/error.h"
#include "tests/platform/error_of.h"
#include "tests/support/heap_inspection.h"

namespace {

using basalt::test::error_of;

constexpr std::size_t KIB = 1024, MIB = 1024 * KIB;
using Blocks = std::vector<void*>;

struct Heap {
    explicit Heap(std::size_t maximum) : handle(HeapCreate(0, 0, maximum)) {}
    ~Heap() { EXPECT_EQ(HeapDestroy(handle), 1); }
    Heap(const Heap&) = delete;
    Heap& operator=(const Heap&) = delete;
    void* take(std::size_t size) const { return HeapAlloc(handle, 0, size); }
    void* resize(void* block, std::size_t size) const { return HeapReAlloc(handle, 0, block, size); }
    BOOL free(void* block) const { return HeapFree(handle, 0, block); }
    bool free_all(const Blocks& blocks) const {
        return std::ranges::all_of(blocks, [this](void* block) { return free(block) != 0; });
    }
    Blocks take_up_to(std::size_t count, std::size_t size) const {
        Blocks blocks;
        for (void* block = nullptr; blocks.size() < count && (block = take(size)) != nullptr;) {
            blocks.push_back(block);
        }
        return blocks;
    }
    std::size_t compact() const { return HeapCompact(handle, 0); }
    basalt::platform::HeapReport report() const {
        const auto report = basalt::platform::inspect_heap(handle);
        EXPECT_STREQ(report.fault, nullptr);
        return report;
    }
    HANDLE handle;
};

TEST(Heap, maximum_bounds_what_is_mapped) {
    for (const std::size_t maximum : {std::size_t{1}, 64 * KIB, 10 * MIB, 70 * MIB}) {
        const Heap heap(maximum);
        const std::size_t pages = (maximum + 4095) / 4096 * 4096;
        EXPECT_EQ(error_of(heap.take(pages)), ERROR_NOT_ENOUGH_MEMORY);
        const Blocks blocks = heap.take_up_to(SIZE_MAX, 1000);
        EXPECT_EQ(heap.report().mapped, pages);
        EXPECT_GE(blocks.size(), pages / 1100) << "most of it is usable";
        EXPECT_TRUE(heap.free_all(blocks));
        void* const whole = heap.take(heap.compact());
        EXPECT_NE(whole, nullptr) << "and in one piece";
        EXPECT_EQ(heap.resize(whole, 2 * pages), nullptr);
    }
    const Heap large(128 * MIB);
    void* const block = large.take(100 * MIB);
    EXPECT_EQ(large.resize(block, 200 * MIB), nullptr);
    EXPECT_NE(large.resize(block, 120 * MIB), nullptr);
    EXPECT_EQ(large.take(10 * MIB), nullptr);
}

TEST(Heap, refuses_sizes_out_of_range_and_what_is_no_heap) {
    const Heap heap(0);
    void* const block = heap.take(10);
    for (const std::size_t size : {SIZE_MAX, SIZE_MAX - 4096, SIZE_MAX / 2, std::size_t{1} << 47}) {
        EXPECT_EQ(error_of(heap.take(size)), ERROR_NOT_ENOUGH_MEMORY);
        EXPECT_EQ(error_of(heap.resize(block, size)), ERROR_NOT_ENOUGH_MEMORY);
    }
    EXPECT_NE(Heap(SIZE_MAX).take(5 * MIB), nullptr);
    alignas(4096) static char page[4096];
    for (HANDLE wrong : {HANDLE{nullptr}, static_cast<HANDLE>(page), static_cast<HANDLE>(page + 8)}) {
        EXPECT_EQ(error_of(HeapAlloc(wrong, 0, 1)), ERROR_INVALID_HANDLE);
        EXPECT_EQ(error_of(HeapFree(wrong, 0, nullptr)), ERROR_INVALID_HANDLE);
        EXPECT_EQ(error_of(HeapReAlloc(wrong, 0, page, 1)), ERROR_INVALID_HANDLE);
        EXPECT_EQ(error_of(HeapCompact(wrong, 0)), ERROR_INVALID_HANDLE);
        EXPECT_EQ(error_of(HeapDestroy(wrong)), ERROR_INVALID_HANDLE);
    }
    EXPECT_EQ(error_of(HeapAlloc(heap.handle, 8, 1)), ERROR_INVALID_PARAMETER) << "a flag";
    EXPECT_EQ(error_of(HeapCreate(1, 0, 0)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(error_of(HeapCreate(0, 2, 1)), ERROR_INVALID_PARAMETER);
}

TEST(Heap, refuses_what_is_no_live_block) {
    const Heap heap(0), other(0);
    int local = 0;
    EXPECT_EQ(heap.free(&local), 0) << "of a heap without memory";
    auto* const first = static_cast<unsigned char*>(heap.take(100));
    void *const second = heap.take(100), *const third = heap.take(100), *const large = heap.take(4 * MIB);
    EXPECT_TRUE(heap.free_all({nullptr, second, third, large}));
    for (void* wrong :
         Blocks{second, third, large, first + 16, other.take(100), first + 1, first - 16, &local}) {
        EXPECT_EQ(error_of(heap.free(wrong)), ERROR_INVALID_PARAMETER);
        EXPECT_EQ(error_of(heap.resize(wrong, 10)), ERROR_INVALID_PARAMETER);
    }
    EXPECT_EQ(error_of(heap.resize(nullptr, 10)), ERROR_INVALID_PARAMETER);
    // What looks like a head in a caller's data, at an address without the alignment of blocks.
    for (const int offset : {1, 2, 4, 8}) {
        const auto copy_head = [&]() __attribute__((no_sanitize("address"))) {
            for (int i = -8; i < 0; ++i) {
                first[16 + offset + i] = first[i];
            }
        };
        copy_head();
        EXPECT_EQ(heap.free(first + 16 + offset), 0) << offset;
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
    EXPECT_EQ(error_of(heap.compact()), ERROR_SUCCESS) << "an unused heap has no free block";
    for (const std::size_t size : {480U, 2048U}) {
        Blocks blocks = heap.take_up_to(100 * MIB / size, size);
        const auto falls = std::ranges::count_if(
            blocks, [&](void*& block) { return &block != blocks.data() && block < *(&block - 1); });
        EXPECT_TRUE(size != 2048 || falls <= static_cast<long>(heap.report().regions))
            << "blocks come in rising order";
        EXPECT_GT(heap.report().mapped, 90 * MIB);
        std::shuffle(blocks.begin(), blocks.end(), std::mt19937(2));
        EXPECT_TRUE(heap.free_all(blocks));
        EXPECT_LE(heap.report().mapped, 32 * MIB);
    }
    EXPECT_GT(heap.compact(), 60 * KIB) << "a used heap keeps a region";
    EXPECT_EQ(heap.report().regions, 1U);
}

TEST(Heap, compacting_returns_the_pages_of_every_free_block) {
    constexpr std::size_t EACH = 100 * KIB, PAGE = 4 * KIB;
    const Heap heap(0);
    const Blocks blocks = heap.take_up_to(20, EACH);
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        std::memset(blocks[i], 1, EACH);
        EXPECT_TRUE(i % 2 == 1 || heap.free(blocks[i]) != 0);
    }
    heap.compact();
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        const std::uintptr_t begin = (reinterpret_cast<std::uintptr_t>(blocks[i]) + 2 * PAGE) & ~(PAGE - 1);
        std::array<unsigned char, EACH / PAGE - 4> pages{};  // between what the heap keeps at both ends
        ASSERT_TRUE(mincore(reinterpret_cast<void*>(begin), pages.size() * PAGE, pages.data()) == 0 ||
                    errno == ENOMEM);
        EXPECT_EQ(std::ranges::count_if(pages, [](int page) { return (page & 1) != 0; }),
                  i % 2 == 0 ? 0 : static_cast<long>(pages.size()));
    }
}

TEST(Heap, quick_lists_serve_the_same_size_and_give_way_to_others) {
    const Heap heap(MIB);
    Blocks blocks = heap.take_up_to(SIZE_MAX, 100);
    for (std::size_t i = 0; i < 200; i += 2) {
        EXPECT_EQ(heap.free(blocks[i]), 1);
        EXPECT_EQ(heap.free(blocks[i]), 0) << "freed twice";
        EXPECT_EQ(heap.resize(blocks[i], 10), nullptr);
    }
    EXPECT_EQ(heap.report().quick_blocks, 100U);
    for (std::size_t i = 200; i > 0; i -= 2) {
        EXPECT_EQ(heap.take(100), blocks[i - 2]) << "last freed, first used";
    }
    std::shuffle(blocks.begin(), blocks.end(), std::mt19937(1));
    EXPECT_TRUE(heap.free_all(blocks));
    void* const whole = heap.take(MIB - 64);
    EXPECT_TRUE(whole != nullptr && heap.free(whole) != 0);
    const Heap large(0);
    blocks = large.take_up_to(100'000, 40);
    EXPECT_TRUE(large.free_all(Blocks(blocks.begin(), blocks.begin() + 50'000)));
    EXPECT_LE(large.report().quick_blocks * 48, 256 * KIB);
    // A large block of a limited heap takes the place of regions whose blocks are all in quick lists.
    const Heap limited(66 * MIB);
    EXPECT_TRUE(limited.free_all(limited.take_up_to(60'000, 480)));
    EXPECT_NE(limited.take(66 * MIB - 8 * KIB), nullptr);
}

TEST(Heap, finds_a_fit_in_the_list_of_nearly_the_size_and_grows_in_place) {
    const Heap full(64 * KIB);
    const Blocks blocks = full.take_up_to(SIZE_MAX, 5000);
    EXPECT_EQ(full.free(blocks[3]), 1);
    EXPECT_EQ(full.take(5008), nullptr);
    EXPECT_EQ(full.take(4990), blocks[3]);
    const Heap heap(0);
    void* const block = heap.take(1000);
    EXPECT_EQ(heap.resize(block, 30'000), block);
    EXPECT_EQ(heap.resize(block, 10), block);
    EXPECT_LT(static_cast<char*>(heap.take(10)), static_cast<char*>(block) + 100) << "the rest is free again";
    EXPECT_NE(heap.resize(block, 1000), block);
}

#ifdef BASALT_ADDRESS_SANITIZER
TEST(Heap, the_sanitizer_finds_overruns_and_uses_after_free) {
    const Heap heap(0);
    for (const std::size_t size : {std::size_t{0}, std::size_t{13}, std::size_t{2048}, 2 * MIB}) {
        auto* const block = static_cast<char*>(heap.resize(heap.take(size + 100), size));
        EXPECT_EQ(__asan_region_is_poisoned(block, size), nullptr);
        EXPECT_TRUE(__asan_address_is_poisoned(block - 1) && __asan_address_is_poisoned(block + size))
            << size;
        heap.free(block);
        EXPECT_TRUE(size >= MIB || __asan_address_is_poisoned(block)) << size;
    }
    static const HANDLE kept = HeapCreate(0, 0, 0);
    *static_cast<char**>(HeapAlloc(kept, 0, 8)) = new char[777];  // no leak: a heap block leads to it
}
#endif

}  // namespace
