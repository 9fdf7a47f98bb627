// Hexadecimal text compared with table loops, Abseil and Boost. Results are compared before anything is
// timed.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstring>
#include <iterator>
#include <random>
#include <string>
#include <vector>

#include "basalt/util/hex.h"
#include "bench/plain_hex.h"

#ifdef BENCH_HAS_ABSL
#include <absl/strings/escaping.h>
#endif
#if __has_include(<boost/algorithm/hex.hpp>)
#define HAS_BOOST_HEX 1
#include <boost/algorithm/hex.hpp>
#endif

namespace {

using Bytes = std::vector<unsigned char>;

Bytes some_bytes(const benchmark::State& state) {
    std::mt19937 random(1);
    Bytes bytes(static_cast<std::size_t>(state.range(0)));
    for (unsigned char& byte : bytes) {
        byte = static_cast<unsigned char>(random());
    }
    return bytes;
}

template <class Encode>
void run_encode(benchmark::State& state, const Encode& encode) {
    const Bytes bytes = some_bytes(state);
    if (encode(bytes) != basalt::VectorToHexString(bytes)) {
        state.SkipWithError("results differ");
        return;
    }
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(encode(bytes));
    }
}

template <class Decode>
void run_decode(benchmark::State& state, const Decode& decode) {
    const Bytes bytes = some_bytes(state);
    const std::string text = basalt::VectorToHexString(bytes);
    const auto decoded = decode(text);
    if (!std::equal(bytes.begin(), bytes.end(), decoded.begin(), decoded.end(),
                    [](unsigned char a, auto b) { return a == static_cast<unsigned char>(b); })) {
        state.SkipWithError("results differ");
        return;
    }
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(decode(text));
    }
}

void hex_encode_basalt(benchmark::State& state) {
    run_encode(state, basalt::VectorToHexString);
}
void hex_encode_table_loop(benchmark::State& state) {
    run_encode(state, plain::encode_hex);
}
void hex_decode_basalt(benchmark::State& state) {
    run_decode(state, basalt::HexStringToVector);
}
void hex_decode_text_basalt(benchmark::State& state) {
    run_decode(state, basalt::HexStringToString);
}
void hex_decode_table_loop(benchmark::State& state) {
    run_decode(state, plain::decode_hex);
}
#ifdef BENCH_HAS_ABSL
void hex_encode_abseil(benchmark::State& state) {
    run_encode(state, [](const Bytes& bytes) {
        return absl::BytesToHexString({reinterpret_cast<const char*>(bytes.data()), bytes.size()});
    });
}
void hex_decode_abseil(benchmark::State& state) {
    run_decode(state, [](const std::string& text) {
        const std::string bytes = absl::HexStringToBytes(text);
        return Bytes(bytes.begin(), bytes.end());
    });
}
void hex_decode_text_abseil(benchmark::State& state) {
    run_decode(state, [](const std::string& text) { return absl::HexStringToBytes(text); });
}
#endif
#ifdef HAS_BOOST_HEX
void hex_encode_boost(benchmark::State& state) {
    run_encode(state, [](const Bytes& bytes) {
        std::string digits;
        digits.reserve(2 * bytes.size());
        boost::algorithm::hex_lower(bytes, std::back_inserter(digits));
        return digits;
    });
}
void hex_decode_boost(benchmark::State& state) {
    run_decode(state, [](const std::string& text) {
        Bytes bytes;
        bytes.reserve(text.size() / 2);
        boost::algorithm::unhex(text, std::back_inserter(bytes));
        return bytes;
    });
}
#endif

// The least that a call does: a container of zeros, and copying the input into it.
template <class Result>
void zeros_and_copies(benchmark::State& state, std::size_t result_bytes, std::size_t read_bytes) {
    const Bytes from(read_bytes, 1);
    for ([[maybe_unused]] auto _ : state) {
        Result result(result_bytes, 0);
        benchmark::DoNotOptimize(result.data());
        for (std::size_t done = 0; done < read_bytes; done += std::min(result_bytes, read_bytes - done)) {
            std::memcpy(result.data(), from.data() + done, std::min(result_bytes, read_bytes - done));
            benchmark::ClobberMemory();
        }
    }
}

void encode_limit(benchmark::State& state) {
    const auto bytes = static_cast<std::size_t>(state.range(0));
    zeros_and_copies<std::string>(state, 2 * bytes, 2 * bytes);
}

template <class Result>
void decode_limit(benchmark::State& state) {
    const auto bytes = static_cast<std::size_t>(state.range(0));
    zeros_and_copies<Result>(state, bytes, 2 * bytes);
}

void sizes(benchmark::internal::Benchmark* row) {
    row->ArgName("bytes")->Arg(6)->Arg(65536);
}

BENCHMARK(hex_encode_basalt)->Name("hex_encode/basalt")->Apply(sizes);
BENCHMARK(hex_encode_table_loop)->Name("hex_encode/table_loop")->Apply(sizes);
#ifdef BENCH_HAS_ABSL
BENCHMARK(hex_encode_abseil)->Name("hex_encode/abseil")->Apply(sizes);
#endif
#ifdef HAS_BOOST_HEX
BENCHMARK(hex_encode_boost)->Name("hex_encode/boost")->Apply(sizes);
#endif
BENCHMARK(encode_limit)->Name("hex_encode/limit_zeros_and_memcpy")->Apply(sizes);
BENCHMARK(decode_limit<Bytes>)->Name("hex_decode/limit_zeros_and_memcpy")->Apply(sizes);
BENCHMARK(decode_limit<std::string>)
    ->Name("hex_decode_text/limit_zeros_and_memcpy")
    ->ArgName("bytes")
    ->Arg(6);
// Text may not hold zeros, as 64 KiB of random bytes do.
BENCHMARK(hex_decode_text_basalt)->Name("hex_decode_text/basalt")->ArgName("bytes")->Arg(6);
#ifdef BENCH_HAS_ABSL
BENCHMARK(hex_decode_text_abseil)->Name("hex_decode_text/abseil")->ArgName("bytes")->Arg(6);
#endif
BENCHMARK(hex_decode_basalt)->Name("hex_decode/basalt")->Apply(sizes);
BENCHMARK(hex_decode_table_loop)->Name("hex_decode/table_loop")->Apply(sizes);
#ifdef BENCH_HAS_ABSL
BENCHMARK(hex_decode_abseil)->Name("hex_decode/abseil")->Apply(sizes);
#endif
#ifdef HAS_BOOST_HEX
BENCHMARK(hex_decode_boost)->Name("hex_decode/boost")->Apply(sizes);
#endif

}  // namespace

BENCHMARK_MAIN();
