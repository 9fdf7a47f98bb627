// Each operation is tried with its n-th call of the heap or the system failing, for every n.
#ifndef BASALT_TESTS_FAULTS_TRIAL_H
#define BASALT_TESTS_FAULTS_TRIAL_H

#include <exception>
#include <functional>
#include <optional>
#include <string>

#include "basalt/platform/cstring.h"
#include "tests/support/failing_new.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace basalt::faults {

// The resource that fails. With a sanitizer, whose heap cannot be replaced, HEAP is `operator new` alone.
// HANDLES: nth - 1 handles of drawing objects are left.
enum class Source { HEAP, SYSTEM, HANDLES };

struct Failure {
    Source source = Source::HEAP;
    bool stays = false;  // every later call fails too
    int nth = 0;         // from 1; 0: none fails
};

// One run of an operation. Only calls within attempt(), throws() and succeeds() fail.
class Trial {
public:
    explicit Trial(const Failure& failure) : m_failure(failure) {}

    template <class Work>
    auto attempt(Work work) noexcept {
        const Attempt failing{*this};
        return work();
    }
    // Whether the work throws.
    template <class Work>
    bool throws(Work work) {
        return !succeeds([&] { return work(), true; });
    }
    // The result of the work, false if it throws.
    template <class Work>
    bool succeeds(Work work) {
        const Attempt failing{*this};
        try {
            return m_done = work();
        } catch (const std::exception&) {
            return m_done = false;
        }
    }

    void expect(bool holds, const char* what) { m_fault = holds || !m_fault.empty() ? m_fault : what; }

    // Whether a call of the present attempt has been made to fail; of the last attempt; of any.
    bool strikes() const;
    bool struck() const { return m_struck; }
    bool was_ever_struck() const { return m_was_ever_struck; }
    bool fails_memory() const { return m_failure.source == Source::HEAP; }
    const std::string& fault() const { return m_fault; }
    static const test::ScratchFolder& folder();
    static CString path(const char* name) { return CString((folder() / name).c_str()); }

private:
    struct Attempt {
        Trial& trial;
        explicit Attempt(Trial& failing) : trial(failing) { trial.begin(); }
        ~Attempt() { trial.end(); }
    };
    void begin();
    void end();
    Failure m_failure;
    std::optional<FailAllocation> m_heap;
    std::optional<test::SystemFailure> m_system;
    bool m_done = true, m_struck = false, m_was_ever_struck = false;
    std::string m_fault;
};

// Runs a case with every failure there is and prints a line of the table. Nothing may stay behind: no block,
// no page, no descriptor, no file.
void check(const char* operation, const std::function<void(Trial&)>& run);

// The common form: a row is a type.
//   Row()         makes the object on trial; nothing fails here
//   act()         the operation: whether it did its work, or an exception (`noexcept` where none may leave)
//   holds(done)   whether the object is as promised after an act that did its work, or that did not
// An act fails only for a reason, and succeeds when it is repeated without one.
template <class Row>
void run(const char* operation) {
    check(operation, [](Trial& trial) {
        Row row;
        const bool done = trial.succeeds([&] { return row.act(); });
        trial.expect(done || trial.struck(), "fails for no reason");
        trial.expect(row.holds(done), done ? "not as promised" : "not as promised after a failure");
        trial.expect(done || (row.act() && row.holds(true)), "not usable after a failure");
    });
}

void check_memory(), check_sparse(), check_texts(), check_files(), check_graphics();

}  // namespace basalt::faults

#endif
