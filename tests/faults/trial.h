// Each operation is tried with its n-th call of the heap or the system failing, for every n there is.
#ifndef BASALT_TESTS_FAULTS_TRIAL_H
#define BASALT_TESTS_FAULTS_TRIAL_H

#include <exception>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "basalt/platform/cstring.h"
#include "tests/support/failing_new.h"
#include "tests/support/heap_calls.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace basalt::faults {

// Whose call fails. A program built with a sanitizer has the sanitizer's heap, which cannot be replaced:
// there `operator new` and malloc are counted apart, and the other libraries' own calls do not fail.
enum class Source { HEAP, MALLOC, SYSTEM };

struct Failure {
    Source source;
    bool stays;  // every later call fails too
    int nth;     // from 1; 0: none fails
};

// One run of an operation. What a case does outside attempt() does not fail.
class Trial {
public:
    Trial(const Failure& failure, const test::ScratchFolder& folder) : m_folder(folder), m_failure(failure) {}

    // Does the work that is on trial; true when it left for want of memory (or of the length of a text).
    template <class Work>
    bool throws(Work work) {
        return guarded([&] {
            try {
                work();
                return false;
            } catch (const std::exception&) {
                return true;
            }
        });
    }
    // The same for work that may not throw: its result.
    template <class Work>
    auto attempt(Work work) noexcept {
        return guarded(work);
    }

    void expect(bool holds, const char* what) {
        if (!holds && m_fault.empty()) {
            m_fault = what;
        }
    }

    // Whether the last attempt had a call that was made to fail; whether any had.
    bool struck() const { return m_struck; }
    bool fails_memory() const { return m_failure.source != Source::SYSTEM; }
    bool was_ever_struck() const { return m_was_ever_struck; }
    const std::string& fault() const { return m_fault; }
    const test::ScratchFolder& folder() const { return m_folder; }
    CString path(const char* name) const { return CString((m_folder / name).c_str()); }

private:
    template <class Work>
    auto guarded(Work work) {
        const EndOfFailure end{*this};
        begin();
        return work();
    }
    struct EndOfFailure {
        Trial& trial;
        ~EndOfFailure() { trial.end(); }
    };
    void begin();
    void end();

    const test::ScratchFolder& m_folder;
    Failure m_failure;
    std::optional<FailAllocation> m_heap;
    std::optional<test::HeapFailure> m_malloc;
    std::optional<test::SystemFailure> m_system;
    bool m_struck = false;
    bool m_was_ever_struck = false;
    std::string m_fault;
};

using Case = std::function<void(Trial&)>;

// Runs a case with every failure there is and prints a line of the table. Nothing may stay behind: no block,
// no page, no descriptor, no file.
void check(const char* operation, const Case& run);

// Whether all lines so far were in order; prints the totals.
bool report_totals();

void check_memory();
void check_sparse();
void check_texts();
void check_files();
void check_graphics();

}  // namespace basalt::faults

#endif
