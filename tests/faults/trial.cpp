#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <set>

#include "basalt/memory.h"
#include "tests/faults/more_system_calls.h"
#include "tests/faults/trial.h"
#include "tests/support/heap_inspection.h"
#include "tests/support/open_descriptors.h"

namespace basalt::faults {

namespace {

constexpr unsigned SECONDS_AN_OPERATION = 120;  // then a signal ends the program: nothing may hang
constexpr int MOST_CALLS = 5000;

struct Totals {
    int operations = 0;
    int points = 0;
    int faults = 0;
};
Totals totals;

// Whether a file is one that the library makes for itself; the others are a case's own.
bool is_temporary(const std::string& name) {
    return name.starts_with("vma") || name.starts_with("~") || name.starts_with("held");
}

// What is held; two that agree say that nothing leaked in between.
struct Holdings {
    long blocks = live_allocations();
    long mapped = test::mapped_balance();
    long descriptors = test::open_descriptors();
    std::size_t shared_blocks =
        basalt::platform::inspect_heap(vex_lib::vlSharedMemoryHeap::GetHeapHandle()).live_blocks;
    std::size_t files;

    explicit Holdings(const test::ScratchFolder& folder)
        : files(static_cast<std::size_t>(std::ranges::count_if(folder.names(), is_temporary))) {}
};

// What stayed behind though nothing was made to stay; empty when nothing did. The shared heap may keep
// regions, so the first run of a case, which takes them, does not count.
std::string leak(const test::ScratchFolder& folder, const Holdings& before, long unmap_refused,
                 long files_kept) {
    const Holdings after(folder);
    if (after.blocks != before.blocks && unmap_refused == 0) {
        return "blocks: " + std::to_string(after.blocks - before.blocks) + " more";
    }
    if (after.mapped != before.mapped && unmap_refused == 0) {
        return "mapped bytes: " + std::to_string(after.mapped - before.mapped) + " more";
    }
    if (after.descriptors != before.descriptors) {
        return "descriptors: " + std::to_string(after.descriptors - before.descriptors) + " more";
    }
    if (after.shared_blocks != before.shared_blocks) {
        return "blocks of the shared heap";
    }
    if (after.files > before.files + static_cast<std::size_t>(files_kept)) {
        return "a temporary file";
    }
    return "";
}

struct Result {
    bool struck;
    std::string fault;
};

Result run_once(const Case& run, const Failure& failure, const test::ScratchFolder& folder) {
    const Holdings before(folder);
    const long unmap_before = test::refused_to_unmap();
    const long files_before = files_made_to_stay();
    Result result;
    {
        Trial trial(failure, folder);
        run(trial);
        result = {trial.was_ever_struck(), trial.fault()};
    }
    if (result.fault.empty()) {
        result.fault = leak(folder, before, test::refused_to_unmap() - unmap_before,
                            files_made_to_stay() - files_before);
    }
    for (const std::string& name : folder.names()) {
        std::filesystem::remove(folder / name);
    }
    return result;
}

const char* name_of(Source source) {
    constexpr const char* NAMES[] = {"heap", "malloc", "system"};
    return NAMES[static_cast<int>(source)];
}

}  // namespace

void Trial::begin() {
    if (m_failure.nth == 0) {
        return;
    }
    switch (m_failure.source) {
        case Source::HEAP:
            m_heap.emplace(m_failure.nth, m_failure.stays);
            break;
        case Source::MALLOC:
            m_malloc.emplace(m_failure.nth);
            break;
        case Source::SYSTEM:
            m_system.emplace(m_failure.nth, m_failure.stays ? test::SystemFailure::Then::STAYS
                                                            : test::SystemFailure::Then::RECOVERS);
            break;
    }
}

void Trial::end() {
    m_struck = (m_heap && m_heap->fired()) || (m_malloc && test::HeapFailure::struck()) ||
               (m_system && test::SystemFailure::struck());
    m_was_ever_struck |= m_struck;
    m_heap.reset();
    m_malloc.reset();
    m_system.reset();
}

void check(const char* operation, const Case& run) {
    const test::ScratchFolder folder;
    alarm(SECONDS_AN_OPERATION);
    int points = 0;
    std::set<std::string> faults;
    const auto note = [&](const Failure& failure, const std::string& fault) {
        if (!fault.empty()) {
            faults.insert(fault + " [" + name_of(failure.source) + " call " + std::to_string(failure.nth) +
                          (failure.stays ? " and later" : "") + "]");
        }
    };
    run_once(run, {Source::HEAP, false, 0}, folder);  // tables made once, regions kept
    note({}, run_once(run, {Source::HEAP, false, 0}, folder).fault);
    for (const Source source : {Source::HEAP, Source::MALLOC, Source::SYSTEM}) {
        for (const bool stays : {false, true}) {
            for (int nth = 1; nth <= MOST_CALLS && !(stays && source == Source::MALLOC); ++nth) {
                const Failure failure = {source, stays, nth};
                const Result result = run_once(run, failure, folder);
                note(failure, result.fault);
                if (!result.struck) {
                    break;
                }
                ++points;
            }
        }
    }
    alarm(0);
    std::printf("%-44s %6d  %s\n", operation, points, faults.empty() ? "ok" : "FAULTS");
    int shown = 0;
    for (const std::string& fault : faults) {
        std::printf("    %s\n", ++shown <= 10 ? fault.c_str() : ".");
    }
    std::fflush(stdout);
    ++totals.operations;
    totals.points += points;
    totals.faults += static_cast<int>(faults.size());
}

bool report_totals() {
    std::printf("%d operations, %d failure points, %d faults\n", totals.operations, totals.points,
                totals.faults);
    return totals.faults == 0;
}

}  // namespace basalt::faults
