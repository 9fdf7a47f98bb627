#include "src/memory/allocators.h"

#include <gtest/gtest.h>

#include <cstring>

#include "basalt/platform/error.h"
#include "tests/support/debug_output.h"
#include "tests/support/heap_inspection.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::DebugOutput;
using basalt::test::Pieces;
using basalt::test::report_of;
using vex_lib::vlSharedMemoryHeap;
using vex_lib::vlWinHeapAllocator;

TEST(Allocators, a_report_has_three_pieces_and_keeps_the_code) {
    const DebugOutput output;
    for (const DWORD code : {ERROR_INVALID_HANDLE, DWORD{0x20001234}}) {
        SetLastError(code);
        vex_lib::ReportLastError();
        EXPECT_EQ(GetLastError(), code);
        EXPECT_EQ(output.take(), report_of(code));
    }
}

TEST(Allocators, heaps_report_each_failure_but_that_of_realloc) {
    const DebugOutput output;
    const auto expect_report = [&](DWORD code) { EXPECT_EQ(output.take(), report_of(code)); };
    vlWinHeapAllocator heap(64 * 1024);
    EXPECT_EQ(heap.Alloc(64 * 1024), nullptr);
    expect_report(ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_EQ(heap.ReAlloc(nullptr, 1UL << 60), nullptr);
    expect_report(ERROR_NOT_ENOUGH_MEMORY);
    auto* const block = static_cast<char*>(heap.Alloc(6));
    std::strcpy(block, "kept!");
    EXPECT_EQ(heap.ReAlloc(block, 64 * 1024), nullptr);
    EXPECT_STREQ(block, "kept!");
    heap.Compact(), heap.Free(nullptr), heap.Free(block);
    EXPECT_EQ(output.take(), Pieces{});
    heap.Free(block), expect_report(ERROR_INVALID_PARAMETER);
    vlWinHeapAllocator(0).Compact(), expect_report(ERROR_SUCCESS);
    vlWinHeapAllocator full(4096);
    while (full.Alloc(1) != nullptr) {
    }
    output.take(), full.Compact(), expect_report(ERROR_SUCCESS);
    EXPECT_NE(vlWinHeapAllocator((1UL << 32) + 4096).Alloc(10'000), nullptr) << "a limit of 64 bits";
}

TEST(Allocators, without_a_heap_every_call_fails_and_is_reported) {
    const DebugOutput output;
    vlWinHeapAllocator none = (basalt::test::SystemFailure(1), vlWinHeapAllocator(0));
    EXPECT_EQ(output.take(), report_of(ERROR_NOT_ENOUGH_MEMORY));
    EXPECT_EQ(none.Handle(), nullptr);
    none.Free(nullptr), none.Compact();
    EXPECT_EQ(none.Alloc(1), nullptr);
    EXPECT_EQ(output.take().size(), 9U) << "each is reported";
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    EXPECT_EQ(none.ReAlloc(&none, 1), nullptr);
    EXPECT_EQ(output.take(), Pieces{});
}

TEST(Allocators, realloc_of_null_is_the_objects_own_alloc) {
    struct Counting : vlWinHeapAllocator {
        using vlWinHeapAllocator::vlWinHeapAllocator;
        void* Alloc(std::uint64_t size) override { return ++calls, vlWinHeapAllocator::Alloc(size); }
        int calls = 0;
    } heap(0);
    EXPECT_NE(heap.ReAlloc(heap.ReAlloc(nullptr, 100), 100'000), nullptr);
    EXPECT_EQ(heap.calls, 1);
}

template <std::size_t SIZE>
struct Record : vlSharedMemoryHeap {
    char data[SIZE];
};

TEST(Allocators, the_shared_heap_holds_objects_of_derived_classes) {
    const auto live = [] {
        return basalt::platform::inspect_heap(vlSharedMemoryHeap::GetHeapHandle()).live_blocks;
    };
    const DebugOutput output;
    const std::size_t before = live();
    auto* const plain = new Record<100>;
    auto* const traced = new (__FILE__, __LINE__) Record<100>;
    EXPECT_EQ(live(), before + 2);
    delete plain;
    Record<100>::operator delete(traced, __FILE__, __LINE__);
    EXPECT_EQ(live(), before);
    vlSharedMemoryHeap::Compact();
    EXPECT_EQ(output.take(), Pieces{});
    EXPECT_EQ(new Record<1UL << 46>, nullptr) << "out of memory: null, no exception";
    EXPECT_EQ(output.take(), report_of(ERROR_NOT_ENOUGH_MEMORY));
}

}  // namespace
