// Private heaps beside malloc and the standard library's pools.
#include <benchmark/benchmark.h>
#include <malloc.h>
#include <sys/mman.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <random>
#include <utility>
#include <vector>

#include "basalt/memory.h"
#include "bench/allocation.h"
#include "bench/limits.h"
#include "src/platform/heap.h"
#include "src/platform/system/lock.h"

namespace {

using bench::Malloc;
using bench::SynchronizedPool;
using bench::timed;
using bench::UnsynchronizedPool;

struct PrivateHeap {
    HANDLE heap = HeapCreate(0, 0, 0);
    ~PrivateHeap() { HeapDestroy(heap); }
    void* take(std::size_t size) const { return HeapAlloc(heap, 0, size); }
    void free(void* block, std::size_t) const { HeapFree(heap, 0, block); }
};

constexpr std::size_t CHUNK = 2048;
constexpr std::size_t LIVE_CHUNKS = 100'000;

// The sparse array's life: chunks taken one by one, each written, then all freed. The allocator is new, and
// so are the pages under malloc.
template <class Allocator>
void chunks(benchmark::State& state) {
    std::vector<void*> live(LIVE_CHUNKS);
    for (auto _ : state) {
        state.PauseTiming();
        malloc_trim(0);
        state.ResumeTiming();
        Allocator allocator;
        for (void*& chunk : live) {
            chunk = allocator.take(CHUNK);
            std::memset(chunk, 1, CHUNK);
        }
        for (void* chunk : live) {
            allocator.free(chunk, CHUNK);
        }
    }
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(LIVE_CHUNKS));
}

// Many chunks alive, one freed and one allocated in turn: the cost of the calls alone.
template <class Allocator>
void chunk_exchange(benchmark::State& state) {
    Allocator allocator;
    std::vector<void*> live(LIVE_CHUNKS);
    for (void*& chunk : live) {
        chunk = allocator.take(CHUNK);
    }
    std::mt19937 random(1);
    for (auto _ : state) {
        void*& chunk = live[random() % 64];
        allocator.free(chunk, CHUNK);
        chunk = allocator.take(CHUNK);
    }
    for (void* chunk : live) {
        allocator.free(chunk, CHUNK);
    }
}

// 16 to 512 bytes, 10,000 alive for each thread, in random order; the threads and all runs share the
// allocator, as they share malloc's; other rows have the cost of new pages.
template <class Allocator>
void small_mix(benchmark::State& state) {
    static Allocator s_alone;
    static Allocator s_together;
    Allocator& allocator = state.threads() == 1 ? s_alone : s_together;
    struct Draw {
        std::uint32_t place, size;
    };
    std::mt19937 random(static_cast<unsigned>(state.thread_index()));
    std::vector<Draw> draws(1 << 14);
    for (Draw& draw : draws) {
        draw = {static_cast<std::uint32_t>(random() % 10'000),
                static_cast<std::uint32_t>(16 + random() % 497)};
    }
    std::vector<std::pair<void*, std::size_t>> live(10'000);
    std::size_t next = 0;
    for (auto _ : state) {
        const Draw& draw = draws[next++ % draws.size()];
        auto& [block, size] = live[draw.place];
        if (block != nullptr) {
            allocator.free(block, size);
        }
        block = allocator.take(size = draw.size);
    }
    for (auto& [block, size] : live) {
        if (block != nullptr) {
            allocator.free(block, size);
        }
    }
}

constexpr std::size_t FRESH_BLOCKS = 1'000'000;
constexpr std::size_t FRESH_SIZE = 64;

// The lower bound: new pages, written one block after the other.
struct Pages {
    std::byte* first = static_cast<std::byte*>(
        mmap(nullptr, FRESH_BLOCKS* FRESH_SIZE, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0));
    std::byte* next = first;
    void* take(std::size_t size) { return std::exchange(next, next + size); }
    void drop(const std::vector<void*>&) const { munmap(first, FRESH_BLOCKS * FRESH_SIZE); }
};

struct FreshHeap {
    HANDLE heap = HeapCreate(0, 0, 0);
    void* take(std::size_t size) const { return HeapAlloc(heap, 0, size); }
    void drop(const std::vector<void*>&) const { HeapDestroy(heap); }
};

struct FreshMalloc {
    static void* take(std::size_t size) { return std::malloc(size); }
    static void drop(const std::vector<void*>& blocks) {
        for (void* block : blocks) {
            std::free(block);
        }
    }
};

// Small blocks from a new allocator, each written, or the release of all of them: time per block.
template <class Allocator, bool TIMES_DROP>
void fresh(benchmark::State& state) {
    std::vector<void*> live(FRESH_BLOCKS);
    while (state.KeepRunningBatch(FRESH_BLOCKS)) {
        malloc_trim(0);
        Allocator allocator;
        const double taking = timed([&] {
            for (void*& block : live) {
                block = allocator.take(FRESH_SIZE);
                std::memset(block, 1, FRESH_SIZE);
            }
        });
        const double dropping = timed([&] { allocator.drop(live); });
        state.SetIterationTime(TIMES_DROP ? dropping : taking);
    }
}

// A block that grows by 64 bytes at a time to 64 KiB, between other blocks: time per step.
template <class Grow>
void grow(benchmark::State& state, Grow grow_to) {
    constexpr std::size_t STEP = 64, STEPS = 1024;
    while (state.KeepRunningBatch(STEPS)) {
        grow_to(STEP, STEPS);
    }
}

void grow_heap_block(std::size_t step, std::size_t steps) {
    static const HANDLE s_heap = HeapCreate(0, 0, 0);
    void* block = HeapAlloc(s_heap, 0, step);
    for (std::size_t i = 2; i <= steps; ++i) {
        block = HeapReAlloc(s_heap, 0, block, i * step);
        benchmark::DoNotOptimize(block);
    }
    HeapFree(s_heap, 0, block);
}

void grow_malloc_block(std::size_t step, std::size_t steps) {
    void* block = std::malloc(step);
    for (std::size_t i = 2; i <= steps; ++i) {
        block = std::realloc(block, i * step);
        benchmark::DoNotOptimize(block);
    }
    std::free(block);
}

void grow_buffer(std::size_t step, std::size_t steps) {
    vex_lib::vlVmBuffer buffer(step, 0, 4096);
    for (std::size_t i = 2; i <= steps; ++i) {
        benchmark::DoNotOptimize(buffer.ReSize(i * step));
    }
}

template <class Mutex>
void lock_pair(benchmark::State& state) {
    Mutex mutex;
    for (auto _ : state) {
        const std::lock_guard guard(mutex);
        benchmark::ClobberMemory();
    }
}

void two_lock_pairs(benchmark::State& state) {
    bench::lock_pairs(state, 2);
}

#define BASALT_COMPARE(work)                                               \
    BENCHMARK_TEMPLATE(work, PrivateHeap)->Name(#work "/basalt");          \
    BENCHMARK_TEMPLATE(work, Malloc)->Name(#work "/malloc");               \
    BENCHMARK_TEMPLATE(work, UnsynchronizedPool)->Name(#work "/pmr_pool"); \
    BENCHMARK_TEMPLATE(work, SynchronizedPool)->Name(#work "/pmr_synchronized_pool")

BASALT_COMPARE(chunks);
BASALT_COMPARE(chunk_exchange);
BENCHMARK(two_lock_pairs)->Name("chunk_exchange/limit_two_lock_pairs");
BENCHMARK_TEMPLATE(small_mix, PrivateHeap)->Name("small_mix/basalt")->ThreadRange(1, 2)->UseRealTime();
BENCHMARK(two_lock_pairs)->Name("small_mix/limit_two_lock_pairs")->ThreadRange(1, 1)->UseRealTime();
BENCHMARK_TEMPLATE(small_mix, Malloc)->Name("small_mix/malloc")->ThreadRange(1, 2)->UseRealTime();
BENCHMARK_TEMPLATE(small_mix, UnsynchronizedPool)->Name("small_mix/pmr_pool")->Threads(1)->UseRealTime();
BENCHMARK_TEMPLATE(small_mix, SynchronizedPool)
    ->Name("small_mix/pmr_synchronized_pool")
    ->ThreadRange(1, 2)
    ->UseRealTime();

BENCHMARK_TEMPLATE(fresh, FreshHeap, false)->Name("fresh_64_bytes/basalt")->UseManualTime();
BENCHMARK_TEMPLATE(fresh, Pages, false)->Name("fresh_64_bytes/limit_pages")->UseManualTime();
BENCHMARK_TEMPLATE(fresh, FreshMalloc, false)->Name("fresh_64_bytes/malloc")->UseManualTime();
BENCHMARK_TEMPLATE(fresh, FreshHeap, true)->Name("drop_64_bytes/basalt")->UseManualTime();
BENCHMARK_TEMPLATE(fresh, Pages, true)->Name("drop_64_bytes/limit_pages")->UseManualTime();
BENCHMARK_TEMPLATE(fresh, FreshMalloc, true)->Name("drop_64_bytes/malloc")->UseManualTime();

BENCHMARK_CAPTURE(grow, heap, grow_heap_block)->Name("grow_heap_block/basalt");
BENCHMARK_CAPTURE(grow, malloc, grow_malloc_block)->Name("grow_heap_block/realloc");
BENCHMARK_CAPTURE(grow, buffer, grow_buffer)->Name("grow_buffer/basalt");
BENCHMARK_CAPTURE(grow, malloc, grow_malloc_block)->Name("grow_buffer/realloc");

BENCHMARK_TEMPLATE(lock_pair, basalt::platform::Lock)->Name("lock_pair/basalt");
BENCHMARK_TEMPLATE(lock_pair, std::mutex)->Name("lock_pair/std_mutex");

}  // namespace

int main(int argc, char** argv) {
    bench::run_with_a_second_thread(argc, argv);
}
