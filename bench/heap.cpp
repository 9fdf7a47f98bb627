// Private heaps against malloc and the standard library's pools: the sparse array's chunks and a mix of
// small blocks. A second thread is kept alive, since the C library spares single-threaded programs its locks.
#include <benchmark/benchmark.h>

#include <condition_variable>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory_resource>
#include <mutex>
#include <random>
#include <stop_token>
#include <thread>
#include <utility>
#include <vector>

#include "src/platform/heap.h"
#include "src/platform/lock.h"

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

// The sparse array's life: chunks taken one by one, each written, then all freed. The allocator is new.
template <class Allocator>
void chunks(benchmark::State& state) {
    std::vector<void*> live(LIVE_CHUNKS);
    for (auto _ : state) {
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

// Many chunks alive, one freed and one taken in turn: what the calls themselves cost.
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

// 16 to 512 bytes, 10,000 alive, in random order.
template <class Allocator>
void small_mix(benchmark::State& state) {
    Allocator allocator;
    std::mt19937 random(2);
    std::vector<std::pair<void*, std::size_t>> live(10'000);
    for (auto& [block, size] : live) {
        block = allocator.take(size = 16 + random() % 497);
    }
    for (auto _ : state) {
        auto& [block, size] = live[random() % live.size()];
        allocator.free(block, size);
        block = allocator.take(size = 16 + random() % 497);
    }
    for (auto& [block, size] : live) {
        allocator.free(block, size);
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

#define BASALT_COMPARE(work)                                               \
    BENCHMARK_TEMPLATE(work, PrivateHeap)->Name(#work "/basalt");          \
    BENCHMARK_TEMPLATE(work, Malloc)->Name(#work "/malloc");               \
    BENCHMARK_TEMPLATE(work, UnsynchronizedPool)->Name(#work "/pmr_pool"); \
    BENCHMARK_TEMPLATE(work, SynchronizedPool)->Name(#work "/pmr_synchronized_pool")

BASALT_COMPARE(chunks);
BASALT_COMPARE(chunk_exchange);
BASALT_COMPARE(small_mix);
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
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
