// The elementary functions beside the C library's, over angles up to a whole turn and directions all round: a
// call for each argument, and for two and four arguments at a time.
#include "src/geo/elementary/four.h"

#include <benchmark/benchmark.h>

#include <cmath>
#include <numbers>
#include <vector>

#include "tests/geo/plain_forms.h"

namespace {

using namespace basalt::geo;

constexpr std::size_t COUNT = 4096;

std::vector<double> drawn(std::uint64_t seed, double most) {
    plain::Random random(seed);
    std::vector<double> values(COUNT);
    for (double& value : values) {
        value = random.real(-most, most);
    }
    return values;
}

/// Times `call` at every `step`-th index; the rate is that of single results.
template <class Call>
void run(benchmark::State& state, std::size_t step, const Call& call) {
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(call(at));
        at = (at + step) % COUNT;
    }
    state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(step));
}

/// One function of the C library and of ours, at angles up to `most` radians.
template <class Call>
void angles(benchmark::State& state, const Call& call) {
    const std::vector<double> a = drawn(1, static_cast<double>(state.range(0)) / 1000.0);
    run(state, 1, [&](std::size_t i) { return call(a[i]); });
}

void sin_cos_basalt(benchmark::State& state) {
    angles(state, [](double a) { return elementary::sin_cos(a); });
}
void sin_cos_libc(benchmark::State& state) {
    angles(state, [](double a) { return elementary::SineCosine{std::sin(a), std::cos(a)}; });
}
void tan_basalt(benchmark::State& state) {
    angles(state, [](double a) { return elementary::tan(a); });
}
void tan_libc(benchmark::State& state) {
    angles(state, [](double a) { return std::tan(a); });
}

void sin_cos_two(benchmark::State& state) {
    const std::vector<double> a = drawn(1, std::numbers::pi);
    run(state, 2, [&](std::size_t i) { return elementary::sin_cos_two(a[i], a[i + 1]); });
}
void atan2_basalt(benchmark::State& state) {
    const std::vector<double> y = drawn(1, 1.0), x = drawn(2, 1.0);
    run(state, 1, [&](std::size_t i) { return elementary::atan2(y[i], x[i]); });
}
void atan2_libc(benchmark::State& state) {
    const std::vector<double> y = drawn(1, 1.0), x = drawn(2, 1.0);
    run(state, 1, [&](std::size_t i) { return std::atan2(y[i], x[i]); });
}
void atan2_two(benchmark::State& state) {
    const std::vector<double> y = drawn(1, 1.0), x = drawn(2, 1.0);
    run(state, 2, [&](std::size_t i) { return elementary::atan2_two(y[i], x[i], y[i + 1], x[i + 1]); });
}
void sizes(benchmark::internal::Benchmark* row) {
    row->ArgName("milliradians")->Arg(700)->Arg(3142)->Arg(1000000);
}

BENCHMARK(sin_cos_basalt)->Name("sin_cos/basalt")->Apply(sizes);
BENCHMARK(sin_cos_libc)->Name("sin_cos/libc")->Apply(sizes);
BENCHMARK(sin_cos_two)->Name("sin_cos_of_two/basalt");
BENCHMARK(tan_basalt)->Name("tan/basalt")->Apply(sizes);
BENCHMARK(tan_libc)->Name("tan/libc")->Apply(sizes);
BENCHMARK(atan2_basalt)->Name("atan2/basalt");
BENCHMARK(atan2_libc)->Name("atan2/libc");
BENCHMARK(atan2_two)->Name("atan2_of_two/basalt");

#if defined(__x86_64__)
[[gnu::target("avx2")]] double sin_cos_avx2(const double* angles) {
    const elementary::SineCosineFour of = elementary::sin_cos(elementary::load_four(angles));
    return of.sine[0] + of.sine[1] + of.cosine[2] + of.cosine[3];
}
void sin_cos_four(benchmark::State& state) {
    const std::vector<double> a = drawn(1, std::numbers::pi);
    run(state, 4, [&](std::size_t i) { return sin_cos_avx2(&a[i]); });
}

[[gnu::target("avx2")]] double atan2_avx2(const double* y, const double* x) {
    const elementary::Four of = elementary::atan2(elementary::load_four(y), elementary::load_four(x));
    return of[0] + of[3];
}
void atan2_four(benchmark::State& state) {
    const std::vector<double> y = drawn(1, 1.0), x = drawn(2, 1.0);
    run(state, 4, [&](std::size_t i) { return atan2_avx2(&y[i], &x[i]); });
}

BENCHMARK(sin_cos_four)->Name("sin_cos_of_four/basalt");
BENCHMARK(atan2_four)->Name("atan2_of_four/basalt");
#endif

}  // namespace

BENCHMARK_MAIN();
