// What a program pays before its first call: the library opened and called once, each time in a process of
// its own, beside other libraries opened in the same way.
#include <benchmark/benchmark.h>
#include <dlfcn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <string>

namespace {

using Clock = std::chrono::steady_clock;

/// Seconds from before the library is opened until `first_call` of its function has returned; below 0
/// when the library or its function is not there.
template <typename FirstCall>
double open_and_call(const char* library, const char* function, const FirstCall& first_call) {
    const auto start = Clock::now();
    void* const handle = dlopen(library, RTLD_NOW | RTLD_LOCAL);
    void* const address = handle != nullptr ? dlsym(handle, function) : nullptr;
    if (address == nullptr) {
        return -1;
    }
    first_call(address);
    return std::chrono::duration<double>(Clock::now() - start).count();
}

/// The same in a child, which has nothing of the library yet.
template <typename FirstCall>
double in_a_child(const char* library, const char* function, const FirstCall& first_call) {
    int ends[2];
    if (pipe(ends) != 0) {
        return -1;
    }
    const pid_t child = fork();
    if (child == 0) {
        const double seconds = open_and_call(library, function, first_call);
        _exit(write(ends[1], &seconds, sizeof seconds) == sizeof seconds ? 0 : 1);
    }
    double seconds = -1;
    close(ends[1]);
    if (child < 0 || read(ends[0], &seconds, sizeof seconds) != sizeof seconds) {
        seconds = -1;
    }
    close(ends[0]);
    if (child > 0) {
        waitpid(child, nullptr, 0);
    }
    return seconds;
}

/// No row for a peer that is not installed.
template <typename FirstCall>
void row(const char* who, const char* library, const char* function, const FirstCall& first_call) {
    const bool ours = std::string(who) == "basalt";
    if (!ours && in_a_child(library, function, first_call) < 0) {
        return;
    }
    benchmark::RegisterBenchmark((std::string("open_and_call_once/") + who).c_str(),
                                 [=](benchmark::State& state) {
                                     for ([[maybe_unused]] auto _ : state) {
                                         const double seconds = in_a_child(library, function, first_call);
                                         if (seconds < 0) {
                                             state.SkipWithError("the library is not there");
                                             return;
                                         }
                                         state.SetIterationTime(seconds);
                                     }
                                 })
        ->UseManualTime()
        ->Unit(benchmark::kMicrosecond);
}

void convert(void* function) {
    double radians = reinterpret_cast<double (*)(double)>(function)(180.0);
    benchmark::DoNotOptimize(radians);
}

void call_version(void* function) {
    const void* version = reinterpret_cast<const void* (*)()>(function)();
    benchmark::DoNotOptimize(version);
}

void touch(void* address) {
    benchmark::DoNotOptimize(address);
}

}  // namespace

int main(int argc, char** argv) {
    row("basalt", BENCH_LIBRARY, "_Z9_degtoradd", convert);
    row("geos", "libgeos_c.so.1", "GEOSversion", call_version);
    row("proj", "libproj.so.25", "proj_context_create", call_version);
    row("cairo", "libcairo.so.2", "cairo_version_string", call_version);
    row("limit_pixman_alone", "libpixman-1.so.0", "pixman_version_string", touch);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
