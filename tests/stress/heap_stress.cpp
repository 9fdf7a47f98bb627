// The shared heap, a private heap with a limit and one without, and page sources. One thread allocates and
// fills a block, another checks and frees it.
#include <cstring>

#include "basalt/memory.h"
#include "src/platform/heap.h"
#include "tests/stress/stress.h"
#include "tests/support/heap_inspection.h"

namespace basalt::stress {

namespace {

using namespace vex_lib;

constexpr int THREADS = 8;
constexpr std::size_t SLOTS = 64;

std::size_t any_size(Random& random) {
    const auto size = 2 * sizeof(std::size_t) + static_cast<std::size_t>(draw(random, 400));
    const int kind = draw(random, 200);
    return kind == 0 ? size + (std::size_t{1} << 20) : kind < 10 ? size * 64 : size;
}

struct Exchange {
    void* heap;  // null: the shared heap by its own calls
    std::atomic<void*> slots[SLOTS] = {};

    // Puts a block into a slot, and frees the one that was there.
    void put(std::size_t slot, void* block) {
        if (void* const other = slots[slot].exchange(block)) {
            std::size_t size = 0;
            std::memcpy(&size, other, sizeof size);
            require(std::memcmp(static_cast<char*>(other) + size - sizeof size, &size, sizeof size) == 0);
            heap == nullptr ? vlSharedMemoryHeap::Free(other) : require(HeapFree(heap, 0, other) != 0);
        }
    }
    // Both ends of a block hold its size.
    void step(Random& random) {
        const std::size_t size = any_size(random);
        void* const block = heap == nullptr ? vlSharedMemoryHeap::Alloc(size) : HeapAlloc(heap, 0, size);
        if (block != nullptr) {
            std::memcpy(block, &size, sizeof size);
            std::memcpy(static_cast<char*>(block) + size - sizeof size, &size, sizeof size);
        }
        put(random() % SLOTS, block);
    }
    HANDLE handle() const { return heap == nullptr ? vlSharedMemoryHeap::GetHeapHandle() : heap; }
    void inspect() const { require(platform::inspect_heap(handle()).fault == nullptr); }
};

void use_page_sources() {
    constexpr unsigned long SIZE = 1 << 20, COMMIT = 0x1000, RESERVE = 0x2000, RELEASE = 0x8000;
    void* const range = vlSharedMemoryAllocator::Alloc(nullptr, SIZE, RESERVE, nullptr);
    require(range != nullptr && vlSharedMemoryAllocator::Alloc(range, SIZE, COMMIT, nullptr) == range);
    std::memset(range, 1, 4096);
    require(vlSharedMemoryAllocator::Free(range, 0, RELEASE, 0) != 0);
    unsigned long handle = 0;
    void* const view = vlMMapFileAllocator::Alloc(nullptr, SIZE, RESERVE, &handle);
    require(view != nullptr && vlMMapFileAllocator::Free(view, 0, RELEASE, handle) != 0);
}

}  // namespace

long stress_heaps(double seconds) {
    Exchange heaps[] = {{HeapCreate(0, 0, 4 << 20)}, {HeapCreate(0, 0, 0)}, {nullptr}};
    const long rounds = run_threads(THREADS, seconds, [&](int thread, Random& random) {
        for (int i = 0; i < 100; ++i) {
            heaps[i % 3].step(random);
        }
        Exchange& any = heaps[draw(random, 3)];
        thread == 0   ? any.inspect()
        : thread == 1 ? static_cast<void>(HeapCompact(any.handle(), 0))
                      : use_page_sources();
    });
    for (Exchange& exchange : heaps) {
        for (std::size_t slot = 0; slot < SLOTS; ++slot) {
            exchange.put(slot, nullptr);
        }
        exchange.inspect();
    }
    return HeapDestroy(heaps[0].heap) != 0 && HeapDestroy(heaps[1].heap) != 0 ? rounds : 0;
}

}  // namespace basalt::stress
