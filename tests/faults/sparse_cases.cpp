// The sparse array: what fails leaves it as it was.
#include <array>
#include <memory>

#include "basalt/sparse.h"
#include "tests/faults/trial.h"
#include "tests/sparse/array_inspection.h"
#include "tests/sparse/visit_recorder.h"

namespace basalt::faults {

namespace {

using vex_util::Sparse2DArray;
using namespace vex_util::testing;

constexpr int BLOCKS = 72;

struct Snapshot {
    explicit Snapshot(Sparse2DArray& array)
        : all(visit_all(array)), selected(visit_selected(array)), dirty(array.IsSelectionDirty()) {
        check_invariants(array);
    }
    bool operator==(const Snapshot&) const = default;

    std::vector<Visited> all;
    std::vector<Visited> selected;
    bool dirty;
};

struct Filled : Sparse2DArray {
    Filled() : Sparse2DArray(8, 4, 3) {
        for (int i = 0; i < BLOCKS; ++i) {
            insert_value(*this, 4 * (i % 7), 4 * (i / 7), static_cast<std::uint64_t>(i));
        }
        select(*this, 0, 0, 12, 12);
        Remove(4, 0);
    }
};

}  // namespace

void check_sparse() {
    check("Sparse2DArray", [](Trial& t) {
        std::unique_ptr<Sparse2DArray> array;
        t.expect(!t.throws([&] { array = std::make_unique<Sparse2DArray>(8, 16, 64); }) || t.struck(),
                 "leaves only for a failure");
    });
    check("Sparse2DArray, copy", [](Trial& t) {
        Filled source;
        std::unique_ptr<Sparse2DArray> copy;
        if (!t.throws([&] { copy = std::make_unique<Sparse2DArray>(source); })) {
            t.expect(Snapshot(*copy) == Snapshot(source), "the copy is the same");
        }
        check_invariants(source);
    });
    check("Sparse2DArray::operator=", [](Trial& t) {
        Filled source;
        Sparse2DArray target(16, 8, 2);
        const std::array<std::uint64_t, 2> element = {5, 6};
        target.Insert(1, 1, element.data());
        const Snapshot before(target);
        if (t.throws([&] { target = source; })) {
            t.expect(t.struck() && Snapshot(target) == before, "what failed changed nothing");
            target = source;
        }
        t.expect(visit_all(target) == visit_all(source), "assigned");
        check_invariants(target);
    });
    check("Sparse2DArray::Insert, many blocks", [](Trial& t) {
        constexpr int MANY = 300;
        Sparse2DArray array(8, 4, 3);
        int inserted = 0;
        const auto insert_rest = [&] {
            for (; inserted < MANY; ++inserted) {
                insert_value(array, 4 * (inserted % 17), 4 * (inserted / 17), 1);
            }
        };
        t.expect(!t.throws(insert_rest) || t.struck(), "leaves only for a failure");
        t.expect(visit_all(array).size() == static_cast<std::size_t>(inserted), "all before it, and not it");
        check_invariants(array);
        insert_rest();
        t.expect(visit_all(array).size() == MANY, "the rest afterwards");
        check_invariants(array);
    });
    check("Sparse2DArray::Insert, chunks mapped alone", [](Trial& t) {
        const std::vector<char> element(std::size_t{1} << 20, 'x');
        Sparse2DArray array(element.size(), 2, 2);
        const bool threw = t.throws([&] { array.Insert(3, 4, element.data()); });
        t.expect(threw == (array.Find(3, 4) == nullptr) && (!threw || t.struck()), "all or nothing");
        t.expect(array.Insert(3, 4, element.data()), "inserted afterwards");
        check_invariants(array);
    });
    check("Sparse2DArray::Select", [](Trial& t) {
        Filled array;
        const Snapshot before(array);
        if (t.throws([&] { select(array, -100, -100, 100, 100); })) {
            t.expect(t.struck() && Snapshot(array) == before, "what failed changed nothing");
        }
        t.expect(select(array, -100, -100, 100, 100), "selected afterwards");
    });
    check("Sparse2DArray::Find, Remove, RemoveAll", [](Trial& t) {
        Filled array;
        t.expect(t.attempt([&] { return array.Find(8, 0) != nullptr && array.Remove(8, 0); }), "removed");
        t.attempt([&] { array.RemoveAll(); });
        t.expect(visit_all(array).empty() && array.Insert(1, 1, &t), "empty, and good for more");
    });
    check("Sparse2DArray::IterateAll, IterateSelected", [](Trial& t) {
        Filled array;
        const auto count = [](int, int, const void*, const void* context) {
            ++*static_cast<int*>(const_cast<void*>(context));
            return true;
        };
        int cells = 0;
        t.attempt([&] { array.IterateAll(count, &cells); });
        t.expect(cells == BLOCKS - 1, "all cells");
        t.attempt([&] { array.IterateSelected(count, &cells); });
        t.expect(cells > BLOCKS, "selected cells too");
    });
}

}  // namespace basalt::faults
