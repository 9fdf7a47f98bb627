// The block allocator beside malloc and pools.
#include <benchmark/benchmark.h>
#if __has_include(<boost/pool/pool.hpp>)
#include <boost/pool/pool.hpp>
#endif

#include <algorithm>
#include <cstddef>
#include <random>
#include <vector>

#include "basalt/memory.h"
#include "bench/allocation.h"

namespace {

using bench::Malloc;
using bench::timed;
using bench::UnsynchronizedPool;

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

}  // namespace

int main(int argc, char** argv) {
    bench::run_with_a_second_thread(argc, argv);
}
