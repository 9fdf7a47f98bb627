#include <array>
#include <cmath>
#include <cstdio>
#include <random>

#include "basalt/geo/curves.h"
#include "bench/accuracy/accuracy.h"
#include "bench/accuracy/error_table.h"

namespace accuracy {

namespace {

/// Integral of the function from 0 to the end, by Romberg's rule.
template <typename Function>
long double integral(Function function, long double end) {
    constexpr std::size_t LEVELS = 11;
    std::array<long double, LEVELS> row = {};
    row[0] = (function(0.0L) + function(end)) * end / 2;
    long double step = end;
    for (std::size_t level = 1; level < LEVELS; ++level) {
        step /= 2;
        long double sum = 0.0L;
        for (int i = 1; i < (1 << level); i += 2) {
            sum += function(i * step);
        }
        long double coarser = row[0];
        row[0] = row[0] / 2 + sum * step;
        long double power = 1.0L;
        for (std::size_t i = 1; i <= level; ++i) {
            power *= 4.0L;
            const long double finer = row[i - 1] + (row[i - 1] - coarser) / (power - 1.0L);
            coarser = row[i];
            row[i] = finer;
        }
    }
    return row[LEVELS - 1];
}

void measure_spiral(double tolerance, const char* tolerance_text) {
    ErrorTable table({"0 to 0.1 rad", "0.1 to 0.5 rad", "0.5 to 1 rad", "1 to 2 rad", "2 to 3 rad",
                      "3 to 4 rad", "4 to 5 rad", "5 to 6 rad"},
                     {0.0, 0.1, 0.5, 1.0, 2.0, 3.0, 4.0, 5.0, 6.0}, {"position, m"});
    std::mt19937_64 engine(20261124);
    const auto random = [&engine] { return static_cast<double>(engine() >> 11) * 0x1p-53; };
    for (int i = 0; i < 8000; ++i) {
        const double length = 1.0 + 999.0 * random();
        // A quarter of the deflections are small.
        const double deflection = i % 4 == 0 ? random() * 0.5 : random() * 6.0;
        const double constant = length * length / deflection;
        double x = 0.0;
        double y = 0.0;
        geo_spiral_deltas(length, constant, tolerance, x, y);
        if (x == GEO_NULL) {
            table.add_refusal(deflection);
            continue;
        }
        const long double k = constant;
        const long double true_x = integral([k](long double s) { return std::cos(s * s / k); }, length);
        const long double true_y = integral([k](long double s) { return std::sin(s * s / k); }, length);
        table.add(deflection, {std::hypot(x - true_x, y - true_y)});
    }
    std::printf("### Transition spiral, `geo_spiral_deltas`, tolerance %s, lengths 1 to 1000 m\n",
                tolerance_text);
    table.print("deflection at its end");
}

}  // namespace

void measure_spiral() {
    measure_spiral(1e-9, "1e-9");
    measure_spiral(1e-4, "1e-4");
}

}  // namespace accuracy
