// The R-tree against its model, structure and search order to the bit: rectangles of every shape, corners in
// the wrong order too, in trees that are copied, swapped and emptied.
#include <algorithm>
#include <cstdint>
#include <memory>
#include <vector>

#include "fuzz/input.h"
#include "src/sparse/rtree.h"
#include "tests/sparse/rtree_model.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using vex_util::RTreeInspector;
using vex_util::RTreeModel;
using vex_util::slRTree;
using vex_util::rtree::Rect;

// A tree and its model.
struct Pair {
    slRTree tree;
    RTreeModel model;

    void insert(const Rect& r, int identifier) {
        const int min[2] = {r.minX, r.minY};
        const int max[2] = {r.maxX, r.maxY};
        tree.Insert(min, max, identifier);
        model.insert(r, identifier);
    }

    void search(const Rect& r) const {
        const int min[2] = {r.minX, r.minY};
        const int max[2] = {r.maxX, r.maxY};
        std::vector<int> found = {-1};
        require(tree.Search(min, max, found) == static_cast<int>(found.size()));
        require(found == model.search(r));
    }
};

// The last rectangle again, blocks near the origin, squares whose volumes round away the 1 of the search for
// seeds, any size, and now and then corners in the wrong order.
Rect rectangle(Input& input, const Rect& last) {
    const unsigned kind = input.byte() % 16;
    if (kind < 3) {
        return last;
    }
    const int x = input.coordinate(), y = input.coordinate();
    if (kind < 8) {
        return {16 * (x % 4096), 16 * (y % 4096), 16 * (x % 4096) + 15, 16 * (y % 4096) + 15};
    }
    if (kind < 10) {
        const int half = 1700 + x % 8;
        return {-half, -half, half, half};
    }
    const Rect r{x, y, input.coordinate(), input.coordinate()};
    return kind == 10 ? r
                      : Rect{std::min(r.minX, r.maxX), std::min(r.minY, r.maxY), std::max(r.minX, r.maxX),
                             std::max(r.minY, r.maxY)};
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    auto pair = std::make_unique<Pair>();
    Rect last{};
    for (int i = 0; !input.is_over() && i < 400; ++i) {
        const unsigned choice = input.byte() % 32;
        if (choice == 0 && input.byte() % 8 == 0) {
            pair->tree.RemoveAll();
            pair->model = {};
        } else if (choice == 1) {
            slRTree copy(pair->tree);
            copy.swap(pair->tree);
            require(RTreeInspector::dump(copy) == RTreeInspector::dump(pair->tree));
        } else if (choice == 2) {
            pair->tree.Reserve(input.byte());
        } else if (choice == 3) {
            for (int row = input.byte() % 64; row > 0; --row) {  // a tree of several levels
                last = {16 * row, 16 * i, 16 * row + 15, 16 * i + 15};
                pair->insert(last, row);
            }
        } else if (choice < 10) {
            pair->search(rectangle(input, last));
        } else {
            last = rectangle(input, last);
            pair->insert(last, static_cast<int>(input.byte()));
        }
    }
    require(RTreeInspector::dump(pair->tree) == RTreeModel::dump(*pair->model.root));
    return 0;
}
