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
using basalt::test::SystemFailure;
using vex_lib::vlSharedMemoryHeap;
using vex_lib::vlWinHeapAllocator;

TEST(Allocators, a_report_has_three_pieces_and_keeps_the_code) {
    const DebugOutput output;
    for (const DWORD code : {ERROR_NOT_ENOUGH_MEMORY, ERROR_INVALID_HANDLE, DWORD{0x20001234}}) {
        SetLastError(code);
        vex_lib::ReportLastError();
        EXPECT_EQ(GetLastError(), code);
        EXPECT_EQ(output.take(), report_of(code));
    }
}

TEST(Allocators, heaps_report_each_failure_but_that_of_realloc) {
    const DebugOutput output;
    const auto expect_report = [&](DWORD code) { EXPECT_EQ(output.take(), report_of(code)); };
    const auto expect_null = [&](const void* block, DWORD code) {
        expect_report(code);
        EXPECT_EQ(block, nullptr);
    };
    vlWinHeapAllocator heap(64 * 1024);
    expect_null(heap.Alloc(64 * 1024), ERROR_NOT_ENOUGH_MEMORY);
    expect_null(heap.ReAlloc(nullptr, std::size_t{1} << 60), ERROR_NOT_ENOUGH_MEMORY);
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
    vlWinHeapAllocator high((1UL << 32) + 4096);  // a limit of 64 bits
    EXPECT_NE(high.Alloc(10'000), nullptr);
}

TEST(Allocators, without_a_heap_every_call_fails_and_is_reported) {
    const DebugOutput output;
    const auto make = [] {
        const SystemFailure failure(1);
        return vlWinHeapAllocator(0);
    };
    vlWinHeapAllocator none = make();
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

TEST(Allocators, the_shared_heap_holds_objects_of_derived_classes) {
    struct Huge : vlSharedMemoryHeap {
        char data[std::size_t{1} << 46];
    };
    struct Record : vlSharedMemoryHeap {
        char data[100] = {};
    };
    const auto live = [] {
        return basalt::platform::inspect_heap(vlSharedMemoryHeap::GetHeapHandle()).live_blocks;
    };
    const DebugOutput output;
    const std::size_t before = live();
    auto* const plain = new Record;
    auto* const traced = new (__FILE__, __LINE__) Record;
    EXPECT_EQ(live(), before + 2);
    delete plain;
    Record::operator delete(traced, __FILE__, __LINE__);
    EXPECT_EQ(live(), before);
    vlSharedMemoryHeap::Compact();
    EXPECT_EQ(output.take(), Pieces{});
    EXPECT_EQ(new Huge, nullptr) << "out of memory: null, no exception";
    EXPECT_EQ(output.take(), report_of(ERROR_NOT_ENOUGH_MEMORY));
}

}  // namespace
