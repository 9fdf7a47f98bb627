// The sparse array beside a locked flat hash map and a sparse volume. Times are per element unless the row
// says otherwise; every peer's contents are compared with ours before anything is timed.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <memory>
#include <mutex>
#include <random>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#if __has_include(<absl/container/flat_hash_map.h>)
#define HAVE_ABSEIL 1
#include <absl/container/flat_hash_map.h>
#endif
#if __has_include(<openvdb/openvdb.h>)
#define HAVE_OPENVDB 1
#include <openvdb/openvdb.h>
#endif

#include "basalt/sparse.h"
#include "bench/limits.h"
#include "bench/resident_memory.h"
#include "src/sparse/lock.h"

namespace {

using Clock = std::chrono::steady_clock;
using Cell = std::pair<int, int>;
using Record = std::array<double, 4>;

Record record_of(int x, int y) {
    return {static_cast<double>(x), static_cast<double>(y), x + 0.5 * y, 1.0};
}

struct Basalt {
    static constexpr const char* NAME = "basalt";
    void insert(int x, int y, const Record& r) { array.Insert(x, y, r.data()); }
    double find(int x, int y) {
        const void* const element = array.Find(x, y);
        return element == nullptr ? 0 : static_cast<const double*>(element)[2];
    }
    bool remove(int x, int y) { return array.Remove(x, y); }
    template <class Sum>
    static bool add(int, int, const void* element, const void* context) {
        *static_cast<Sum*>(const_cast<void*>(context)) += static_cast<const double*>(element)[2];
        return true;
    }
    double visit_all() {
        double sum = 0;
        array.IterateAll(add<double>, &sum);
        return sum;
    }
    double visit_window(int x0, int y0, int side) {
        const int min[2] = {x0, y0};
        const int max[2] = {x0 + side - 1, y0 + side - 1};
        array.Select(min, max);
        double sum = 0;
        array.IterateSelected(add<double>, &sum);
        return sum;
    }
    vex_util::Sparse2DArray array{sizeof(Record), 16, 64};
};

#ifdef HAVE_ABSEIL
// A lock around each call, since ours has one.
template <class Mutex>
struct FlatMap {
    static constexpr const char* NAME = std::is_same_v<Mutex, std::recursive_mutex> ? "absl_locked" : "absl";
    static std::uint64_t key(int x, int y) {
        return std::uint64_t{static_cast<std::uint32_t>(x)} << 32 | static_cast<std::uint32_t>(y);
    }
    void insert(int x, int y, const Record& r) {
        const std::lock_guard<Mutex> lock(mutex);
        map[key(x, y)] = r;
    }
    double find(int x, int y) {
        const std::lock_guard<Mutex> lock(mutex);
        const auto found = map.find(key(x, y));
        return found == map.end() ? 0 : found->second[2];
    }
    bool remove(int x, int y) {
        const std::lock_guard<Mutex> lock(mutex);
        return map.erase(key(x, y)) != 0;
    }
    double visit_all() {
        double sum = 0;
        for (const auto& [k, r] : map) {
            sum += r[2];
        }
        return sum;
    }
    Mutex mutex;
    absl::flat_hash_map<std::uint64_t, Record> map;
};
struct NoMutex {
    void lock() {}
    void unlock() {}
};
#endif

#ifdef HAVE_OPENVDB
// The plane folded into the volume's 8 x 8 x 8 leaves, 32 x 16 cells a leaf, so that no leaf is wasted.
struct Volume {
    static constexpr const char* NAME = "openvdb";
    using Tree = openvdb::tree::Tree4<openvdb::Vec4d, 5, 4, 3>::Type;
    static openvdb::Coord fold(int x, int y) {
        return {(x >> 5) * 8 + (x & 7), (y >> 4) * 8 + (y & 7), ((x >> 3) & 3) + 4 * ((y >> 3) & 1)};
    }
    void insert(int x, int y, const Record& r) { accessor.setValue(fold(x, y), openvdb::Vec4d(r.data())); }
    double find(int x, int y) {
        openvdb::Vec4d value;
        return accessor.probeValue(fold(x, y), value) ? value[2] : 0;
    }
    bool remove(int x, int y) {
        accessor.setValueOff(fold(x, y));
        return true;
    }
    double visit_all() {
        double sum = 0;
        for (auto value = tree.cbeginValueOn(); value; ++value) {
            sum += (*value)[2];
        }
        return sum;
    }
    double visit_window(int x0, int y0, int side) {
        double sum = 0;
        for (int by = y0 >> 4; by <= (y0 + side - 1) >> 4; ++by) {
            for (int bx = x0 >> 5; bx <= (x0 + side - 1) >> 5; ++bx) {
                if (const auto* leaf = accessor.probeConstLeaf(openvdb::Coord(bx * 8, by * 8, 0))) {
                    for (auto value = leaf->cbeginValueOn(); value; ++value) {
                        sum += (*value)[2];
                    }
                }
            }
        }
        return sum;
    }
    Tree tree{openvdb::Vec4d(0, 0, 0, 0)};
    openvdb::tree::ValueAccessor<Tree> accessor{tree};
};
#endif

std::vector<Cell> square(int side) {
    std::vector<Cell> cells;
    cells.reserve(static_cast<std::size_t>(side) * static_cast<std::size_t>(side));
    for (int y = 0; y < side; ++y) {
        for (int x = 0; x < side; ++x) {
            cells.emplace_back(x - side / 2, y - side / 2);
        }
    }
    return cells;
}

std::vector<Cell> shuffled(std::vector<Cell> cells) {
    std::shuffle(cells.begin(), cells.end(), std::mt19937_64(7));
    return cells;
}

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

template <class Store>
void add_visit_rows() {
    for (const int side : {100, 1000}) {
        const auto cells = square(side);
        const std::string size = " of " + std::to_string(cells.size());
        const auto store = std::make_shared<std::unique_ptr<Store>>(filled<Store>(cells));
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
                                     // A second thread that has lived keeps the C library from skipping its
                                     // locked instructions.
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

void add_limits(std::size_t records) {
    for (const char* work : {"insert", "find", "remove"}) {
        for (const bool in_order : {true, false}) {
            const std::string row = std::string(work) + (in_order ? " row by row" : " at random");
            benchmark::RegisterBenchmark(
                (row + "/limit_lock_pair_and_a_look").c_str(),
                [=](benchmark::State& state) { bench::locked_looks(state, records, in_order); });
        }
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
#ifdef HAVE_ABSEIL
    require_same<FlatMap<std::recursive_mutex>>(few);
    add_store<FlatMap<std::recursive_mutex>>(rows, random, tenth);
    add_store<FlatMap<NoMutex>>(rows, random, tenth);
#endif
#ifdef HAVE_OPENVDB
    openvdb::initialize();
    require_same<Volume>(few);
    add_store<Volume>(rows, random, tenth);
#endif
    add_lock_row<OurLock>("basalt");
    add_lock_row<bench::Floor>("limit_exchange_and_store");
    add_lock_row<std::recursive_mutex>("std_recursive_mutex");
    add_limits(rows.size());
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
