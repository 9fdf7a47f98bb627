// Hexadecimal text compared with table loops, Abseil and Boost, and one log line with the C library's streams
// and spdlog. Results are compared before anything is timed.
#include <benchmark/benchmark.h>
#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "basalt/util.h"
#include "bench/plain_hex.h"
#include "tests/support/failing_new.h"

#ifdef BENCH_HAS_ABSL
#include <absl/strings/escaping.h>
#endif
#if __has_include(<boost/algorithm/hex.hpp>)
#define HAS_BOOST_HEX 1
#include <boost/algorithm/hex.hpp>
#endif

#ifdef BENCH_HAS_SPDLOG
#include <spdlog/sinks/basic_file_sink.h>
#include <spdlog/spdlog.h>
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

constexpr char LINE[] = "2021-02-01 12:00:00.250 RTK fixed, 14 satellites, age 0.8 s, HDOP 0.7, 3.1 mm";

struct CloseStream {
    void operator()(std::FILE* stream) const { std::fclose(stream); }
};
using Stream = std::unique_ptr<std::FILE, CloseStream>;

const std::filesystem::path& log_path() {
    static const std::filesystem::path path = std::filesystem::temp_directory_path() / "basalt_bench.log";
    return path;
}

// Whether the file holds the line `count` times, with or without carriage returns.
bool holds_lines(int count) {
    std::ifstream stream(log_path());
    int found = 0;
    for (std::string line; std::getline(stream, line);) {
        found += line == LINE || line == std::string(LINE) + '\r';
    }
    return found == count;
}

// Times writing one line with a writer made by `open`, which is called again for an empty file.
template <class Open>
void run(benchmark::State& state, const Open& open) {
    {
        auto writer = open();
        for (int i = 0; i < 100; ++i) {
            writer();
        }
    }
    if (!holds_lines(100)) {
        state.SkipWithError("the file does not hold the lines");
        return;
    }
    {
        auto writer = open();
        for ([[maybe_unused]] auto _ : state) {
            writer();
        }
    }
    std::filesystem::remove(log_path());
}

void log_line_basalt(benchmark::State& state) {
    const CString line = CString(LINE) + L"\n";
    bool took_memory = false;
    {
        vex_util::FileLogger log(log_path().c_str());
        const FailAllocation guard(1);
        for (int i = 0; i < 1000; ++i) {
            log.Write(line);
        }
        took_memory = guard.fired();
    }
    if (took_memory) {
        state.SkipWithError("writing a line takes memory");
        return;
    }
    run(state, [&line] {
        return
            [log = std::make_unique<vex_util::FileLogger>(log_path().c_str()), &line] { log->Write(line); };
    });
}

// The least work per line: a copy into a buffer and its share of the call that writes a full one.
class BareLog {
public:
    explicit BareLog(const std::filesystem::path& path)
        : m_file(::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_APPEND | O_CLOEXEC, 0666)) {}
    ~BareLog() {
        send();
        ::close(m_file);
    }
    BareLog(const BareLog&) = delete;
    BareLog& operator=(const BareLog&) = delete;

    void write(const std::string& line) {
        if (m_used + line.size() > sizeof m_bytes) {
            send();
        }
        std::memcpy(m_bytes + m_used, line.data(), line.size());
        m_used += line.size();
    }

private:
    void send() { benchmark::DoNotOptimize(::write(m_file, m_bytes, std::exchange(m_used, 0))); }

    int m_file;
    std::size_t m_used = 0;
    char m_bytes[8192];
};

void log_line_limit(benchmark::State& state) {
    const std::string line = std::string(LINE) + "\r\n";
    run(state,
        [&line] { return [log = std::make_unique<BareLog>(log_path()), &line] { log->write(line); }; });
}

void log_line_fputs(benchmark::State& state) {
    const std::string line = std::string(LINE) + "\r\n";
    run(state, [&line] {
        return [log = Stream(std::fopen(log_path().c_str(), "w")), &line] {
            std::fputs(line.c_str(), log.get());
        };
    });
}

void log_line_fputws(benchmark::State& state) {
    const std::wstring line = std::wstring(LINE, LINE + sizeof LINE - 1) + L"\r\n";
    run(state, [&line] {
        return [log = Stream(std::fopen(log_path().c_str(), "w")), &line] {
            std::fputws(line.c_str(), log.get());
        };
    });
}

#ifdef BENCH_HAS_SPDLOG
void log_line_spdlog(benchmark::State& state) {
    run(state, [] {
        auto sink = std::make_shared<spdlog::sinks::basic_file_sink_st>(log_path().string(), true);
        sink->set_pattern("%v");
        return [log = std::make_shared<spdlog::logger>("bench", sink)] { log->info(LINE); };
    });
}
#endif

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

// A fixed number of lines, so that every file has the same size.
void lines(benchmark::internal::Benchmark* row) {
    row->Iterations(200'000);
}

BENCHMARK(log_line_basalt)->Name("log_line/basalt")->Apply(lines);
BENCHMARK(log_line_limit)->Name("log_line/limit_memcpy_and_write")->Apply(lines);
BENCHMARK(log_line_fputs)->Name("log_line/fputs")->Apply(lines);
#ifdef BENCH_HAS_SPDLOG
BENCHMARK(log_line_spdlog)->Name("log_line/spdlog_basic_file")->Apply(lines);
#endif
BENCHMARK(log_line_fputws)->Name("log_line/fputws")->Apply(lines);

}  // namespace

BENCHMARK_MAIN();
