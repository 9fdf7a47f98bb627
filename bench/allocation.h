// What the benchmarks of heaps and blocks share: malloc and pools as peers, and the time of a phase.
#ifndef BASALT_BENCH_ALLOCATION_H
#define BASALT_BENCH_ALLOCATION_H

#include <benchmark/benchmark.h>
#include <malloc.h>

#include <condition_variable>
#include <cstddef>
#include <cstdlib>
#include <ctime>
#include <memory_resource>
#include <mutex>
#include <stop_token>
#include <thread>

namespace bench {

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

// Seconds of processor time of an action; the other thread sleeps. Wall time would include other processes,
// which short phases do not average out.
template <class Action>
double timed(Action action) {
    const std::clock_t start = std::clock();
    action();
    return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

// Runs all benchmarks beside a sleeping thread: the C library takes no locks in single-threaded programs.
inline void run_with_a_second_thread(int argc, char** argv) {
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

}  // namespace bench

#endif
