// The sparse array beside a flat hash map and a sparse volume, with and without a lock. Times are per element
// unless the row says otherwise. Contents are compared before anything is timed.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <memory>
#include <mutex>
#include <random>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "bench/limits.h"
#include "bench/resident_memory.h"
#include "bench/sparse_rows.h"
#include "bench/sparse_stores.h"
#include "src/sparse/critical_section_wrapper.h"

namespace {

using Clock = std::chrono::steady_clock;
using bench::Basalt;
using bench::Cell;
using bench::record_of;
using bench::shuffled;
using bench::square;

template <class Store>
std::unique_ptr<Store> filled(const std::vector<Cell>& cells) {
    auto store = std::make_unique<Store>();
    for (const auto& [x, y] : cells) {
        store->insert(x, y, record_of(x, y));
    }
    return store;
}

template <class Store>
void require_same(const std::vector<Cell>& cells) {
    auto ours = filled<Basalt>(cells);
    auto theirs = filled<Store>(cells);
    for (const auto& [x, y] : cells) {
        if (ours->find(x, y) != theirs->find(x, y) || ours->find(x, y) != record_of(x, y)[2]) {
            std::fprintf(stderr, "%s differs at (%d, %d)\n", Store::NAME, x, y);
            std::exit(1);
        }
    }
    if (ours->visit_all() != theirs->visit_all()) {
        std::fprintf(stderr, "%s differs in a visit\n", Store::NAME);
        std::exit(1);
    }
}

void require_same_visits(int side) {
    auto ours = filled<Basalt>(square(side));
    const bench::PlainSquare plain(side);
    if (ours->visit_all() != plain.visit_all() ||
        ours->visit_window(-20, -3, 21) != plain.visit_window(-20, -3, 21)) {
        std::fprintf(stderr, "the lower bound of visits reads other records\n");
        std::exit(1);
    }
}

// Runs prepare untimed and work timed, once an iteration, and reports work's time per item.
void time_per_item(benchmark::State& state, std::size_t items,
                   const std::function<std::function<void()>()>& prepare) {
    for (auto _ : state) {
        const std::function<void()> work = prepare();
        const auto start = Clock::now();
        work();
        const std::chrono::duration<double> elapsed = Clock::now() - start;
        state.SetIterationTime(elapsed.count() / static_cast<double>(items));
    }
}

void add(const std::string& row, const char* who, std::size_t items,
         const std::function<std::function<void()>()>& prepare) {
    benchmark::RegisterBenchmark((row + "/" + who).c_str(),
                                 [=](benchmark::State& state) { time_per_item(state, items, prepare); })
        ->UseManualTime()
        ->Unit(benchmark::kNanosecond)
        ->Iterations(3);
}

template <class Store>
void add_cell_rows(const std::string& order, const std::vector<Cell>& cells) {
    const auto shared = std::make_shared<std::vector<Cell>>(cells);
    const std::size_t n = cells.size();
    add("insert " + order, Store::NAME, n, [=] {
        auto store = std::make_shared<Store>();
        return [=] {
            for (const auto& [x, y] : *shared) {
                store->insert(x, y, record_of(x, y));
            }
        };
    });
    add("find " + order, Store::NAME, n, [=] {
        std::shared_ptr<Store> store = filled<Store>(*shared);
        return [=] {
            double sum = 0;
            for (const auto& [x, y] : *shared) {
                sum += store->find(x, y);
            }
            benchmark::DoNotOptimize(sum);
        };
    });
    add("remove " + order, Store::NAME, n, [=] {
        std::shared_ptr<Store> store = filled<Store>(*shared);
        return [=] {
            for (const auto& [x, y] : *shared) {
                store->remove(x, y);
            }
        };
    });
}

// Whole rows, and many scattered cells, in one call.
void add_grid_rows(int side, const std::vector<Cell>& random) {
    using bench::GridRows;
    const std::size_t n = random.size();
    const auto shared = std::make_shared<std::vector<Cell>>(random);
    const auto filled_rows = [=] {
        auto rows = std::make_shared<GridRows>(side);
        rows->insert_all();
        return rows;
    };
    add("insert row by row", GridRows::NAME, n, [=] {
        const auto rows = std::make_shared<GridRows>(side);
        return [=] { rows->insert_all(); };
    });
    add("find row by row", GridRows::NAME, n, [=] {
        const auto rows = filled_rows();
        return [=] { benchmark::DoNotOptimize(rows->copy_all()); };
    });
    add("remove row by row", GridRows::NAME, n, [=] {
        const auto rows = filled_rows();
        return [=] { rows->remove_all(); };
    });
    add("find at random", GridRows::NAME, n, [=] {
        const auto rows = filled_rows();
        return [=] { benchmark::DoNotOptimize(rows->find_cells(*shared)); };
    });
    add("visit all of " + std::to_string(n), "basalt_spans", n, [=] {
        const auto rows = filled_rows();
        return [=] { benchmark::DoNotOptimize(rows->visit_spans()); };
    });
}

template <class Store>
void add_visit_rows() {
    for (const int side : {100, 1000}) {
        const auto cells = square(side);
        const std::string size = " of " + std::to_string(cells.size());
        const auto store = std::make_shared<std::unique_ptr<Store>>();
        if constexpr (std::is_constructible_v<Store, int>) {
            *store = std::make_unique<Store>(side);
            if constexpr (requires(Store s) { s.insert_all(); }) {
                (*store)->insert_all();
            }
        } else {
            *store = filled<Store>(cells);
        }
        add("visit all" + size, Store::NAME, cells.size(), [=] {
            return [=] {
                double sum = (*store)->visit_all();
                benchmark::DoNotOptimize(sum);
            };
        });
        if constexpr (requires(Store s) { s.visit_window(0, 0, 64); }) {
            constexpr int WINDOWS = 50;
            add("select and visit 64 x 64" + size + " (a window)", Store::NAME, WINDOWS, [=] {
                return [=] {
                    double sum = 0;
                    std::mt19937 random(3);
                    for (int i = 0; i < WINDOWS; ++i) {
                        const int room = side - 64;
                        const int x = static_cast<int>(random() % static_cast<unsigned>(room)) - side / 2;
                        const int y = static_cast<int>(random() % static_cast<unsigned>(room)) - side / 2;
                        sum += (*store)->visit_window(x, y, 64);
                    }
                    benchmark::DoNotOptimize(sum);
                };
            });
        }
    }
}

template <class Store>
void add_memory_row(const std::string& row, const std::vector<Cell>& cells) {
    const auto shared = std::make_shared<std::vector<Cell>>(cells);
    benchmark::RegisterBenchmark(
        (row + "/" + Store::NAME).c_str(),
        [=](benchmark::State& state) {
            for (auto _ : state) {
                const double before = bench::resident_bytes();
                auto store = filled<Store>(*shared);
                const double bytes = bench::resident_bytes() - before;
                state.SetIterationTime(bytes / static_cast<double>(shared->size()) * 1e-9);
            }
        })
        ->UseManualTime()
        ->Unit(benchmark::kNanosecond)
        ->Iterations(1);
}

template <class Store>
void add_store(const std::vector<Cell>& rows, const std::vector<Cell>& random,
               const std::vector<Cell>& tenth) {
    add_cell_rows<Store>("row by row", rows);
    add_cell_rows<Store>("at random", random);
    add_visit_rows<Store>();
    add_memory_row<Store>("bytes per element, full blocks (bytes, not ns)", rows);
    add_memory_row<Store>("bytes per element, one cell in ten (bytes, not ns)", tenth);
}

struct OurLock {
    void lock() { wrapper.Enter(); }
    void unlock() { wrapper.Leave(); }
    vex_util::CriticalSectionWrapper wrapper;
};

template <class Lock>
void add_lock_row(const char* who) {
    benchmark::RegisterBenchmark((std::string("lock pair, uncontended/") + who).c_str(),
                                 [](benchmark::State& state) {
                                     // The C library skips locked instructions in a process
                                     // that never had a second thread.
                                     std::thread([] {}).join();
                                     Lock lock;
                                     long guarded = 0;
                                     for (auto _ : state) {
                                         lock.lock();
                                         benchmark::DoNotOptimize(++guarded);
                                         lock.unlock();
                                     }
                                 });
}

// Lower bounds: reading or writing the record alone; for a removal, clearing the cell's pointer.
void add_limits(std::size_t records) {
    for (const bool in_order : {true, false}) {
        const std::string order = in_order ? " row by row/" : " at random/";
        const auto limit = [&](const std::string& name, auto work) {
            benchmark::RegisterBenchmark(name.c_str(), [=](benchmark::State& state) {
                bench::each_of(state, std::vector<typename decltype(work)::Item>(records), in_order, work);
            });
        };
        limit("insert" + order + "limit_writing_the_record", bench::Write{});
        limit("find" + order + "limit_reading_the_record", bench::Read{});
        limit("remove" + order + "limit_clearing_a_pointer", bench::Clear{});
    }
}

}  // namespace

int main(int argc, char** argv) {
    const std::vector<Cell> rows = square(1000);
    const std::vector<Cell> random = shuffled(rows);
    std::vector<Cell> tenth = shuffled(square(3162));
    tenth.resize(tenth.size() / 10);
    std::sort(tenth.begin(), tenth.end(), [](const Cell& a, const Cell& b) {
        return std::pair(a.second, a.first) < std::pair(b.second, b.first);
    });
    const std::vector<Cell> few(random.begin(), random.begin() + 10000);
    add_store<Basalt>(rows, random, tenth);
    bench::require_same_rows(*filled<Basalt>(square(100)), 100);
    add_grid_rows(1000, random);
    add_visit_rows<bench::GridRows>();
#ifdef HAVE_ABSEIL
    require_same<bench::FlatMap<std::recursive_mutex>>(few);
    add_store<bench::FlatMap<std::recursive_mutex>>(rows, random, tenth);
    add_store<bench::FlatMap<bench::NoMutex>>(rows, random, tenth);
#endif
#ifdef HAVE_OPENVDB
    openvdb::initialize();
    require_same<bench::Volume<std::recursive_mutex>>(few);
    add_store<bench::Volume<std::recursive_mutex>>(rows, random, tenth);
    add_store<bench::Volume<bench::NoMutex>>(rows, random, tenth);
#endif
    add_lock_row<OurLock>("basalt");
    add_lock_row<bench::SpinLock>("exchange_and_store");
    add_lock_row<std::recursive_mutex>("std_recursive_mutex");
    add_limits(rows.size());
    require_same_visits(64);
    add_visit_rows<bench::PlainSquare>();
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
