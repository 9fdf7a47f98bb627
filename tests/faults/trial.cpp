// Makes every call of an operation to the heap or the system fail in turn, once and for good, and prints a
// line for each operation: the documented result, nothing leaked, everything usable afterwards.
#include "tests/faults/trial.h"

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <utility>
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
    long blocks = live_allocations(), mapped = test::bytes_mapped, mapped_kept = test::bytes_kept;
    long descriptors = test::open_descriptors(), files_kept = test::files_kept;
    std::size_t shared_blocks =
        platform::inspect_heap(vex_lib::vlSharedMemoryHeap::GetHeapHandle()).live_blocks;
    long files = std::ranges::count_if(Trial::folder().names(), [](const std::string& name) {
        return name.starts_with("vma") || name.starts_with("~") || name.starts_with("held");
    });

    // What stayed behind since, though nothing was made to stay; empty when nothing did.
    std::string leak(const Holdings& before) const {
        const bool unmaps = mapped_kept == before.mapped_kept;
        const std::pair<bool, std::string> leaks[] = {
            {unmaps && blocks != before.blocks, std::to_string(blocks - before.blocks) + " blocks"},
            {unmaps && mapped != before.mapped, std::to_string(mapped - before.mapped) + " mapped bytes"},
            {descriptors != before.descriptors, "a descriptor"},
            {shared_blocks != before.shared_blocks, "a block of the shared heap"},
            {files - before.files > files_kept - before.files_kept, "a temporary file"}};
        const auto* const leak = std::ranges::find(leaks, true, &std::pair<bool, std::string>::first);
        return leak != std::end(leaks) ? leak->second + " leaked" : "";
    }
};

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

void check(const char* operation, const std::function<void(Trial&)>& run) {
    const test::ScratchFolder folder;
    current_folder = &folder;
    alarm(SECONDS_AN_OPERATION);
    int tried = 0;
    std::string found;
    // Whether a call was made to fail.
    const auto run_once = [&](const Failure& failure) {
        for (const std::string& name : folder.names()) {
            std::filesystem::remove(folder / name);
        }
        const Holdings before;
        std::string fault;
        bool struck = false;
        {
            Trial trial(failure);
            run(trial);
            fault = trial.fault(), struck = trial.was_ever_struck();
        }
        fault = fault.empty() ? Holdings().leak(before) : fault;
        constexpr const char* NAMES[] = {"heap", "system", "handles"};
        if (!fault.empty()) {
            ++faults;
            found += "    " + fault + " [" + NAMES[static_cast<int>(failure.source)] + " call " +
                     std::to_string(failure.nth) + (failure.stays ? " and later]\n" : "]\n");
        }
        return struck;
    };
    Trial warm_up({});  // tables are made once, and regions of the shared heap kept
    run(warm_up), run_once({});
    for (const auto& [source, stays] : {std::pair(Source::HEAP, false),
                                        {Source::HEAP, true},
                                        {Source::SYSTEM, false},
                                        {Source::SYSTEM, true},
                                        {Source::HANDLES, true}}) {
        for (int nth = 1; nth <= MOST_CALLS && run_once({source, stays, nth}); ++nth) {
            ++tried;
        }
    }
    alarm(0);
    std::printf("%-44s %6d  %s\n%s", operation, tried, found.empty() ? "ok" : "FAULTS", found.c_str());
    std::fflush(stdout);
    ++operations, points += tried;
}

}  // namespace basalt::faults

int main() {
    using namespace basalt::faults;
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    std::printf("%-44s %6s\n", "operation", "points");
    check_memory(), check_sparse(), check_texts(), check_files(), check_graphics();
    std::printf("%d operations, %d failure points, %d faults\n", operations, points, faults);
    return faults == 0 ? 0 : 1;
}
