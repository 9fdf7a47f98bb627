// Makes every call that an operation makes to the heap or the system fail in turn, once and for good, and
// prints a line for each: the documented answer, nothing left behind, everything usable afterwards.
#include <cstdio>

#include "basalt/platform/error.h"
#include "tests/faults/trial.h"

int main() {
    using namespace basalt::faults;
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    std::printf("%-44s %6s\n", "operation", "points");
    check_memory(), check_sparse(), check_texts(), check_files(), check_graphics();
    return report_totals() ? 0 : 1;
}
