// The rectangles and windows of bench_rtree.
#ifndef BASALT_BENCH_RTREE_BLOCKS_H
#define BASALT_BENCH_RTREE_BLOCKS_H

#include <algorithm>
#include <cmath>
#include <random>
#include <vector>

namespace bench {

struct Rectangle {
    int min[2], max[2];
};

// A square of 16 x 16 blocks without gaps, in random order; the position is the identifier.
inline std::vector<Rectangle> shuffled_blocks(int count, unsigned seed = 1) {
    const int side = static_cast<int>(std::ceil(std::sqrt(count)));
    std::vector<Rectangle> blocks;
    for (int i = 0; i < count; ++i) {
        const int x = i % side * 16, y = i / side * 16;
        blocks.push_back({{x, y}, {x + 15, y + 15}});
    }
    std::shuffle(blocks.begin(), blocks.end(), std::mt19937(seed));
    return blocks;
}

// Several orders, 100,000 blocks in all: branch predictors learn a short sequence that repeats.
inline std::vector<std::vector<Rectangle>> orders_of_blocks(int count) {
    std::vector<std::vector<Rectangle>> orders;
    for (unsigned seed = 1; seed == 1 || static_cast<int>(seed) * count <= 100'000; ++seed) {
        orders.push_back(shuffled_blocks(count, seed));
    }
    return orders;
}

// Windows of `across` x `down` blocks anywhere in the square.
inline std::vector<Rectangle> windows(int count, int across, int down) {
    const int side = static_cast<int>(std::ceil(std::sqrt(count)));
    std::mt19937 random(2);
    std::vector<Rectangle> result;
    for (int i = 0; i < 1000; ++i) {
        const int x = std::uniform_int_distribution<int>(0, side - across - 1)(random) * 16;
        const int y = std::uniform_int_distribution<int>(0, side - down - 2)(random) * 16;
        result.push_back({{x + 3, y + 5}, {x + 16 * across - 4, y + 16 * down - 2}});
    }
    return result;
}

}  // namespace bench

#endif
