// The R-tree against a plain list, and its order against the tree written down plainly: rectangles of every
// shape, sides turned round too, in trees that are copied, swapped and emptied.
#include <algorithm>
#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

#include "fuzz/input.h"
#include "src/sparse/rtree.h"
#include "tests/sparse/rtree_inspector.h"
#include "tests/sparse/rtree_model.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using vex_util::RTreeInspector;
using vex_util::RTreeModel;
using vex_util::slRTree;
using vex_util::rtree::Rect;

struct Listed {
    Rect rect;
    int identifier;
};

struct Forest {
    slRTree tree;
    std::vector<Listed> list;
    RTreeModel model;

    void insert(const Rect& r, int identifier) {
        const int min[2] = {r.minX, r.minY};
        const int max[2] = {r.maxX, r.maxY};
        tree.Insert(min, max, identifier);
        model.Insert(min, max, identifier);
        list.push_back({r, identifier});
    }

    // A rectangle with a side turned round may hide below a cover that it does not fill, so only the model
    // knows whether it is found; of the others the list does.
    void search(const Rect& r) const {
        const int min[2] = {r.minX, r.minY};
        const int max[2] = {r.maxX, r.maxY};
        std::vector<int> found = {-1};
        require(tree.Search(min, max, found) == static_cast<int>(found.size()));
        std::vector<int> ordered;
        model.Search(min, max, ordered);
        require(found == ordered);
        if (is_straight(r) &&
            std::all_of(list.begin(), list.end(), [](const Listed& one) { return is_straight(one.rect); })) {
            std::vector<int> expected;
            for (const Listed& one : list) {
                if (one.rect.minX <= r.maxX && one.rect.maxX >= r.minX && one.rect.minY <= r.maxY &&
                    one.rect.maxY >= r.minY) {
                    expected.push_back(one.identifier);
                }
            }
            std::sort(expected.begin(), expected.end());
            std::sort(found.begin(), found.end());
            require(found == expected);
        }
    }

    static bool is_straight(const Rect& r) { return r.minX <= r.maxX && r.minY <= r.maxY; }
};

Rect rectangle(Input& input) {
    Rect r{input.coordinate(), input.coordinate(), input.coordinate(), input.coordinate()};
    if (input.byte() % 16 != 0) {
        r = {std::min(r.minX, r.maxX), std::min(r.minY, r.maxY), std::max(r.minX, r.maxX),
             std::max(r.minY, r.maxY)};
    }
    return r;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    auto forest = std::make_unique<Forest>();
    for (int i = 0; !input.is_over() && i < 400; ++i) {
        const unsigned choice = input.byte() % 32;
        if (choice == 0 && input.byte() % 8 == 0) {
            forest->tree.RemoveAll();
            forest->model.RemoveAll();
            forest->list.clear();
        } else if (choice == 1) {
            slRTree copy(forest->tree);
            copy.swap(forest->tree);
            require(RTreeInspector::dump(copy) == RTreeInspector::dump(forest->tree));
        } else if (choice == 2) {
            forest->tree.Reserve();
        } else if (choice < 10) {
            forest->search(rectangle(input));
        } else {
            forest->insert(rectangle(input), static_cast<int>(input.byte()));
        }
    }
    require(RTreeInspector::check(forest->tree).empty());
    require(RTreeInspector::dump(forest->tree) == forest->model.dump());
    return 0;
}
