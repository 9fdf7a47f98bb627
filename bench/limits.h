// What the machine allows at best: memory moved, a lock's two operations, a wait for memory.
#ifndef BENCH_LIMITS_H
#define BENCH_LIMITS_H

#include <benchmark/benchmark.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <numeric>
#include <random>
#include <vector>

namespace bench {

/// The cheapest lock: one locked operation and a store.
class SpinLock {
public:
    void lock() {
        while (m_word.exchange(1, std::memory_order_acquire) != 0) {
        }
    }
    void unlock() { m_word.store(0, std::memory_order_release); }

private:
    std::atomic<int> m_word{0};
};

/// Times `count` pairs of locking and unlocking.
inline void lock_pairs(benchmark::State& state, int count) {
    SpinLock lock;
    long guarded = 0;
    for ([[maybe_unused]] auto _ : state) {
        for (int i = 0; i < count; ++i) {
            lock.lock();
            benchmark::DoNotOptimize(++guarded);
            lock.unlock();
        }
    }
}

using Bytes32 = std::array<double, 4>;

struct Read {
    using Item = Bytes32;
    double sum = 0;
    void operator()(Item& item) { sum += item[2]; }
};
struct Write {
    using Item = Bytes32;
    double next = 0;
    void operator()(Item& item) {
        next += 1;
        item = {next, next, next, next};
    }
};
struct Clear {
    using Item = void*;
    void operator()(Item& item) { item = nullptr; }
};

/// Times the work on one item, the items in order or shuffled.
template <class Work>
void each_of(benchmark::State& state, std::vector<typename Work::Item> items, bool in_order, Work work) {
    std::vector<std::uint32_t> order(items.size());
    std::iota(order.begin(), order.end(), 0U);
    if (!in_order) {
        std::shuffle(order.begin(), order.end(), std::mt19937(5));
    }
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        work(items[order[at]]);
        benchmark::DoNotOptimize(work);
        at = at + 1 == items.size() ? 0 : at + 1;
    }
    benchmark::DoNotOptimize(items.data());
}

inline void copying(benchmark::State& state, std::size_t bytes) {
    std::vector<unsigned char> from(bytes, 1);
    std::vector<unsigned char> to(bytes, 2);
    for ([[maybe_unused]] auto _ : state) {
        std::memcpy(to.data(), from.data(), bytes);
        benchmark::ClobberMemory();
    }
}

inline void setting(benchmark::State& state, std::size_t bytes) {
    std::vector<unsigned char> to(bytes, 2);
    for ([[maybe_unused]] auto _ : state) {
        std::memset(to.data(), 3, bytes);
        benchmark::ClobberMemory();
    }
}

[[gnu::target_clones("avx2", "default"), maybe_unused]] static std::uint64_t all_bits(
    const std::vector<std::uint64_t>& words) {
    std::uint64_t all[16] = {};
    for (std::size_t i = 0; i + 16 <= words.size(); i += 16) {
        for (std::size_t k = 0; k < 16; ++k) {
            all[k] |= words[i + k];
        }
    }
    for (std::size_t k = 1; k < 16; ++k) {
        all[0] |= all[k];
    }
    return all[0];
}

/// Reading whole words, as many at once as the machine can.
inline void reading(benchmark::State& state, std::size_t bytes) {
    const std::vector<std::uint64_t> words(bytes / sizeof(std::uint64_t), 3);
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(all_bits(words));
        benchmark::ClobberMemory();
    }
}

}  // namespace bench

#endif
