#include "src/platform/heap.h"

#include <gtest/gtest.h>
#include <sys/mman.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdint>
#include <cstring>
#include <map>
#include <random>
#include <utility>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/heap/sanitizer.h"
#include "tests/platform/error_of.h"
#include "tests/support/heap_inspection.h"
#include "tests/support/system_failures.h"
#include "tests/support/threads.h"

namespace {

using basalt::platform::HeapReport;
using basalt::platform::inspect_heap;
using basalt::test::error_of;
using basalt::test::mapped_balance;
using basalt::test::SystemFailure;

constexpr std::size_t KIB = 1024;
constexpr std::size_t MIB = 1024 * KIB;
constexpr std::size_t MIXED_SIZES[] = {0, 1, 24, 25, 100, 2048, 4 * KIB, 60 * KIB, 300 * KIB, MIB, 3 * MIB};

struct Heap {
    explicit Heap(std::size_t maximum) : handle(HeapCreate(0, 0, maximum)) {}
    ~Heap() { HeapDestroy(handle); }
    Heap(const Heap&) = delete;
    Heap& operator=(const Heap&) = delete;
    void* take(std::size_t size) const { return HeapAlloc(handle, 0, size); }
    void* resize(void* block, std::size_t size) const { return HeapReAlloc(handle, 0, block, size); }
    BOOL free(void* block) const { return HeapFree(handle, 0, block); }
    HANDLE handle;
};

HeapReport sound(HANDLE heap) {
    const HeapReport report = inspect_heap(heap);
    EXPECT_STREQ(report.fault, nullptr);
    return report;
}

void expect_fill(const unsigned char* block, std::size_t size, unsigned char fill) {
    ASSERT_TRUE(size == 0 || (block[0] == fill && std::memcmp(block, block + 1, size - 1) == 0));
}

std::vector<void*> take_many(const Heap& heap, std::size_t size, std::size_t count) {
    std::vector<void*> blocks(count);
    std::generate(blocks.begin(), blocks.end(), [&] { return heap.take(size); });
    EXPECT_EQ(std::count(blocks.begin(), blocks.end(), nullptr), 0);
    return blocks;
}

std::vector<void*> take_until_full(const Heap& heap, std::size_t size) {
    std::vector<void*> blocks;
    while (void* block = heap.take(size)) {
        blocks.push_back(block);
    }
    return blocks;
}

void free_all(const Heap& heap, const std::vector<void*>& blocks) {
    for (void* block : blocks) {
        EXPECT_EQ(heap.free(block), 1);
    }
}

// The model: every live block, its size, and the byte it is filled with.
using Model = std::map<unsigned char*, std::pair<std::size_t, unsigned char>>;

void add(Model& model, void* block, std::size_t size, unsigned char fill) {
    ASSERT_EQ(reinterpret_cast<std::uintptr_t>(block) % 16, 0U);
    auto* begin = static_cast<unsigned char*>(block);
    const auto after = model.lower_bound(begin);
    ASSERT_TRUE(after == model.end() || begin + size <= after->first);
    ASSERT_TRUE(after == model.begin() || std::prev(after)->first + std::prev(after)->second.first <= begin);
    std::memset(begin, fill, size);
    model.emplace(begin, std::pair(size, fill));
}

Model::iterator pick(Model& model, std::uint64_t random) {
    return std::next(model.begin(), static_cast<long>(random % model.size()));
}

bool take_one(const Heap& heap, Model& model, std::size_t size, unsigned char fill) {
    SetLastError(ERROR_SUCCESS);
    void* block = heap.take(size);
    EXPECT_TRUE(block != nullptr || GetLastError() == ERROR_NOT_ENOUGH_MEMORY);
    if (block != nullptr) {
        add(model, block, size, fill);
    }
    return block != nullptr;
}

void resize_one(const Heap& heap, Model& model, Model::iterator at, std::size_t size,
                unsigned char new_fill) {
    const auto [old_size, fill] = at->second;
    expect_fill(at->first, old_size, fill);
    if (void* block = heap.resize(at->first, size)) {
        expect_fill(static_cast<unsigned char*>(block), std::min(size, old_size), fill);
        model.erase(at);
        add(model, block, size, new_fill);
    } else {
        expect_fill(at->first, old_size, fill);
    }
}

void free_one(const Heap& heap, Model& model, Model::iterator at) {
    expect_fill(at->first, at->second.first, at->second.second);
    EXPECT_EQ(heap.free(at->first), 1);
    model.erase(at);
}

// Uses the heap and frees all in the end. Held against the model, unless others use the heap meanwhile.
void run_randomly(const Heap& heap, std::mt19937_64& random, int steps, bool is_alone) {
    Model model;
    for (int step = 0; step < steps; ++step) {
        const auto choice = random() % 100;
        std::size_t size = MIXED_SIZES[random() % std::size(MIXED_SIZES)] + random() % 64;
        if (!is_alone) {
            size %= 4000;
        } else if (size > 64 * KIB && random() % 8 != 0) {
            size %= 512;
        }
        const auto fill = static_cast<unsigned char>(random());
        if (choice < 45 || model.empty()) {
            take_one(heap, model, size, fill);
        } else if (choice < 75) {
            free_one(heap, model, pick(model, random()));
        } else if (choice < 98) {
            resize_one(heap, model, pick(model, random()), size, fill);
        } else {
            const std::size_t largest = HeapCompact(heap.handle, 0);
            const HeapReport report = sound(heap.handle);
            EXPECT_TRUE(largest == report.largest_free || !is_alone);
        }
        if (is_alone && step % 64 == 0) {
            ASSERT_EQ(sound(heap.handle).live_blocks, model.size());
        }
    }
    while (!model.empty()) {
        free_one(heap, model, pick(model, random()));
    }
}

void expect_emptied(const Heap& heap) {
    const HeapReport report = sound(heap.handle);
    EXPECT_EQ(report.live_blocks, 0U);
    EXPECT_LE(report.mapped, 32 * MIB) << "an emptied heap keeps some memory for its next use";
    HeapCompact(heap.handle, 0);
    EXPECT_LE(sound(heap.handle).regions, 1U) << "compacting leaves one region at most";
}

TEST(Heap, FollowsTheModelUnderRandomUse) {
    const auto seed = std::random_device{}();
    SCOPED_TRACE(testing::Message() << "seed " << seed);
    std::mt19937_64 random(seed);
    for (const std::size_t maximum : {std::size_t{0}, 64 * KIB, 3 * MIB + 1, 80 * MIB}) {
        SCOPED_TRACE(testing::Message() << "maximum " << maximum);
        const long before = mapped_balance();
        {
            const Heap heap(maximum);
            run_randomly(heap, random, 6000, true);
            expect_emptied(heap);
        }
        EXPECT_EQ(mapped_balance(), before);
    }
}

TEST(Heap, EightThreadsShareOne) {
    const Heap heap(0);
    basalt::test::run_threads(8, [&](int thread) {
        std::mt19937_64 random(static_cast<unsigned>(thread));
        run_randomly(heap, random, 3000, false);
    });
    expect_emptied(heap);
}

// Everything a heap asks of the system, with every answer checked.
void exercise() {
    const Heap heap(0);
    if (heap.handle == nullptr) {
        EXPECT_EQ(GetLastError(), ERROR_NOT_ENOUGH_MEMORY);
        return;
    }
    Model model;
    for (const std::size_t size : MIXED_SIZES) {
        if (take_one(heap, model, size, 1)) {
            resize_one(heap, model, pick(model, size), size + MIB / 2, 2);
        }
        EXPECT_EQ(sound(heap.handle).live_blocks, model.size());
    }
    for (const auto& [block, content] : model) {
        if (heap.free(block) == 0) {
            EXPECT_EQ(GetLastError(), ERROR_NOT_ENOUGH_MEMORY);
            EXPECT_EQ(heap.free(block), 1);
        }
        sound(heap.handle);
    }
    HeapCompact(heap.handle, 0);
    EXPECT_EQ(sound(heap.handle).live_blocks, 0U);
}

TEST(Heap, SurvivesEachSystemCallFailing) {
    int nth = 0;
    for (bool fails = true; fails;) {
        SCOPED_TRACE(++nth);
        const SystemFailure failure(nth);
        exercise();
        fails = SystemFailure::struck();
    }
    EXPECT_GT(nth, 21);
}

// The system moves only pages that are alike: those of a large block, whole large pages and the rest behind
// them, once were not, and neither are those of which a host has locked some.
TEST(Heap, EnlargesLargeBlocksWhosePagesAreNotAlike) {
    const Heap heap(0);
    for (const std::size_t size : {2 * MIB, 6 * MIB + 100 * KIB}) {
        auto* block = static_cast<unsigned char*>(heap.take(size));
        std::memset(block, 7, size);
        block = static_cast<unsigned char*>(heap.resize(block, 2 * size));
        ASSERT_NE(block, nullptr) << size;
        const std::uintptr_t page = (reinterpret_cast<std::uintptr_t>(block) + MIB) & ~(MIB - 1);
        ASSERT_EQ(madvise(reinterpret_cast<void*>(page), 64 * KIB, MADV_DONTDUMP), 0);
        block = static_cast<unsigned char*>(heap.resize(block, 3 * size));
        ASSERT_NE(block, nullptr) << size << ", part of it changed by the host";
        expect_fill(block, size, 7);
        block[3 * size - 1] = 1;
        EXPECT_EQ(heap.free(block), 1);
        sound(heap.handle);
    }
}

TEST(Heap, MapsNothingMoreOnceTheSystemRefuses) {
    const Heap heap(0);
    void* block = heap.take(100);
    std::memset(block, 7, 100);
    const HeapReport before = sound(heap.handle);
    const long balance = mapped_balance();
    {
        const SystemFailure failure(1, SystemFailure::Then::STAYS);
        for (const std::size_t size : {100 * KIB, 900 * KIB, 5 * MIB}) {
            EXPECT_EQ(error_of(heap.take(size)), ERROR_NOT_ENOUGH_MEMORY);
            EXPECT_EQ(error_of(heap.resize(block, size)), ERROR_NOT_ENOUGH_MEMORY);
        }
        EXPECT_NE(heap.take(1000), nullptr) << "what is there is still handed out";
    }
    EXPECT_EQ(mapped_balance(), balance);
    EXPECT_EQ(sound(heap.handle).mapped, before.mapped);
    expect_fill(static_cast<unsigned char*>(block), 100, 7);
}

TEST(Heap, MaximumBoundsWhatIsMapped) {
    for (const std::size_t maximum : {std::size_t{1}, 64 * KIB, 10 * MIB, 70 * MIB}) {
        SCOPED_TRACE(maximum);
        const Heap heap(maximum);
        const std::size_t pages = (maximum + 4095) / 4096 * 4096;
        EXPECT_EQ(error_of(heap.take(pages)), ERROR_NOT_ENOUGH_MEMORY);
        const std::vector<void*> blocks = take_until_full(heap, 1000);
        EXPECT_EQ(sound(heap.handle).mapped, pages);
        EXPECT_GE(blocks.size(), pages / 1100) << "most of it is handed out";
        free_all(heap, blocks);
    }
    const Heap heap(2 * MIB);
    void* whole = heap.take(2 * MIB - 64);
    EXPECT_NE(whole, nullptr) << "single blocks may be as large as the maximum allows";
    EXPECT_EQ(heap.take(4000), nullptr);
    EXPECT_EQ(heap.resize(whole, 4 * MIB), nullptr);
    EXPECT_EQ(heap.free(whole), 1);
    EXPECT_NE(heap.take(HeapCompact(heap.handle, 0)), nullptr);

    const Heap larger(128 * MIB);
    void* block = larger.take(100 * MIB);
    EXPECT_EQ(larger.resize(block, 200 * MIB), nullptr)
        << "nor may a block in a region of its own grow further";
    EXPECT_NE(larger.resize(block, 120 * MIB), nullptr);
    EXPECT_EQ(larger.take(10 * MIB), nullptr);
}

TEST(Heap, RefusesAbsurdSizes) {
    const Heap heap(0);
    const Heap small(64 * KIB);
    void* block = heap.take(10);
    for (const std::size_t size :
         {SIZE_MAX, SIZE_MAX - 7, SIZE_MAX - 4096, SIZE_MAX / 2, std::size_t{1} << 47}) {
        EXPECT_EQ(error_of(heap.take(size)), ERROR_NOT_ENOUGH_MEMORY);
        EXPECT_EQ(error_of(heap.resize(block, size)), ERROR_NOT_ENOUGH_MEMORY);
        EXPECT_EQ(small.take(size), nullptr);
    }
    EXPECT_EQ(heap.free(block), 1);
    const Heap boundless(SIZE_MAX);
    EXPECT_NE(boundless.take(5 * MIB), nullptr);
}

TEST(Heap, TellsWhatIsNoLiveBlock) {
    const Heap heap(0);
    const Heap other(0);
    int local = 0;
    EXPECT_EQ(heap.free(&local), 0) << "of a heap that has no memory yet";
    auto* first = static_cast<char*>(heap.take(100));
    auto* second = static_cast<char*>(heap.take(100));
    void* third = heap.take(100);
    void* foreign = other.take(100);
    void* large = heap.take(4 * MIB);
    EXPECT_EQ(heap.free(nullptr), 1);
    EXPECT_EQ(heap.free(second), 1);
    EXPECT_EQ(heap.free(third), 1) << "joins the one before";
    EXPECT_EQ(heap.free(large), 1);
    for (void* wrong :
         {static_cast<void*>(second), third, large, static_cast<void*>(first + 16), foreign,
          static_cast<void*>(first + 1), static_cast<void*>(first - 16), static_cast<void*>(&local)}) {
        EXPECT_EQ(error_of(heap.free(wrong)), ERROR_INVALID_PARAMETER);
        EXPECT_EQ(error_of(heap.resize(wrong, 10)), ERROR_INVALID_PARAMETER);
    }
    EXPECT_EQ(heap.resize(nullptr, 10), nullptr);
    EXPECT_EQ(sound(heap.handle).live_blocks, 1U);
}

// What a caller has written may look like a block's head, but no block lies there.
TEST(Heap, TellsAMisalignedBlockByItsPlaceAlone) {
    const Heap heap(0);
    auto* const block = static_cast<unsigned char*>(heap.take(100));
    constexpr int HEAD = 8;
    for (const int offset : {1, 2, 4, 8}) {
        const auto copy_head = [&]() __attribute__((no_sanitize("address"))) {
            for (int i = 0; i < HEAD; ++i) {
                block[16 + offset - HEAD + i] = block[i - HEAD];
            }
        };
        copy_head();
        EXPECT_EQ(heap.free(block + 16 + offset), 0) << offset;
    }
    EXPECT_EQ(heap.free(block), 1);
}

TEST(Heap, RefusesWhatIsNoHeap) {
    alignas(4096) static char page[4096];
    for (HANDLE wrong : {HANDLE{nullptr}, static_cast<HANDLE>(page), static_cast<HANDLE>(page + 8)}) {
        EXPECT_EQ(error_of(HeapAlloc(wrong, 0, 1)), ERROR_INVALID_HANDLE);
        EXPECT_EQ(HeapFree(wrong, 0, nullptr), 0);
        EXPECT_EQ(HeapReAlloc(wrong, 0, page, 1), nullptr);
        EXPECT_EQ(HeapCompact(wrong, 0), 0U);
        EXPECT_EQ(error_of(HeapDestroy(wrong)), ERROR_INVALID_HANDLE);
    }
    const Heap heap(0);
    EXPECT_EQ(error_of(HeapAlloc(heap.handle, 8, 1)), ERROR_INVALID_PARAMETER) << "a flag";
    EXPECT_EQ(HeapCreate(1, 0, 0), nullptr);
    EXPECT_EQ(error_of(HeapCreate(0, 2, 1)), ERROR_INVALID_PARAMETER);
}

TEST(Heap, ChunksComeInRisingOrderAndGoBackToTheSystem) {
    const Heap heap(0);
    SetLastError(ERROR_ACCESS_DENIED);
    EXPECT_EQ(error_of(HeapCompact(heap.handle, 0)), ERROR_SUCCESS) << "nothing was taken yet";
    EXPECT_EQ(sound(heap.handle).largest_free, 0U);
    const std::vector<void*> chunks = take_many(heap, 2048, 20'000);
    std::size_t falls = 0;
    for (std::size_t i = 1; i < chunks.size(); ++i) {
        falls += chunks[i] < chunks[i - 1] ? 1U : 0U;
    }
    EXPECT_LE(falls, sound(heap.handle).regions);
    free_all(heap, chunks);
    EXPECT_GT(sound(heap.handle).regions, 1U);
    EXPECT_LE(sound(heap.handle).mapped, 32 * MIB);
    free_all(heap, take_many(heap, 2048, chunks.size()));
    EXPECT_LE(sound(heap.handle).mapped, 32 * MIB) << "the kept regions served first";
    EXPECT_GT(HeapCompact(heap.handle, 0), 60 * KIB) << "a used heap keeps a region";
    EXPECT_EQ(sound(heap.handle).regions, 1U);
}

// A new block may have no room but among those of its own size class, where not every block is large enough.
TEST(Heap, FullHeapGivesABlockOfNearlyTheSizeAgain) {
    const Heap heap(64 * KIB);
    const std::vector<void*> blocks = take_until_full(heap, 5000);
    ASSERT_GT(blocks.size(), 5U);
    EXPECT_EQ(heap.free(blocks[3]), 1);
    EXPECT_EQ(heap.take(5008), nullptr);
    EXPECT_EQ(heap.take(4990), blocks[3]);
}

TEST(Heap, CompactGivesBackThePagesOfEveryFreeBlock) {
    constexpr std::size_t EACH = 100 * KIB;
    constexpr std::size_t PAGE = 4 * KIB;
    const Heap heap(0);
    const std::vector<void*> blocks = take_many(heap, EACH, 20);
    for (void* block : blocks) {
        std::memset(block, 1, EACH);
    }
    for (std::size_t i = 0; i < blocks.size(); i += 2) {
        EXPECT_EQ(heap.free(blocks[i]), 1);
    }
    HeapCompact(heap.handle, 0);
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        // between what the heap keeps at either end
        const std::uintptr_t begin = (reinterpret_cast<std::uintptr_t>(blocks[i]) + 2 * PAGE) & ~(PAGE - 1);
        std::array<unsigned char, EACH / PAGE - 4> pages{};
        if (mincore(reinterpret_cast<void*>(begin), pages.size() * PAGE, pages.data()) != 0) {
            ASSERT_EQ(errno, ENOMEM) << "given back with its region";
        }
        const bool is_live = i % 2 == 1;
        EXPECT_TRUE(std::all_of(pages.begin(), pages.end(), [&](unsigned char page) {
            return ((page & 1) != 0) == is_live;
        })) << i;
    }
}

TEST(Heap, SmallBlocksAreSetAsideUntilTheirRoomIsNeeded) {
    const Heap heap(MIB);
    std::vector<void*> blocks = take_until_full(heap, 100);
    // Each second one is taken again as it is, last freed first.
    for (std::size_t i = 0; i < 200; i += 2) {
        EXPECT_EQ(heap.free(blocks[i]), 1);
        EXPECT_EQ(heap.free(blocks[i]), 0) << "freed twice";
        EXPECT_EQ(heap.resize(blocks[i], 10), nullptr);
    }
    EXPECT_EQ(sound(heap.handle).quick_blocks, 100U);
    for (std::size_t i = 200; i > 0; i -= 2) {
        EXPECT_EQ(heap.take(100), blocks[i - 2]);
    }
    // All of it in one piece, though nothing but small blocks was freed, and for a small block of another
    // size.
    std::shuffle(blocks.begin(), blocks.end(), std::mt19937(1));
    free_all(heap, blocks);
    EXPECT_GT(sound(heap.handle).quick_blocks, 0U);
    void* whole = heap.take(MIB - 64);
    EXPECT_NE(whole, nullptr);
    EXPECT_EQ(heap.free(whole), 1);
    blocks = take_until_full(heap, 40);
    blocks.resize(1000);
    free_all(heap, blocks);
    EXPECT_NE(heap.take(400), nullptr);
    EXPECT_EQ(sound(heap.handle).quick_blocks, 0U);
}

TEST(Heap, SmallBlocksSetAsideStayWithinBounds) {
    const Heap heap(0);
    const std::vector<void*> held = take_many(heap, 500, 1000);
    std::vector<void*> blocks = take_many(heap, 40, 100'000);
    blocks.resize(blocks.size() / 2);
    free_all(heap, blocks);
    EXPECT_GT(sound(heap.handle).quick_blocks, 0U);
    EXPECT_LE(sound(heap.handle).quick_blocks * 48, 256 * KIB);
    // Among those, the ones of other sizes find their place.
    free_all(heap, held);
    sound(heap.handle);
    HeapCompact(heap.handle, 0);
    EXPECT_EQ(sound(heap.handle).quick_blocks, 0U);
}

// Blocks set aside lie in every region here, and must not keep any from going back.
TEST(Heap, RegionsGoBackThoughOnlySmallBlocksWereFreed) {
    const Heap heap(0);
    std::vector<void*> blocks = take_many(heap, 480, 200'000);
    EXPECT_GT(sound(heap.handle).mapped, 90 * MIB);
    std::shuffle(blocks.begin(), blocks.end(), std::mt19937(2));
    free_all(heap, blocks);
    EXPECT_LE(sound(heap.handle).mapped, 32 * MIB);
    // A large block of a limited heap drives out regions whose blocks are all set aside.
    const Heap limited(66 * MIB);
    blocks = take_many(limited, 480, 60'000);
    free_all(limited, blocks);
    EXPECT_GT(sound(limited.handle).quick_blocks, 0U);
    EXPECT_NE(limited.take(66 * MIB - 8 * KIB), nullptr);
    sound(limited.handle);
}

TEST(Heap, GrowsInPlaceIntoAFreeNeighbour) {
    const Heap heap(0);
    void* block = heap.take(1000);
    EXPECT_EQ(heap.resize(block, 30000), block);
    EXPECT_EQ(heap.resize(block, 10), block);
    void* next = heap.take(10);
    EXPECT_LT(static_cast<char*>(next), static_cast<char*>(block) + 100) << "the cut end is free again";
    EXPECT_NE(heap.resize(block, 1000), block);
}

#ifdef BASALT_ADDRESS_SANITIZER
TEST(Heap, TheSanitizerWatchesOverrunsAndUsesAfterFree) {
    const Heap heap(0);
    for (const std::size_t size : {std::size_t{0}, std::size_t{13}, std::size_t{2048}, 2 * MIB}) {
        SCOPED_TRACE(size);
        auto* block = static_cast<char*>(heap.take(size));
        EXPECT_EQ(__asan_region_is_poisoned(block, size), nullptr);
        for (const char* outside : {block - 8, block - 1, block + size, block + size + 15}) {
            EXPECT_TRUE(__asan_address_is_poisoned(outside));
        }
        block = static_cast<char*>(heap.resize(block, size + 100));
        EXPECT_EQ(__asan_region_is_poisoned(block, size + 100), nullptr);
        EXPECT_TRUE(__asan_address_is_poisoned(block + size + 100));
        block = static_cast<char*>(heap.resize(block, 7));
        EXPECT_TRUE(__asan_address_is_poisoned(block + 7));
        heap.free(block);
        EXPECT_TRUE(size >= MIB || __asan_address_is_poisoned(block));
    }
}

// The leak check at the program's end fails when this block counts as lost.
TEST(Heap, WhatItsBlocksPointToIsNoLeak) {
    static const HANDLE kept = HeapCreate(0, 0, 0);
    *static_cast<char**>(HeapAlloc(kept, 0, 8)) = new char[777];
}
#endif

}  // namespace
