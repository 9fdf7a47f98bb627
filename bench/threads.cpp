// Two threads on two arrays and on one, beside a hash map under a lock. Times are wall time per operation
// of all threads: without contention, two threads take half the time of one.
#include <benchmark/benchmark.h>

#include <array>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <utility>

#include "basalt/sparse.h"

#if __has_include(<absl/container/flat_hash_map.h>)
#define HAVE_ABSEIL 1
#include <absl/container/flat_hash_map.h>
#endif

namespace {

using Record = std::array<double, 4>;

constexpr int SIDE = 256;  // cells of a thread's square

class Basalt {
public:
    void insert(int x, int y, const Record& record) { m_array.Insert(x, y, record.data()); }
    double find(int x, int y) { return static_cast<const double*>(m_array.Find(x, y))[0]; }

private:
    vex_util::Sparse2DArray m_array{sizeof(Record), 16, 64};
};

#ifdef HAVE_ABSEIL
class FlatMap {
public:
    void insert(int x, int y, const Record& record) {
        const std::lock_guard guard(m_mutex);
        m_map.try_emplace({x, y}, record);
    }
    double find(int x, int y) {
        const std::lock_guard guard(m_mutex);
        return m_map.find({x, y})->second[0];
    }

private:
    std::mutex m_mutex;
    absl::flat_hash_map<std::pair<int, int>, Record> m_map;
};
#endif

// Each thread looks up its own square, cell by cell, in its own array or in one for both.
template <class Store, bool SHARED>
void find(benchmark::State& state) {
    static std::array<std::unique_ptr<Store>, 2> s_stores;
    const int thread = state.thread_index();
    const auto fill = [](Store& store, int square) {
        for (int y = 0; y < SIDE; ++y) {
            for (int x = 0; x < SIDE; ++x) {
                store.insert(x + square * SIDE, y, {1.0, 0.0, 0.0, 0.0});
            }
        }
    };
    if (thread == 0) {
        for (int square = 0; square < 2; ++square) {
            auto& store = s_stores[SHARED ? 0 : static_cast<std::size_t>(square)];
            if (!SHARED || square == 0) {
                store = std::make_unique<Store>();
            }
            fill(*store, square);
        }
    }
    double sum = 0;
    std::int64_t found = 0;
    std::uint32_t at = 0;
    Store* store = nullptr;  // threads start together, once the first has filled the arrays
    for ([[maybe_unused]] auto _ : state) {
        if (store == nullptr) {
            store = s_stores[SHARED ? 0 : static_cast<std::size_t>(thread)].get();
        }
        sum += store->find(static_cast<int>(at % SIDE) + thread * SIDE, static_cast<int>(at / SIDE % SIDE));
        ++at;
        ++found;
    }
    if (sum != static_cast<double>(found)) {
        state.SkipWithError("cells are missing");
    }
}

template <class Store>
void rows(const char* who) {
    const auto add = [who](const char* name, void (*work)(benchmark::State&), int threads) {
        benchmark::RegisterBenchmark((std::string(name) + "/" + who).c_str(), work)
            ->Threads(threads)
            ->UseRealTime();
    };
    add("find_one_thread", find<Store, false>, 1);
    add("find_two_threads_two_arrays", find<Store, false>, 2);
    add("find_two_threads_one_array", find<Store, true>, 2);
}

}  // namespace

int main(int argc, char** argv) {
    rows<Basalt>("basalt");
#ifdef HAVE_ABSEIL
    rows<FlatMap>("absl_locked");
#endif
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
