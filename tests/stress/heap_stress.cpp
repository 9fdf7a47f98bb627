// The shared heap, a private heap with a limit, and page sources. Blocks go from hand to hand: one thread
// takes them, another finds them as they were left and gives them back.
#include <cstring>

#include "basalt/memory.h"
#include "tests/stress/stress.h"
#include "tests/support/heap_inspection.h"

namespace basalt::stress {

namespace {

using namespace vex_lib;

constexpr int THREADS = 8;
constexpr std::size_t SLOTS = 64;

struct Block {
    std::size_t size;
    std::size_t check;  // follows from the size, at the end of the block again
};

std::size_t check_of(std::size_t size) {
    return ~size * 31;
}

void mark(void* block, std::size_t size) {
    const Block head = {size, check_of(size)};
    std::memcpy(block, &head, sizeof head);
    std::memcpy(static_cast<char*>(block) + size - sizeof head.check, &head.check, sizeof head.check);
}

void require_marked(const void* block) {
    Block head;
    std::memcpy(&head, block, sizeof head);
    std::size_t end = 0;
    std::memcpy(&end, static_cast<const char*>(block) + head.size - sizeof end, sizeof end);
    require(head.check == check_of(head.size) && end == head.check, "a block holds what was left in it");
}

std::size_t any_size(Random& random) {
    const std::size_t size =
        sizeof(Block) + sizeof(std::size_t) + static_cast<std::size_t>(draw(random, 400));
    const int kind = draw(random, 200);
    return kind == 0 ? size + (std::size_t{1} << 20) : kind < 10 ? size * 64 : size;
}

template <class Take, class Give>
void exchange(std::atomic<void*>& slot, Random& random, Take take, Give give) {
    const std::size_t size = any_size(random);
    void* const block = take(size);
    if (block != nullptr) {
        mark(block, size);
    }
    if (void* const other = slot.exchange(block)) {
        require_marked(other);
        give(other);
    }
}

void inspect(void* heap) {
    require(basalt::platform::inspect_heap(heap).fault == nullptr, "the heap is sound");
}

void use_page_sources() {
    constexpr unsigned long SIZE = 1 << 20, COMMIT = 0x1000, RESERVE = 0x2000, RELEASE = 0x8000;
    void* const range = vlSharedMemoryAllocator::Alloc(nullptr, SIZE, RESERVE, nullptr);
    require(range != nullptr && vlSharedMemoryAllocator::Alloc(range, SIZE, COMMIT, nullptr) == range,
            "a range of its own");
    std::memset(range, 1, 4096);
    require(vlSharedMemoryAllocator::Free(range, 0, RELEASE, 0) != 0, "a range released");
    unsigned long handle = 0;
    void* const view = vlMMapFileAllocator::Alloc(nullptr, SIZE, RESERVE, &handle);
    require(view != nullptr && vlMMapFileAllocator::Free(view, 0, RELEASE, handle) != 0, "a view");
}

}  // namespace

long stress_heaps(double seconds) {
    static std::atomic<void*> shared[SLOTS];
    static std::atomic<void*> limited[SLOTS];
    vlWinHeapAllocator heap(4 << 20);
    const long rounds = run_threads(THREADS, seconds, [&](int thread, Random& random) {
        for (int i = 0; i < 100; ++i) {
            const std::size_t slot = random() % SLOTS;
            exchange(shared[slot], random, vlSharedMemoryHeap::Alloc, vlSharedMemoryHeap::Free);
            exchange(
                limited[slot], random, [&](std::size_t size) { return heap.Alloc(size); },
                [&](void* block) { heap.Free(block); });
        }
        if (thread == 0) {
            inspect(vlSharedMemoryHeap::GetHeapHandle());
            inspect(heap.Handle());
        } else if (thread == 1) {
            vlSharedMemoryHeap::Compact();
            heap.Compact();
        } else {
            use_page_sources();
        }
    });
    for (std::size_t slot = 0; slot < SLOTS; ++slot) {
        vlSharedMemoryHeap::Free(shared[slot].exchange(nullptr));
        heap.Free(limited[slot].exchange(nullptr));
    }
    inspect(heap.Handle());
    return rounds;
}

}  // namespace basalt::stress
