#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "basalt/memory.h"
#include "basalt/platform/error.h"
#include "src/memory/allocators.h"
#include "src/platform/heap.h"
#include "tests/support/debug_output.h"
#include "tests/support/heap_inspection.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::DebugOutput;
using basalt::test::Pieces;
using basalt::test::report_of;
using basalt::test::SystemFailure;
using vex_lib::vlAllocator;
using vex_lib::vlSharedMemoryHeap;
using vex_lib::vlWinHeapAllocator;

constexpr std::size_t BEYOND_MEMORY = std::size_t{1} << 60;

TEST(ReportLastError, WritesThreePiecesAndKeepsTheCode) {
    const DebugOutput output;
    for (const DWORD code : {ERROR_NOT_ENOUGH_MEMORY, ERROR_INVALID_HANDLE, DWORD{0x20001234}}) {
        SetLastError(code);
        vex_lib::ReportLastError();
        EXPECT_EQ(GetLastError(), code);
        EXPECT_EQ(output.take(), report_of(code));
    }
}

TEST(WinHeapAllocator, ReportsAsDescribed) {
    const DebugOutput output;
    vlWinHeapAllocator heap(64 * 1024);
    const Pieces no_memory = report_of(ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_EQ(heap.Alloc(64 * 1024), nullptr);
    EXPECT_EQ(output.take(), no_memory);
    EXPECT_EQ(heap.ReAlloc(nullptr, BEYOND_MEMORY), nullptr);
    EXPECT_EQ(output.take(), no_memory);

    auto* block = static_cast<char*>(heap.Alloc(6));
    std::strcpy(block, "kept!");
    EXPECT_EQ(heap.ReAlloc(block, 64 * 1024), nullptr);
    EXPECT_EQ(output.take(), Pieces{}) << "a failed ReAlloc is not reported";
    EXPECT_STREQ(block, "kept!");
    EXPECT_EQ(GetLastError(), ERROR_NOT_ENOUGH_MEMORY);

    heap.Compact();
    heap.Free(nullptr);
    heap.Free(block);
    EXPECT_EQ(output.take(), Pieces{});
    heap.Free(block);
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_PARAMETER));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER) << "whatever the handler did";
}

TEST(WinHeapAllocator, CompactWithoutAFreeBlockIsReported) {
    const DebugOutput output;
    vlWinHeapAllocator fresh(0);
    fresh.Compact();
    EXPECT_EQ(output.take(), report_of(ERROR_SUCCESS));
    vlWinHeapAllocator full(4096);
    while (full.Alloc(1) != nullptr) {
    }
    output.take();
    full.Compact();
    EXPECT_EQ(output.take(), report_of(ERROR_SUCCESS));
}

TEST(WinHeapAllocator, WithoutAHeapEveryCallFailsAndIsReported) {
    const DebugOutput output;
    {
        const auto make = [] {
            const SystemFailure failure(1);
            return vlWinHeapAllocator(0);
        };
        vlWinHeapAllocator none = make();
        EXPECT_EQ(output.take(), report_of(ERROR_NOT_ENOUGH_MEMORY));
        EXPECT_EQ(none.Handle(), nullptr);
        const Pieces invalid = report_of(ERROR_INVALID_HANDLE);
        EXPECT_EQ(none.Alloc(1), nullptr);
        EXPECT_EQ(output.take(), invalid);
        none.Free(nullptr);
        EXPECT_EQ(output.take(), invalid);
        none.Compact();
        EXPECT_EQ(output.take(), invalid);
        EXPECT_EQ(none.ReAlloc(&none, 1), nullptr);
        EXPECT_EQ(output.take(), Pieces{});
    }
    EXPECT_EQ(output.take(), Pieces{}) << "destruction reports nothing";
}

TEST(WinHeapAllocator, ReAllocOfNullIsTheObjectsOwnAlloc) {
    struct Counting : vlWinHeapAllocator {
        using vlWinHeapAllocator::vlWinHeapAllocator;
        void* Alloc(std::uint64_t size) override {
            ++calls;
            return vlWinHeapAllocator::Alloc(size);
        }
        int calls = 0;
    } heap(0);
    void* block = heap.ReAlloc(nullptr, 100);
    EXPECT_EQ(heap.calls, 1);
    block = heap.ReAlloc(block, 100000);
    EXPECT_NE(block, nullptr);
    EXPECT_EQ(heap.calls, 1);
}

TEST(WinHeapAllocator, DestructionReleasesEveryBlock) {
    const long before = basalt::test::mapped_balance();
    {
        vlWinHeapAllocator heap(0);
        for (const std::uint64_t size : {1U, 5000U, 70000U, 3U << 20}) {
            EXPECT_NE(heap.Alloc(size), nullptr);
        }
        EXPECT_GT(basalt::test::mapped_balance(), before);
    }
    EXPECT_EQ(basalt::test::mapped_balance(), before);
    // 4 GiB and a page, of which the low 32 bits would be one page.
    vlWinHeapAllocator high((1UL << 32) + 4096);
    EXPECT_NE(high.Alloc(10000), nullptr);
}

// Virtual slots as hosts compiled against them expect: two for the destructor, then the operations.
TEST(WinHeapAllocator, KeepsItsVirtualSlots) {
    const DebugOutput output;
    vlWinHeapAllocator heap(0);
    void** slots = *reinterpret_cast<void***>(&heap);
    const auto alloc = reinterpret_cast<void* (*)(void*, std::uint64_t)>(slots[2]);
    const auto free = reinterpret_cast<void (*)(void*, void*)>(slots[3]);
    const auto resize = reinterpret_cast<void* (*)(void*, void*, std::uint64_t)>(slots[4]);
    void* block = resize(&heap, alloc(&heap, 100), 200);
    ASSERT_NE(block, nullptr);
    free(&heap, block);
    EXPECT_EQ(basalt::platform::inspect_heap(heap.Handle()).live_blocks, 0U);
    EXPECT_EQ(output.take(), Pieces{});
    static_assert(!std::is_copy_constructible_v<vlWinHeapAllocator>);
    static_assert(!std::is_copy_assignable_v<vlWinHeapAllocator>);
    static_assert(sizeof(vlWinHeapAllocator) == 2 * sizeof(void*));
}

TEST(SharedMemoryHeap, HoldsObjectsOfDerivedClasses) {
    struct Record : vlSharedMemoryHeap {
        explicit Record(int& count) : made(count) { ++made; }
        int& made;
        char data[100] = {};
    };
    struct Huge : vlSharedMemoryHeap {
        char data[std::size_t{1} << 46];
    };
    const auto report = [] { return basalt::platform::inspect_heap(vlSharedMemoryHeap::GetHeapHandle()); };
    const auto live = [&] { return report().live_blocks; };
    const DebugOutput output;
    const std::size_t before = live();
    int made = 0;
    auto* plain = new Record(made);
    auto* traced = new (__FILE__, __LINE__) Record(made);
    EXPECT_EQ(live(), before + 2);
    delete plain;
    Record::operator delete(traced, __FILE__, __LINE__);
    EXPECT_EQ(live(), before);
    EXPECT_EQ(made, 2);
    EXPECT_EQ(output.take(), Pieces{});

    EXPECT_EQ(new Huge, nullptr) << "exhausted: null, no exception";
    EXPECT_EQ(output.take(), report_of(ERROR_NOT_ENOUGH_MEMORY));
    {
        const SystemFailure failure(1, SystemFailure::Then::STAYS);
        EXPECT_EQ(vlSharedMemoryHeap::Alloc(std::size_t{5} << 20), nullptr);
    }
    output.take();
    vlSharedMemoryHeap::Free(vlSharedMemoryHeap::Alloc(10));
    EXPECT_NE(report().quick_blocks, 0U);
    vlSharedMemoryHeap::Compact();
    EXPECT_EQ(report().quick_blocks, 0U) << "joined with their neighbours";
    EXPECT_EQ(output.take(), Pieces{});
}

TEST(HeapAllocator, IsMallocAndReportsNothing) {
    const DebugOutput output;
    vex_lib::vlHeapAllocator allocator;
    vlAllocator& base = allocator;
    void* block = base.Alloc(1000);
    ASSERT_NE(block, nullptr);
    std::memset(block, 1, 1000);
    std::free(block);
    base.Free(std::malloc(10));
    base.Free(nullptr);
    EXPECT_EQ(output.take(), Pieces{});
}

}  // namespace
