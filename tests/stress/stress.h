// Many threads at once for a while: what the headers allow to be done at the same time.
#ifndef BASALT_TESTS_STRESS_STRESS_H
#define BASALT_TESTS_STRESS_STRESS_H

#include <atomic>
#include <functional>
#include <random>

#include "fuzz/input.h"

namespace basalt::stress {

using fuzz::require;

// Source of a thread's choices: seeded with its number, so that every run draws the same.
using Random = std::mt19937;

inline int draw(Random& random, int below) {
    return static_cast<int>(random() % static_cast<unsigned>(below));
}

// Called again and again, in every thread, until the time is up.
using Round = std::function<void(int thread, Random& random)>;

// The number of rounds of all threads together.
long run_threads(int count, double seconds, const Round& round);

// Each for so many seconds; the result is its number of rounds.
long stress_sparse(double seconds), stress_heaps(double seconds), stress_files(double seconds);

}  // namespace basalt::stress

#endif
