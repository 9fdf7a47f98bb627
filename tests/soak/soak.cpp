// Works a site over and over for minutes and says whether anything grew: memory, descriptors, time.
// Run by scripts/soak.sh, in a folder of its own.
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <numeric>
#include <thread>
#include <vector>

#include "tests/soak/process_figures.h"
#include "tests/soak/site.h"
#include "tests/support/open_descriptors.h"

namespace {

using namespace basalt::soak;
using Clock = std::chrono::steady_clock;
using Seconds = std::chrono::duration<double>;

constexpr double GROWTH_ALLOWED = 1.01;
constexpr Seconds TICK{0.1};
constexpr int STEPS_A_TICK = 20;

// What a site took, and what was held when it had been cleared.
struct SiteFigures {
    double cpu_seconds = 0;
    std::size_t resident = 0;
    long descriptors = 0;
    std::size_t heaps = 0;  // at their largest
};

// Leaves the rest of the machine's time to others: a tick takes a tenth of a second, and longer rather than
// more than the share.
void rest(Clock::time_point begun, double share) {
    if (share < 1) {
        const Seconds busy = Clock::now() - begun;
        std::this_thread::sleep_for(std::max(TICK - busy, busy * (1 / share - 1)));
    }
}

SiteFigures work(Site& site, double share) {
    SiteFigures figures;
    const double before = cpu_seconds();
    while (!site.is_done()) {
        const Clock::time_point begun = Clock::now();
        for (int i = 0; i < STEPS_A_TICK && !site.is_done(); ++i) {
            site.step();
        }
        site.tick();
        rest(begun, share);
    }
    figures.heaps = heap_bytes();
    site.finish();
    figures.cpu_seconds = cpu_seconds() - before;
    figures.resident = resident_bytes();
    figures.descriptors = basalt::test::open_descriptors();
    return figures;
}

double mib(std::size_t bytes) {
    return static_cast<double>(bytes) / (1 << 20);
}

struct Span {
    double cpu_milliseconds = 0;  // of a site, mean
    std::size_t resident = 0;     // the most
    long descriptors = 0;         // the most
};

// A tenth of the sites, so that one that happened to be disturbed does not decide.
Span summary(const std::vector<SiteFigures>& sites, std::size_t first, std::size_t count) {
    Span span;
    for (std::size_t i = first; i < first + count; ++i) {
        span.cpu_milliseconds += 1e3 * sites[i].cpu_seconds / static_cast<double>(count);
        span.resident = std::max(span.resident, sites[i].resident);
        span.descriptors = std::max(span.descriptors, sites[i].descriptors);
    }
    return span;
}

void report_line(const char* when, const Span& span) {
    std::printf("%-12s %9.2f ms a site, resident %8.3f MiB, descriptors %ld\n", when, span.cpu_milliseconds,
                mib(span.resident), span.descriptors);
}

// The first tenth is warm-up; the next one is held against the last.
bool report(const std::vector<SiteFigures>& sites) {
    const std::size_t tenth = std::max<std::size_t>(sites.size() / 10, 1);
    const Span warm = summary(sites, std::min(tenth, sites.size() - 1), tenth);
    const Span last = summary(sites, sites.size() - tenth, tenth);
    std::size_t heaps = 0;
    for (const SiteFigures& site : sites) {
        heaps = std::max(heaps, site.heaps);
    }
    std::printf("%zu sites, heaps' high-water mark %.3f MiB\n", sites.size(), mib(heaps));
    report_line("warmed up", warm);
    report_line("at the end", last);
    const bool memory_grew =
        static_cast<double>(last.resident) > GROWTH_ALLOWED * static_cast<double>(warm.resident);
    const bool descriptors_grew = last.descriptors > warm.descriptors;
    std::printf("memory %s, descriptors %s\n", memory_grew ? "GREW" : "held",
                descriptors_grew ? "GREW" : "held");
    return !memory_grew && !descriptors_grew;
}

int soak(double minutes, double share, const char* folder) {
    const Clock::time_point end =
        Clock::now() + std::chrono::duration_cast<Clock::duration>(Seconds(60 * minutes));
    std::vector<SiteFigures> sites;
    sites.reserve(1 << 20);  // touched later, page by page: 32 bytes a site
    Site site(folder);
    while (Clock::now() < end || sites.size() < 3) {
        sites.push_back(work(site, share));
        if (sites.size() % 10 == 0) {
            report_line("so far", summary(sites, sites.size() - 10, 10));
            std::fflush(stdout);
        }
    }
    return report(sites) ? 0 : 1;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 4) {
        std::puts("usage: soak MINUTES PERCENT_OF_A_PROCESSOR FOLDER");
        return 2;
    }
    try {
        return soak(std::atof(argv[1]), std::atof(argv[2]) / 100, argv[3]);
    } catch (const std::exception& error) {
        std::printf("soak: %s\n", error.what());
        return 1;
    }
}
