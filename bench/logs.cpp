// One line to a log, compared with the C library's streams and spdlog. The file is compared before anything
// is timed.
#include <benchmark/benchmark.h>
#include <fcntl.h>
#include <unistd.h>

#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <utility>

#include "basalt/util/file_logger.h"
#include "tests/support/failing_new.h"

#ifdef BENCH_HAS_SPDLOG
#include <spdlog/sinks/basic_file_sink.h>
#include <spdlog/spdlog.h>
#endif

namespace {

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
    std::wstring line(LINE, LINE + sizeof LINE - 1);
    line.append(L"\r\n");
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
