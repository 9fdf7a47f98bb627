// The R-tree beside those of Boost.Geometry and libspatialindex with the same split and entries per node, on
// the same blocks and windows. Results are compared before anything is timed.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>
#include <vector>

#include "bench/rtree_blocks.h"
#include "src/sparse/rtree.h"

#if __has_include(<boost/geometry/index/rtree.hpp>)
#define HAVE_BOOST 1
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wconversion"
#pragma GCC diagnostic ignored "-Wshadow"
#include <boost/geometry.hpp>
#include <boost/geometry/index/rtree.hpp>
#pragma GCC diagnostic pop
#endif

#if __has_include(<spatialindex/SpatialIndex.h>)
#define HAVE_SPATIALINDEX 1
#include "bench/rtree_spatialindex.h"
#endif

namespace {

using bench::orders_of_blocks;
using bench::Rectangle;
using bench::shuffled_blocks;
using bench::windows;
using vex_util::slRTree;

void fill(slRTree& tree, const std::vector<Rectangle>& blocks) {
    int id = 0;
    for (const Rectangle& b : blocks)
        tree.Insert(b.min, b.max, id++);
}

void insert(benchmark::State& state) {
    const auto orders = orders_of_blocks(static_cast<int>(state.range(0)));
    std::size_t next = 0;
    for (auto _ : state) {
        slRTree tree;
        fill(tree, orders[next++ % orders.size()]);
        benchmark::DoNotOptimize(tree);
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

constexpr int STORED = 100000;

const slRTree& stored() {
    static const auto tree = [] {
        auto t = std::make_unique<slRTree>();
        fill(*t, shuffled_blocks(STORED));
        return t;
    }();
    return *tree;
}

void window(benchmark::State& state) {
    const auto queries = windows(STORED, static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    const slRTree& tree = stored();
    std::vector<int> found;
    std::size_t i = 0;
    for (auto _ : state) {
        const Rectangle& q = queries[i++ % queries.size()];
        benchmark::DoNotOptimize(tree.Search(q.min, q.max, found));
    }
}

#if HAVE_BOOST
namespace bg = boost::geometry;
using Point = bg::model::point<int, 2, bg::cs::cartesian>;
using Box = bg::model::box<Point>;
using Value = std::pair<Box, int>;
using BoostTree = bg::index::rtree<Value, bg::index::quadratic<8, 4>>;

Box box(const Rectangle& b) {
    return {Point(b.min[0], b.min[1]), Point(b.max[0], b.max[1])};
}

std::vector<Value> values(const std::vector<Rectangle>& blocks) {
    std::vector<Value> result;
    for (const Rectangle& b : blocks)
        result.emplace_back(box(b), static_cast<int>(result.size()));
    return result;
}

void boost_insert(benchmark::State& state) {
    std::vector<std::vector<Value>> orders;
    for (const auto& blocks : orders_of_blocks(static_cast<int>(state.range(0))))
        orders.push_back(values(blocks));
    std::size_t next = 0;
    for (auto _ : state) {
        BoostTree tree;
        for (const Value& v : orders[next++ % orders.size()])
            tree.insert(v);
        benchmark::DoNotOptimize(tree);
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

BoostTree boost_tree(bool packed) {
    const auto all = values(shuffled_blocks(STORED));
    if (packed)
        return BoostTree(all.begin(), all.end());
    BoostTree tree;
    for (const Value& v : all)
        tree.insert(v);
    return tree;
}

struct IdWriter {
    std::vector<int>* ids;
    IdWriter& operator*() { return *this; }
    IdWriter& operator++() { return *this; }
    IdWriter operator++(int) { return *this; }
    IdWriter& operator=(const Value& v) {
        ids->push_back(v.second);
        return *this;
    }
};

void boost_search(const BoostTree& tree, const Rectangle& q, std::vector<int>& found) {
    found.clear();
    tree.query(bg::index::intersects(box(q)), IdWriter{&found});
}

void boost_window(benchmark::State& state, bool packed) {
    const auto queries = windows(STORED, static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    static std::map<bool, BoostTree> trees;
    if (!trees.contains(packed))
        trees.emplace(packed, boost_tree(packed));
    const BoostTree& tree = trees.at(packed);
    std::vector<int> found;
    std::size_t i = 0;
    for (auto _ : state) {
        boost_search(tree, queries[i++ % queries.size()], found);
        benchmark::DoNotOptimize(found.data());
    }
}

#endif

#if HAVE_SPATIALINDEX
void spatial_insert(benchmark::State& state) {
    const auto blocks = shuffled_blocks(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        bench::SpatialTree tree(blocks);
        benchmark::DoNotOptimize(tree);
    }
}

const bench::SpatialTree& spatial_stored() {
    static const bench::SpatialTree tree(shuffled_blocks(STORED));
    return tree;
}

void spatial_window(benchmark::State& state) {
    const auto queries = windows(STORED, static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    const bench::SpatialTree& tree = spatial_stored();
    std::vector<int> found;
    std::size_t i = 0;
    for (auto _ : state) {
        tree.search(queries[i++ % queries.size()], found);
        benchmark::DoNotOptimize(found.data());
    }
}
#endif

// Lower bound of a window query: the hits, already side by side, are tested and written.
void limit_window(benchmark::State& state) {
    struct Found {
        Rectangle query;
        std::vector<std::pair<Rectangle, int>> hits;
    };
    const auto blocks = shuffled_blocks(STORED);
    std::vector<Found> expected;
    std::vector<int> found;
    for (const Rectangle& q :
         windows(STORED, static_cast<int>(state.range(0)), static_cast<int>(state.range(1)))) {
        stored().Search(q.min, q.max, found);
        expected.push_back({q, {}});
        for (const int id : found) {
            expected.back().hits.emplace_back(blocks[static_cast<std::size_t>(id)], id);
        }
    }
    std::size_t i = 0;
    for (auto _ : state) {
        const auto& [q, hits] = expected[i++ % expected.size()];
        found.resize(hits.size());
        std::size_t count = 0;
        for (const auto& [b, id] : hits) {
            found[count] = id;
            count += static_cast<std::size_t>((b.min[0] <= q.max[0]) & (b.max[0] >= q.min[0]) &
                                              (b.min[1] <= q.max[1]) & (b.max[1] >= q.min[1]));
        }
        benchmark::DoNotOptimize(found.data());
        benchmark::ClobberMemory();
    }
}

// Lower bound of insertion into a growing tree: one dependent node read per level, and the entry written.
// Nodes hold 5.6 entries, as after splits at random.
void limit_insert(benchmark::State& state) {
    using vex_util::rtree::Node;
    constexpr double FILL = 5.6;
    const auto count = static_cast<std::size_t>(state.range(0));
    std::vector<Node> nodes(static_cast<std::size_t>(static_cast<double>(count) / FILL) + 1, Node{});
    for (auto _ : state) {
        for (std::size_t i = 1; i <= count; ++i) {
            const double leaves = static_cast<double>(i) / FILL;
            std::size_t at = 0;
            std::size_t next = i * 0x9E3779B97F4A7C15U;
            for (double level = 1; level < leaves;) {
                level = std::min(level * FILL, leaves);
                at = static_cast<std::size_t>(level * static_cast<double>(next >> 32) * 0x1p-32);
                next += static_cast<std::size_t>(nodes[at].count);
                next *= 0x9E3779B97F4A7C15U;
            }
            nodes[at].slot[i % 8] = static_cast<std::uint32_t>(i);
        }
        benchmark::DoNotOptimize(nodes.data());
    }
}

template <class Search>
void require_same(const char* peer, Search search) {
    for (const auto& [across, down] : {std::pair{5, 2}, {40, 25}}) {
        for (const Rectangle& q : windows(STORED, across, down)) {
            std::vector<int> ours;
            std::vector<int> theirs;
            stored().Search(q.min, q.max, ours);
            search(q, theirs);
            std::sort(ours.begin(), ours.end());
            std::sort(theirs.begin(), theirs.end());
            if (ours != theirs || ours.size() != static_cast<std::size_t>(across * down)) {
                std::fprintf(stderr, "%s disagrees: %zu and %zu hits\n", peer, ours.size(), theirs.size());
                std::exit(1);
            }
        }
    }
}

void insert_sizes(benchmark::internal::Benchmark* b) {
    b->Arg(1000)->Arg(10000)->Arg(100000)->Arg(1000000)->Unit(benchmark::kMillisecond);
}

void window_sizes(benchmark::internal::Benchmark* b) {
    b->ArgNames({"across", "down"})->Args({5, 2})->Args({40, 25});
}

// libspatialindex takes about ten seconds for a million.
[[maybe_unused]] void small_insert_sizes(benchmark::internal::Benchmark* b) {
    b->Arg(1000)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
}

BENCHMARK(insert)->Name("insert/basalt")->Apply(insert_sizes);
#if HAVE_BOOST
BENCHMARK(boost_insert)->Name("insert/boost")->Apply(insert_sizes);
#endif
BENCHMARK(window)->Name("window/basalt")->Apply(window_sizes);
#if HAVE_BOOST
BENCHMARK_CAPTURE(boost_window, inserted, false)->Name("window/boost_inserted")->Apply(window_sizes);
BENCHMARK_CAPTURE(boost_window, packed, true)->Name("window/boost_packed")->Apply(window_sizes);
#endif
#if HAVE_SPATIALINDEX
BENCHMARK(spatial_insert)->Name("insert/spatialindex")->Apply(small_insert_sizes);
BENCHMARK(spatial_window)->Name("window/spatialindex")->Apply(window_sizes);
#endif
BENCHMARK(limit_insert)->Name("insert/limit_one_node_a_level")->Apply(insert_sizes);
BENCHMARK(limit_window)->Name("window/limit_testing_the_hits")->Apply(window_sizes);

}  // namespace

int main(int argc, char** argv) {
#if HAVE_BOOST
    const BoostTree peer = boost_tree(false);
    require_same("boost", [&](const Rectangle& q, auto& found) { boost_search(peer, q, found); });
#endif
#if HAVE_SPATIALINDEX
    require_same("spatialindex", [](const Rectangle& q, auto& found) { spatial_stored().search(q, found); });
#endif
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
