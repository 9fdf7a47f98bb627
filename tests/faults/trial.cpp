#include "tests/faults/trial.h"

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <set>
#include <vector>

#include "basalt/memory.h"
#include "basalt/platform.h"
#include "tests/support/heap_inspection.h"
#include "tests/support/open_descriptors.h"

namespace basalt::faults {

namespace {

constexpr unsigned SECONDS_AN_OPERATION = 120;  // then a signal ends the program: nothing may hang
constexpr int MOST_CALLS = 5000;

int operations = 0, points = 0, faults = 0;
const test::ScratchFolder* current_folder = nullptr;
std::vector<HBRUSH> taken_handles;

// What the process holds, and what was made to stay. The library's own files count; the others are a case's.
struct Holdings {
    long blocks = live_allocations(), mapped = test::mapped_balance(), mapped_kept = test::bytes_kept;
    long descriptors = test::open_descriptors(), files_kept = test::files_kept;
    std::size_t shared_blocks =
        platform::inspect_heap(vex_lib::vlSharedMemoryHeap::GetHeapHandle()).live_blocks;
    long files = std::ranges::count_if(Trial::folder().names(), [](const std::string& name) {
        return name.starts_with("vma") || name.starts_with("~") || name.starts_with("held");
    });

    // What stayed behind since, though nothing was made to stay; empty when nothing did.
    std::string leak(const Holdings& before) const {
        const bool unmaps = mapped_kept == before.mapped_kept;
        return unmaps && blocks != before.blocks ? std::to_string(blocks - before.blocks) + " blocks leaked"
               : unmaps && mapped != before.mapped
                   ? std::to_string(mapped - before.mapped) + " mapped bytes leaked"
               : descriptors != before.descriptors                     ? "a descriptor leaked"
               : shared_blocks != before.shared_blocks                 ? "a block of the shared heap leaked"
               : files - before.files > files_kept - before.files_kept ? "a temporary file stayed"
                                                                       : "";
    }
};

// The fault found; whether a call was made to fail.
std::pair<std::string, bool> run_once(const Case& run, const Failure& failure) {
    const Holdings before;
    std::pair<std::string, bool> result;
    {
        Trial trial(failure);
        run(trial);
        result = {trial.fault(), trial.was_ever_struck()};
    }
    result.first = result.first.empty() ? Holdings().leak(before) : result.first;
    for (const std::string& name : Trial::folder().names()) {
        std::filesystem::remove(Trial::folder() / name);
    }
    return result;
}

}  // namespace

const test::ScratchFolder& Trial::folder() {
    return *current_folder;
}

void Trial::begin() {
    using Then = test::SystemFailure::Then;
    if (m_failure.nth == 0) {
        return;
    }
    if (m_failure.source == Source::HEAP) {
        m_heap.emplace(m_failure.nth, m_failure.stays);
    } else if (m_failure.source == Source::SYSTEM) {
        m_system.emplace(m_failure.nth, m_failure.stays ? Then::STAYS : Then::RECOVERS);
    } else {
        while (HBRUSH const brush = CreateSolidBrush(0)) {
            taken_handles.push_back(brush);
        }
        for (int left = 1; left < m_failure.nth; ++left) {
            DeleteObject(taken_handles.back());
            taken_handles.pop_back();
        }
    }
}

bool Trial::strikes() const {
    return (m_heap && m_heap->fired()) || (m_system && m_system->struck());
}

void Trial::end() {
    m_struck = strikes() || (m_failure.source == Source::HANDLES && !m_done);
    std::ranges::for_each(taken_handles, DeleteObject);
    std::vector<HBRUSH>().swap(taken_handles);
    m_was_ever_struck |= m_struck;
    m_heap.reset(), m_system.reset();
}

void check(const char* operation, const Case& run, Handles handles) {
    const test::ScratchFolder folder;
    current_folder = &folder;
    alarm(SECONDS_AN_OPERATION);
    int tried = 0;
    std::set<std::string> found;
    const auto run_with = [&](Source source, bool stays, int nth) {
        constexpr const char* NAMES[] = {"heap", "system", "handles"};
        const auto [fault, struck] = run_once(run, {source, stays, nth});
        if (!fault.empty()) {
            found.insert(fault + " [" + NAMES[static_cast<int>(source)] + " call " + std::to_string(nth) +
                         (stays ? " and later" : "") + "]");
        }
        return struck;
    };
    run_once(run, {Source::HEAP, false, 0});  // tables are made once, and regions of the shared heap kept
    run_with(Source::HEAP, false, 0);
    for (const Source source : {Source::HEAP, Source::SYSTEM, Source::HANDLES}) {
        for (const bool stays : {false, true}) {
            const bool applies = source != Source::HANDLES || (handles == Handles::FAIL && stays);
            for (int nth = 1; applies && nth <= MOST_CALLS && run_with(source, stays, nth); ++nth) {
                ++tried;
            }
        }
    }
    alarm(0);
    std::printf("%-44s %6d  %s\n", operation, tried, found.empty() ? "ok" : "FAULTS");
    for (const std::string& fault : found) {
        std::printf("    %s\n", fault.c_str());
    }
    std::fflush(stdout);
    ++operations, points += tried, faults += static_cast<int>(found.size());
}

bool report_totals() {
    std::printf("%d operations, %d failure points, %d faults\n", operations, points, faults);
    return faults == 0;
}

}  // namespace basalt::faults
