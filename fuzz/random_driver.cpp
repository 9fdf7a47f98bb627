// Runs a fuzz target as a plain test: on the files it is given, then on random inputs for a number of
// seconds.
//
// Usage: fuzz_<target> [seconds] [first seed] [file ...]
// Each random input has a seed of its own, printed when the target aborts; given as the first seed with 0
// seconds it runs that input alone.
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>
#include <random>
#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

using Bytes = std::vector<std::uint8_t>;

char g_running[64];  // what runs now, for the handler

void print_running(int signal) {
    (void)!write(STDERR_FILENO, g_running, std::strlen(g_running));
    (void)std::signal(signal, SIG_DFL);
    (void)std::raise(signal);
}

// Uniform bytes, bytes below a drawn limit, or a kept input with some bytes replaced.
Bytes random_input(std::uint64_t seed, const std::vector<Bytes>& kept) {
    std::mt19937_64 random(seed);
    const auto below = [&random](std::uint64_t limit) { return random() % limit; };
    Bytes input;
    if (!kept.empty() && below(2) == 0) {
        input = kept[below(kept.size())];
        for (std::uint64_t changes = below(8); changes > 0 && !input.empty(); --changes) {
            input[below(input.size())] = static_cast<std::uint8_t>(below(256));
        }
    } else {
        input.resize(below(below(4) == 0 ? 2000 : 200));
        const std::uint64_t limit = below(2) == 0 ? 256 : 1 + below(256);
        for (std::uint8_t& byte : input) {
            byte = static_cast<std::uint8_t>(below(limit));
        }
    }
    return input;
}

void run(const Bytes& input) {
    alarm(60);  // an input that hangs is a failure
    LLVMFuzzerTestOneInput(input.data(), input.size());
}

}  // namespace

int main(int argc, char** argv) {
    using Clock = std::chrono::steady_clock;
    const int seconds = argc > 1 ? std::atoi(argv[1]) : 1;
    std::uint64_t seed = argc > 2 ? std::strtoull(argv[2], nullptr, 10) : 1;
    for (const int signal : {SIGABRT, SIGSEGV, SIGFPE, SIGBUS, SIGALRM}) {
        (void)std::signal(signal, print_running);
    }
    std::vector<Bytes> kept;
    for (int i = 3; i < argc; ++i) {
        std::ifstream file(argv[i], std::ios::binary);
        kept.emplace_back(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
        std::snprintf(g_running, sizeof g_running, "input: file %d of the arguments\n", i - 2);
        run(kept.back());
    }
    const Clock::time_point end = Clock::now() + std::chrono::seconds(seconds);
    std::uint64_t count = 0;
    do {
        std::snprintf(g_running, sizeof g_running, "input: seed %llu\n",
                      static_cast<unsigned long long>(seed));
        const Bytes input = random_input(seed, kept);
        run(input);
        ++seed;
        ++count;
    } while (Clock::now() < end);
    std::printf("%llu inputs\n", static_cast<unsigned long long>(count));
    return 0;
}
