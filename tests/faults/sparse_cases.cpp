// The sparse array: an operation that fails leaves it as it was, and succeeds when tried again.
#include <tuple>
#include <vector>

#include "basalt/sparse_cells.h"
#include "tests/faults/trial.h"
#include "tests/sparse/visit_recorder.h"
#include "tests/support/sparse_inspector.h"

namespace basalt::faults {

namespace {

using vex_util::Sparse2DArray;
using namespace vex_util::testing;

struct Filled : Sparse2DArray {
    explicit Filled(int blocks) : Sparse2DArray(8, 4, 3) {
        for (int i = 0; i < blocks; ++i) {
            insert_value(*this, 4 * (i % 7), 4 * (i / 7), static_cast<std::uint64_t>(i));
        }
        select(*this, 0, 0, 12, 12);
        Remove(4, 0);
    }
};

auto state_of(Sparse2DArray& array) {
    check_invariants(array);
    return std::tuple(visits(array, true), visits(array, false), array.IsSelectionDirty());
}

}  // namespace

void check_sparse() {
    const auto check_call = [](const char* operation, int blocks, const auto& call) {
        check(operation, [&](Trial& t) {
            Filled array(blocks);
            const auto before = state_of(array);
            const bool threw = t.throws([&] { call(array); });
            t.expect(!threw || (t.struck() && state_of(array) == before), "a failed call changes nothing");
            call(array);
            state_of(array);
        });
    };
    const std::vector<std::uint64_t> row(150, 9);
    for (const int blocks : {1, 3, 8, 16, 64, 73}) {  // full chunks, block table, leaves, root
        check_call("Sparse2DArray::Insert", blocks, [](auto& a) { insert_value(a, 999, 999, 1); });
    }
    check_call("SparseCells::insert_row", 73,
               [&](auto& a) { SparseCells::insert_row(a, -9, 1, row.data(), 8, row.size()); });
    check_call("Sparse2DArray::Select", 73, [](auto& a) { select(a, -100, -100, 100, 100); });
    check_call("Sparse2DArray, copy", 90, [](auto& a) { const Sparse2DArray copy(a); });
    check("Sparse2DArray::operator=", [](Trial& t) {
        Filled source(73), target(5);
        const bool threw = t.throws([&] { target = source; });
        t.expect(!threw || t.struck(), "throws only for a failure");
        t.expect(visits(target, true) == (threw ? Visits{} : visits(source, true)), "assigned or empty");
        target = source;
        t.expect(visits(target, true) == visits(source, true), "assigned afterwards");
    });
    check("Sparse2DArray::RemoveAll", [](Trial& t) {
        Filled array(73);
        t.attempt([&] { array.RemoveAll(); });
        t.expect(!t.struck() && visits(array, true).empty() && array.Insert(1, 1, &t), "empty, and usable");
    });
}

}  // namespace basalt::faults
