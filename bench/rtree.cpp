// The R-tree beside Boost.Geometry's: the same blocks, the same windows, the results compared before any
// timing.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>
#include <random>
#include <vector>

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

namespace {

using vex_util::slRTree;

struct Block {
    int min[2], max[2];
};

// A square of 16 x 16 blocks, block by block without a gap, in random order; the order is the identifier.
std::vector<Block> shuffled_blocks(int count) {
    const int side = static_cast<int>(std::ceil(std::sqrt(count)));
    std::vector<Block> blocks;
    for (int i = 0; i < count; ++i) {
        const int x = i % side * 16, y = i / side * 16;
        blocks.push_back({{x, y}, {x + 15, y + 15}});
    }
    std::shuffle(blocks.begin(), blocks.end(), std::mt19937(1));
    return blocks;
}

// Windows that meet `hits` blocks each (hits a square times the side ratio), anywhere in the square of
// blocks.
std::vector<Block> windows(int count, int across, int down) {
    const int side = static_cast<int>(std::ceil(std::sqrt(count)));
    std::mt19937 random(2);
    std::vector<Block> result;
    for (int i = 0; i < 1000; ++i) {
        const int x = std::uniform_int_distribution<int>(0, side - across - 1)(random) * 16;
        const int y = std::uniform_int_distribution<int>(0, side - down - 2)(random) * 16;
        result.push_back({{x + 3, y + 5}, {x + 16 * across - 4, y + 16 * down - 2}});
    }
    return result;
}

void fill(slRTree& tree, const std::vector<Block>& blocks) {
    int id = 0;
    for (const Block& b : blocks)
        tree.Insert(b.min, b.max, id++);
}

void insert(benchmark::State& state) {
    const auto blocks = shuffled_blocks(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        slRTree tree;
        fill(tree, blocks);
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
        const Block& q = queries[i++ % queries.size()];
        benchmark::DoNotOptimize(tree.Search(q.min, q.max, found));
    }
}

#if HAVE_BOOST
namespace bg = boost::geometry;
using Point = bg::model::point<int, 2, bg::cs::cartesian>;
using Box = bg::model::box<Point>;
using Value = std::pair<Box, int>;
using BoostTree = bg::index::rtree<Value, bg::index::quadratic<8, 4>>;

Box box(const Block& b) {
    return {Point(b.min[0], b.min[1]), Point(b.max[0], b.max[1])};
}

std::vector<Value> values(const std::vector<Block>& blocks) {
    std::vector<Value> result;
    for (const Block& b : blocks)
        result.emplace_back(box(b), static_cast<int>(result.size()));
    return result;
}

void boost_insert(benchmark::State& state) {
    const auto all = values(shuffled_blocks(static_cast<int>(state.range(0))));
    for (auto _ : state) {
        BoostTree tree;
        for (const Value& v : all)
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

void boost_search(const BoostTree& tree, const Block& q, std::vector<int>& found) {
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

void compare_results() {
    const BoostTree peer = boost_tree(false);
    for (const auto& [across, down] : {std::pair{5, 2}, {40, 25}}) {
        for (const Block& q : windows(STORED, across, down)) {
            std::vector<int> ours, theirs;
            stored().Search(q.min, q.max, ours);
            boost_search(peer, q, theirs);
            std::sort(ours.begin(), ours.end());
            std::sort(theirs.begin(), theirs.end());
            if (ours != theirs || ours.size() != static_cast<std::size_t>(across * down)) {
                std::fprintf(stderr, "the trees disagree: %zu and %zu hits\n", ours.size(), theirs.size());
                std::exit(1);
            }
        }
    }
}
#endif

void insert_sizes(benchmark::internal::Benchmark* b) {
    b->Arg(1000)->Arg(10000)->Arg(100000)->Arg(1000000)->Unit(benchmark::kMillisecond);
}

void window_sizes(benchmark::internal::Benchmark* b) {
    b->ArgNames({"across", "down"})->Args({5, 2})->Args({40, 25});
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

}  // namespace

int main(int argc, char** argv) {
#if HAVE_BOOST
    compare_results();
#endif
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
