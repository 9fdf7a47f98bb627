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

// Files that the library makes for itself; the others are a case's own.
std::size_t temporary_files() {
    return static_cast<std::size_t>(
        std::ranges::count_if(Trial::folder().names(), [](const std::string& name) {
            return name.starts_with("vma") || name.starts_with("~") || name.starts_with("held");
        }));
}

struct Holdings {
    long blocks = live_allocations();
    long mapped = test::mapped_balance();
    long unmap_refused = test::refused_to_unmap();
    long descriptors = test::open_descriptors();
    std::size_t shared_blocks =
        platform::inspect_heap(vex_lib::vlSharedMemoryHeap::GetHeapHandle()).live_blocks;
    std::size_t files = temporary_files();
    long files_kept = test::files_made_to_stay();
};

// What stayed behind though nothing was made to stay; empty when nothing did.
std::string leak(const Holdings& before) {
    const Holdings after;
    const bool unmaps = after.unmap_refused == before.unmap_refused;
    if (unmaps && after.blocks != before.blocks) {
        return std::to_string(after.blocks - before.blocks) + " blocks leaked";
    }
    if (unmaps && after.mapped != before.mapped) {
        return std::to_string(after.mapped - before.mapped) + " mapped bytes leaked";
    }
    const bool keeps_file =
        after.files > before.files + static_cast<std::size_t>(after.files_kept - before.files_kept);
    return after.descriptors != before.descriptors       ? "a descriptor leaked"
           : after.shared_blocks != before.shared_blocks ? "a block of the shared heap leaked"
           : keeps_file                                  ? "a temporary file stayed"
                                                         : "";
}

// The fault found; whether a call was made to fail.
std::pair<std::string, bool> run_once(const Case& run, const Failure& failure) {
    const Holdings before;
    std::pair<std::string, bool> result;
    {
        Trial trial(failure);
        run(trial);
        result = {trial.fault(), trial.was_ever_struck()};
    }
    if (result.first.empty()) {
        result.first = leak(before);
    }
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
    if (m_failure.nth == 0) {
        return;
    }
    using Then = test::SystemFailure::Then;
    switch (m_failure.source) {
        case Source::HEAP:
            m_heap.emplace(m_failure.nth, m_failure.stays);
            break;
        case Source::SYSTEM:
            m_system.emplace(m_failure.nth, m_failure.stays ? Then::STAYS : Then::RECOVERS);
            break;
        case Source::HANDLES:
            while (HBRUSH const brush = CreateSolidBrush(0)) {
                taken_handles.push_back(brush);
            }
            for (int left = 1; left < m_failure.nth; ++left) {
                DeleteObject(taken_handles.back());
                taken_handles.pop_back();
            }
            break;
    }
}

bool Trial::strikes() const {
    return (m_heap && m_heap->fired()) || (m_system && test::SystemFailure::struck());
}

void Trial::end() {
    m_struck = strikes() || (m_failure.source == Source::HANDLES && !m_done);
    std::ranges::for_each(taken_handles, [](HBRUSH brush) { DeleteObject(brush); });
    std::vector<HBRUSH>().swap(taken_handles);
    m_was_ever_struck |= m_struck;
    m_heap.reset();
    m_system.reset();
}

void check(const char* operation, const Case& run, Handles handles) {
    const test::ScratchFolder folder;
    current_folder = &folder;
    alarm(SECONDS_AN_OPERATION);
    int tried = 0;
    std::set<std::string> found;
    const auto run_with = [&](const Failure& failure) {
        constexpr const char* NAMES[] = {"heap", "system", "handles"};
        const auto [fault, struck] = run_once(run, failure);
        if (!fault.empty()) {
            found.insert(fault + " [" + NAMES[static_cast<int>(failure.source)] + " call " +
                         std::to_string(failure.nth) + (failure.stays ? " and later" : "") + "]");
        }
        return struck;
    };
    run_once(run, {Source::HEAP, false, 0});  // tables are made once, and regions of the shared heap kept
    run_with({Source::HEAP, false, 0});
    for (const auto& [source, stays] :
         {std::pair(Source::HEAP, false), std::pair(Source::HEAP, true), std::pair(Source::SYSTEM, false),
          std::pair(Source::SYSTEM, true), std::pair(Source::HANDLES, true)}) {
        for (int nth = 1; nth <= MOST_CALLS && (source != Source::HANDLES || handles == Handles::FAIL);
             ++nth) {
            if (!run_with({source, stays, nth})) {
                break;
            }
            ++tried;
        }
    }
    alarm(0);
    std::printf("%-44s %6d  %s\n", operation, tried, found.empty() ? "ok" : "FAULTS");
    for (const std::string& fault : found) {
        std::printf("    %s\n", fault.c_str());
    }
    std::fflush(stdout);
    ++operations;
    points += tried;
    faults += static_cast<int>(found.size());
}

bool report_totals() {
    std::printf("%d operations, %d failure points, %d faults\n", operations, points, faults);
    return faults == 0;
}

}  // namespace basalt::faults
