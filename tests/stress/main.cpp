// Runs one subject, or all but first_use, and prints its number of rounds and the resident memory. The thread
// sanitizer finds data races; other faults end the program, and so does memory that grows in a run of a
// minute or more. Usage: stress [SECONDS (for each subject) [SUBJECT]]
#include <malloc.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <latch>
#include <string>
#include <string_view>
#include <utility>

#include "basalt/basalt.h"
#include "tests/stress/stress.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/threads.h"

namespace basalt::stress {

long run_threads(int count, double seconds, const Round& round) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::duration<double>(seconds);
    std::atomic<long> rounds = 0;
    test::run_threads(count, [&](int thread) {
        Random random(static_cast<unsigned>(thread + 1));
        long mine = 0;  // a shared count would order the threads' rounds and hide races
        do {
            round(thread, random);
            ++mine;
        } while (std::chrono::steady_clock::now() < end);
        rounds += mine;
    });
    return rounds;
}

namespace {

using namespace vex_lib;
using namespace vex_util;

constexpr int THREADS = 8;  // of first_use

void convert_a_text() {
    wchar_t wide[8];
    _char2tchar("\xC3\xBC", wide, 7);
    require(wide[0] == 0xFC && wide[1] == 0);
}

void use_an_array() {
    Sparse2DArray array(8, 16, 64);
    require(array.Insert(1, 1, "eight by") && array.Find(1, 1) != nullptr);
}

void (*const CALLS[])() = {
    convert_a_text,
    use_an_array,
    [] { require(_operatingsystem() == 11); },
    [] { require(_handheldVersion() == 1); },
    [] { require(_checkForHighResolution() == 1.0); },
    [] { require(_languageVersion() == 15); },
    [] { require(!_tempFilePath().IsEmpty()); },
    [] { require(HiResTimer().GetElapsedS() >= 0); },
    [] { require(_currentjavatime() > 1'700'000'000'000U); },
    [] { require(VersionInfo().GetMajorVersion() == 1); },
    [] { VersionInfo().InitVersionInfo(nullptr); },
    [] { MACAddressFromMIBTable().Create(); },
    [] { vlSharedMemoryHeap::Free(vlSharedMemoryHeap::Alloc(100)); },
    [] { require(static_cast<void*>(CMemoryMap(100)) != nullptr); },
    [] { require(vlVmAllocator(4096, 4096).Alloc(4096) != nullptr); },
    [] { require(DeleteObject(CreateSolidBrush(1)) != 0); },
    [] { require(GetStockObject(BLACK_PEN) != nullptr); },
    [] { mfc::DumpBitmap(nullptr, CString(L"/nowhere/at.all")); },
    [] { require(IsHexString(StringToHexString(std::string(100, 'x')))); },
};

// What is made at its first use, by all threads at once in different orders: one try per process.
long first_use(double) {
    std::latch start(THREADS);
    test::run_threads(THREADS, [&](int thread) {
        start.arrive_and_wait();
        for (std::size_t i = 0; i < std::size(CALLS); ++i) {
            const auto pair = static_cast<std::size_t>(thread / 2);  // so that two always meet
            CALLS[(pair * 5 + i) % std::size(CALLS)]();
        }
    });
    return THREADS * std::ssize(CALLS);
}

// Resident MiB.
double resident() {
    malloc_trim(0);
    vex_lib::vlSharedMemoryHeap::Compact();
    double pages = 0;
    std::ifstream("/proc/self/statm") >> pages >> pages;
    return pages * static_cast<double>(sysconf(_SC_PAGESIZE)) / (1 << 20);
}

// In ten parts; what is held after the second is compared with what is held at the end.
void run(const char* name, long (*subject)(double), double seconds) {
    long rounds = subject(seconds / 10) + subject(seconds / 10);
    const long descriptors = test::open_descriptors();
    const double before = resident();
    for (int part = 2; part < 10; ++part) {
        rounds += subject(seconds / 10);
    }
    const double after = resident();
    std::printf("%-10s %9ld rounds, resident %.1f and %.1f MiB\n", name, rounds, before, after);
    std::fflush(stdout);
    require(test::open_descriptors() <= descriptors);
    require(seconds < 60 || after <= 1.05 * before + 1);
}

}  // namespace

}  // namespace basalt::stress

int main(int argc, char** argv) {
    using namespace basalt::stress;
    const double seconds = argc > 1 ? std::atof(argv[1]) : 1;
    const std::string_view wanted = argc > 2 ? argv[2] : "all";
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    int result = 2;  // for no subject
    const std::pair<const char*, long (*)(double)> subjects[] = {{"first_use", first_use},
                                                                 {"sparse", stress_sparse},
                                                                 {"heaps", stress_heaps},
                                                                 {"files", stress_files}};
    for (const auto& [name, subject] : subjects) {
        if (wanted == name || (wanted == "all" && subject != first_use)) {
            run(name, subject, seconds);
            result = 0;
        }
    }
    return result;
}
