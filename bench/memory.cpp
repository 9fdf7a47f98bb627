// Private heaps and the block allocator against malloc and pools. A second thread is kept alive, since the C
// library takes no locks in single-threaded programs.
#include <benchmark/benchmark.h>
#include <malloc.h>
#include <sys/mman.h>
#if __has_include(<boost/pool/pool.hpp>)
#include <boost/pool/pool.hpp>
#endif

#include <algorithm>
#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <memory_resource>
#include <mutex>
#include <random>
#include <stop_token>
#include <thread>
#include <utility>
#include <vector>

#include "basalt/memory.h"
#include "bench/limits.h"
#include "src/platform/heap.h"
#include "src/platform/system/lock.h"

namespace {

struct PrivateHeap {
    HANDLE heap = HeapCreate(0, 0, 0);
    ~PrivateHeap() { HeapDestroy(heap); }
    void* take(std::size_t size) const { return HeapAlloc(heap, 0, size); }
    void free(void* block, std::size_t) const { HeapFree(heap, 0, block); }
};

struct Malloc {
    static void* take(std::size_t size) { return std::malloc(size); }
    static void free(void* block, std::size_t) { std::free(block); }
};

template <class Resource>
struct Pool {
    Resource resource;
    void* take(std::size_t size) { return resource.allocate(size); }
    void free(void* block, std::size_t size) { resource.deallocate(block, size); }
};
using UnsynchronizedPool = Pool<std::pmr::unsynchronized_pool_resource>;
using SynchronizedPool = Pool<std::pmr::synchronized_pool_resource>;

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

// Seconds of processor time of an action; the other thread sleeps. Wall time would include other processes,
// which short phases do not average out.
template <class Action>
double timed(Action action) {
    const std::clock_t start = std::clock();
    action();
    return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
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

constexpr std::size_t BLOCK = 4096;
constexpr std::size_t LIVE_BLOCKS = 100'000;

struct BlockAllocator {
    vex_lib::vlVmAllocator allocator{16 << 20, BLOCK};
    void* take(std::size_t size) { return allocator.Alloc(size); }
    void free(void* block, std::size_t) { allocator.Free(block); }
};

#if __has_include(<boost/pool/pool.hpp>)
struct BoostPool {
    boost::pool<> pool{BLOCK};
    void* take(std::size_t) { return pool.malloc(); }
    void free(void* block, std::size_t) { pool.free(block); }
};
#define BASALT_COMPARE_BOOST(...) __VA_ARGS__
#else
#define BASALT_COMPARE_BOOST(...)
#endif

enum class Order { NEWEST_FIRST, OLDEST_FIRST, RANDOM };
enum class Timed { ALLOCATE, FREE };

// Fills or empties an allocator that has been full before: time per block.
template <class Allocator, Order ORDER, Timed TIMED>
void blocks(benchmark::State& state) {
    Allocator allocator;
    std::vector<void*> live(LIVE_BLOCKS);
    std::vector<void*> freed(LIVE_BLOCKS);
    std::mt19937 random(3);
    const auto round = [&] {
        const double taking = timed([&] {
            for (void*& block : live) {
                block = allocator.take(BLOCK);
            }
        });
        freed = live;
        if (ORDER == Order::NEWEST_FIRST) {
            std::reverse(freed.begin(), freed.end());
        } else if (ORDER == Order::RANDOM) {
            std::shuffle(freed.begin(), freed.end(), random);
        }
        const double freeing = timed([&] {
            for (void* block : freed) {
                allocator.free(block, BLOCK);
            }
        });
        return TIMED == Timed::ALLOCATE ? taking : freeing;
    };
    round();
    std::sort(freed.begin(), freed.end());
    if (freed.front() == nullptr || std::adjacent_find(freed.begin(), freed.end()) != freed.end()) {
        state.SkipWithError("a block is missing, or handed out twice");
        return;
    }
    while (state.KeepRunningBatch(LIVE_BLOCKS)) {
        state.SetIterationTime(round());
    }
}

// A full allocator whose blocks are freed and allocated in random order.
template <class Allocator>
void block_churn(benchmark::State& state) {
    Allocator allocator;
    std::vector<void*> live(LIVE_BLOCKS);
    for (void*& block : live) {
        block = allocator.take(BLOCK);
    }
    std::mt19937 random(4);
    std::shuffle(live.begin(), live.end(), random);
    // All blocks of a window are freed before any is allocated, so that none is reused at once.
    constexpr std::size_t WINDOW = 10'000;
    std::size_t first = 0;
    while (state.KeepRunningBatch(WINDOW)) {
        first = (first + WINDOW) % LIVE_BLOCKS;
        for (std::size_t i = first; i < first + WINDOW; ++i) {
            allocator.free(live[i], BLOCK);
        }
        for (std::size_t i = first; i < first + WINDOW; ++i) {
            live[i] = allocator.take(BLOCK);
        }
    }
    for (void* block : live) {
        allocator.free(block, BLOCK);
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

#define BASALT_COMPARE_BLOCKS(who, Allocator)                                   \
    BENCHMARK_TEMPLATE(blocks, Allocator, Order::NEWEST_FIRST, Timed::ALLOCATE) \
        ->Name("blocks_allocate_after_newest_first/" who)                       \
        ->UseManualTime();                                                      \
    BENCHMARK_TEMPLATE(blocks, Allocator, Order::OLDEST_FIRST, Timed::ALLOCATE) \
        ->Name("blocks_allocate_after_oldest_first/" who)                       \
        ->UseManualTime();                                                      \
    BENCHMARK_TEMPLATE(blocks, Allocator, Order::NEWEST_FIRST, Timed::FREE)     \
        ->Name("blocks_free_newest_first/" who)                                 \
        ->UseManualTime();                                                      \
    BENCHMARK_TEMPLATE(blocks, Allocator, Order::OLDEST_FIRST, Timed::FREE)     \
        ->Name("blocks_free_oldest_first/" who)                                 \
        ->UseManualTime();                                                      \
    BENCHMARK_TEMPLATE(blocks, Allocator, Order::RANDOM, Timed::FREE)           \
        ->Name("blocks_free_random/" who)                                       \
        ->UseManualTime();                                                      \
    BENCHMARK_TEMPLATE(block_churn, Allocator)->Name("blocks_churn_random/" who)

BASALT_COMPARE_BLOCKS("basalt", BlockAllocator);
BASALT_COMPARE_BLOCKS("pmr_pool", UnsynchronizedPool);
BASALT_COMPARE_BLOCKS("malloc", Malloc);
BASALT_COMPARE_BOOST(BASALT_COMPARE_BLOCKS("boost_pool", BoostPool);)

BENCHMARK_TEMPLATE(lock_pair, basalt::platform::Lock)->Name("lock_pair/basalt");
BENCHMARK_TEMPLATE(lock_pair, std::mutex)->Name("lock_pair/std_mutex");

}  // namespace

int main(int argc, char** argv) {
    const std::jthread second([](const std::stop_token& stop) {
        std::mutex mutex;
        std::condition_variable_any asleep;
        std::unique_lock lock(mutex);
        asleep.wait(lock, stop, [] { return false; });
    });
    // Let the C library's heap keep its freed memory too.
    mallopt(M_TRIM_THRESHOLD, 1 << 30);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
