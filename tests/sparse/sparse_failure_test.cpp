// Every allocation of every operation is made to fail in turn; the array must be as it was and go on working.
#include <gtest/gtest.h>

#include <functional>
#include <new>

#include "basalt/platform/error.h"
#include "src/platform/heap.h"
#include "tests/sparse/array_inspection.h"
#include "tests/sparse/visit_recorder.h"
#include "tests/support/failing_new.h"

namespace {

// The shared heap's calls pass through here (the linker wraps the symbol).
thread_local long heap_calls_until_failure = 0;

}  // namespace

extern "C" {
void* __real__Z9HeapAllocPvjm(HANDLE heap, DWORD flags, std::size_t size);
void* __wrap__Z9HeapAllocPvjm(HANDLE heap, DWORD flags, std::size_t size) {
    if (heap_calls_until_failure > 0 && --heap_calls_until_failure == 0) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return nullptr;
    }
    return __real__Z9HeapAllocPvjm(heap, flags, size);
}
}

namespace vex_util::testing {
namespace {

struct Snapshot {
    explicit Snapshot(Sparse2DArray& array)
        : all(visit_all(array)), selected(visit_selected(array)), dirty(array.IsSelectionDirty()) {}
    bool operator==(const Snapshot&) const = default;

    std::vector<Visited> all;
    std::vector<Visited> selected;
    bool dirty;
};

// Enough blocks that one more splits nodes up to the root and grows the block table and every list.
Sparse2DArray& fill(Sparse2DArray& array, int blocks) {
    for (int i = 0; i < blocks; ++i) {
        insert_value(array, 4 * (i % 7), 4 * (i / 7), static_cast<std::uint64_t>(i));
    }
    select(array, 0, 0, 12, 12);
    array.Remove(4, 0);
    return array;
}

enum class Source { ProcessHeap, SharedHeap };

// Runs the operation on like arrays with the n-th allocation failing, n = 1, 2, ... until it succeeds, and
// answers how often it failed.
int fail_in_turn(Source source, int blocks, const std::function<void(Sparse2DArray&)>& operation) {
    for (int n = 1;; ++n) {
        Sparse2DArray array(8, 4, 3);
        fill(array, blocks);
        const Snapshot before(array);
        bool failed = false;
        bool fired = false;
        {
            const bool shared = source == Source::SharedHeap;
            const FailAllocation failure(shared ? 0 : n);
            heap_calls_until_failure = shared ? n : 0;
            try {
                operation(array);
            } catch (const std::bad_alloc&) {
                failed = true;
            }
            fired = shared ? heap_calls_until_failure == 0 : failure.fired();
            heap_calls_until_failure = 0;
        }
        check_invariants(array);
        EXPECT_EQ(failed, fired) << "at allocation " << n;
        if (!failed) {
            return n - 1;
        }
        EXPECT_EQ(Snapshot(array), before) << "at allocation " << n;
        operation(array);
        check_invariants(array);
    }
}

class FailingOperation : public ::testing::TestWithParam<int> {
protected:
    void SetUp() override {
        previous = basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    }
    void TearDown() override { basalt::platform::SetDebugOutputHandler(previous); }
    basalt::platform::DebugOutputHandler previous = nullptr;
};

TEST_P(FailingOperation, LeavesTheArrayAsItWas) {
    const int blocks = GetParam();
    Sparse2DArray other(8, 4, 3);
    fill(other, blocks + 3);
    insert_value(other, -100, -100, 5);

    const auto insert_new_block = [](Sparse2DArray& array) { insert_value(array, 1000, 1000, 1); };
    const auto assign = [&](Sparse2DArray& array) { array = other; };
    const auto copy = [](Sparse2DArray& array) { const Sparse2DArray copied(array); };
    const auto select_more = [](Sparse2DArray& array) { select(array, -100, -100, 1000, 1000); };
    const auto insert_in_block = [](Sparse2DArray& array) {
        // Three to a chunk: one of these takes a new one.
        for (int x = 0; x < 3; ++x) {
            if (array.Find(x, 1) == nullptr) {
                insert_value(array, x, 1, 1);
                return;
            }
        }
    };

    EXPECT_GE(fail_in_turn(Source::ProcessHeap, blocks, assign), 5);
    fail_in_turn(Source::ProcessHeap, blocks, insert_new_block);
    fail_in_turn(Source::ProcessHeap, blocks, select_more);
    fail_in_turn(Source::ProcessHeap, blocks, insert_in_block);
    EXPECT_GE(fail_in_turn(Source::SharedHeap, blocks, assign), blocks / 3);
    EXPECT_GE(fail_in_turn(Source::SharedHeap, blocks, copy), blocks / 3);
    fail_in_turn(Source::SharedHeap, blocks, insert_new_block);
    // A failed copy is nobody's to destroy.
    const long before = live_allocations();
    EXPECT_GE(fail_in_turn(Source::ProcessHeap, blocks, copy), 5);
    EXPECT_EQ(live_allocations(), before);
}

// 8 to 9 and 73 to 74 blocks split the tree's root, 16 and 64 fill the block table, 3 and 48 the chunks; for
// more than 76 the tree takes memory while blocks are copied.
INSTANTIATE_TEST_SUITE_P(Sizes, FailingOperation, ::testing::Values(1, 3, 8, 16, 30, 48, 64, 73, 90));

TEST(FailingOperation, ConstructionAndClearing) {
    {
        const FailAllocation failure(1);
        EXPECT_THROW(Sparse2DArray(8, 4, 3), std::bad_alloc);
    }
    Sparse2DArray array(8, 4, 3);
    fill(array, 40);
    {
        const FailAllocation failure(1, true);
        array.RemoveAll();
        EXPECT_FALSE(failure.fired());
    }
    check_invariants(array);
}

}  // namespace
}  // namespace vex_util::testing
