// Runs one subject, or all but first_use, and prints how often the threads went round. A data race is the
// thread sanitizer's to find; what is wrong without one ends the program. Usage: stress [SECONDS [SUBJECT]]
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include "basalt/platform/error.h"
#include "tests/stress/stress.h"
#include "tests/support/threads.h"

namespace basalt::stress {

void require(bool holds, const char* what) {
    if (!holds) {
        std::fprintf(stderr, "stress: not so: %s\n", what);
        std::abort();
    }
}

long run_threads(int count, double seconds, const Round& round) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::duration<double>(seconds);
    std::atomic<long> rounds = 0;
    test::run_threads(count, [&](int thread) {
        Random random(static_cast<unsigned>(thread + 1));
        long mine = 0;  // what all count at once would order their rounds, and hide a race
        do {
            round(thread, random);
            ++mine;
        } while (std::chrono::steady_clock::now() < end);
        rounds += mine;
    });
    return rounds;
}

}  // namespace basalt::stress

int main(int argc, char** argv) {
    using namespace basalt::stress;
    const double seconds = argc > 1 ? std::atof(argv[1]) : 1;
    const std::string_view wanted = argc > 2 ? argv[2] : "all";
    if (wanted == "first_use") {
        std::printf("first_use %ld\n", first_use());
        return 0;
    }
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    constexpr struct {
        const char* name;
        long (*run)(double);
    } SUBJECTS[] = {{"sparse", stress_sparse},
                    {"heaps", stress_heaps},
                    {"files", stress_files},
                    {"graphics", stress_graphics}};
    bool known = false;
    for (const auto& subject : SUBJECTS) {
        if (wanted == "all" || wanted == subject.name) {
            known = true;
            std::printf("%-10s %ld rounds\n", subject.name, subject.run(seconds));
            std::fflush(stdout);
        }
    }
    return known ? 0 : 2;
}
