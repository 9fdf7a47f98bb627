// The sparse array from a thousand to a hundred million cells: time per operation, and bytes per cell of
// the whole process. A square of cells is filled row by row or in a scattered order.
#include <benchmark/benchmark.h>

#include <array>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "basalt/sparse.h"
#include "bench/resident_memory.h"

namespace {

using Record = std::array<double, 4>;
using Clock = std::chrono::steady_clock;
using vex_util::Sparse2DArray;

// The i-th of side * side cells. A stride coprime to the count reaches each cell once, far from the last.
class Order {
public:
    Order(std::uint64_t side, bool scattered) : m_side(side), m_count(side * side) {
        if (scattered) {
            m_stride = static_cast<std::uint64_t>(static_cast<double>(m_count) * 0.6180339887498949) | 1U;
            while (gcd(m_stride, m_count) != 1) {
                m_stride += 2;
            }
        }
    }
    std::uint64_t count() const { return m_count; }
    template <class Work>
    void for_each(Work work) const {
        std::uint64_t cell = 0;
        for (std::uint64_t i = 0; i < m_count; ++i) {
            work(static_cast<int>(cell % m_side), static_cast<int>(cell / m_side));
            cell += m_stride;
            cell -= cell >= m_count ? m_count : 0;
        }
    }

private:
    static std::uint64_t gcd(std::uint64_t a, std::uint64_t b) { return b == 0 ? a : gcd(b, a % b); }

    std::uint64_t m_side;
    std::uint64_t m_count;
    std::uint64_t m_stride = 1;
};

bool add_element(int, int, const void* element, const void* context) {
    *static_cast<double*>(const_cast<void*>(context)) += static_cast<const double*>(element)[2];
    return true;
}

template <class Work>
double nanoseconds(Work work) {
    const auto start = Clock::now();
    work();
    return std::chrono::duration<double, std::nano>(Clock::now() - start).count();
}

// Of one cell; bytes are the growth of the process.
struct Figures {
    double bytes, insert_ns, find_ns, visit_ns, remove_ns;
    bool complete;
};

// One pass over the life of an array, or of as many small ones side by side as a clock can measure. Weighing
// first returns unused pages to the system.
Figures life(const Order& order, bool weighed) {
    constexpr std::uint64_t LEAST_CELLS = 100'000;
    const std::uint64_t arrays = (LEAST_CELLS + order.count() - 1) / order.count();
    const auto count = static_cast<double>(arrays * order.count());
    const double before = weighed ? bench::resident_bytes() : 0;
    std::vector<std::unique_ptr<Sparse2DArray>> all;
    const auto nanoseconds_per_cell = [&](auto work) {
        return nanoseconds([&] {
                   for (const auto& array : all) {
                       work(*array);
                   }
               }) /
               count;
    };
    for (std::uint64_t i = 0; i < arrays; ++i) {
        all.push_back(std::make_unique<Sparse2DArray>(sizeof(Record), 16, 64));
    }
    Figures figures{};
    figures.insert_ns = nanoseconds_per_cell([&](Sparse2DArray& array) {
        order.for_each([&](int x, int y) {
            const Record record = {static_cast<double>(x), static_cast<double>(y), 1.0, 0.0};
            array.Insert(x, y, record.data());
        });
    });
    figures.bytes = weighed ? (bench::resident_bytes() - before) / count : 0;
    double sum = 0;
    figures.find_ns = nanoseconds_per_cell([&](Sparse2DArray& array) {
        order.for_each([&](int x, int y) { sum += static_cast<const double*>(array.Find(x, y))[2]; });
    });
    figures.visit_ns =
        nanoseconds_per_cell([&](Sparse2DArray& array) { array.IterateAll(add_element, &sum); });
    figures.complete = sum == 2 * count;
    figures.remove_ns = nanoseconds_per_cell(
        [&](Sparse2DArray& array) { order.for_each([&](int x, int y) { array.Remove(x, y); }); });
    return figures;
}

// The row's own time is the insertion's, the others are counters. In a long-lived process small arrays reuse
// pages that the heap has kept: they live twice, and times are those of the second life.
void lives(benchmark::State& state, std::uint64_t side, bool scattered) {
    constexpr std::uint64_t SMALL = 1'000'000;
    const Order order(side, scattered);
    for (auto _ : state) {
        Figures figures = life(order, true);
        state.counters["bytes_per_cell"] = figures.bytes;
        if (order.count() < SMALL) {
            figures = life(order, false);
        }
        if (!figures.complete) {
            state.SkipWithError("cells are missing");
        }
        state.counters["find_ns"] = figures.find_ns;
        state.counters["visit_ns"] = figures.visit_ns;
        state.counters["remove_ns"] = figures.remove_ns;
        state.SetIterationTime(figures.insert_ns * 1e-9);
    }
}

}  // namespace

int main(int argc, char** argv) {
    for (const bool scattered : {false, true}) {
        for (int exponent = 3; exponent <= 8; ++exponent) {
            const auto side = static_cast<std::uint64_t>(std::llround(std::pow(10.0, exponent / 2.0)));
            const std::string row =
                std::string(scattered ? "scattered" : "row by row") + ", 10^" + std::to_string(exponent);
            benchmark::RegisterBenchmark((row + " cells/basalt").c_str(),
                                         [=](benchmark::State& state) { lives(state, side, scattered); })
                ->UseManualTime()
                ->Unit(benchmark::kNanosecond)
                ->Iterations(1);
        }
    }
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
