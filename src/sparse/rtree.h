// The R-tree that indexes the blocks of a sparse array.
#ifndef BASALT_SRC_SPARSE_RTREE_H
#define BASALT_SRC_SPARSE_RTREE_H

#include <vector>

#include "src/sparse/rtree_pool.h"

namespace vex_util {

/// Guttman's R-tree with the quadratic split over rectangles of cells with int identifiers; rectangles are
/// measured by the volume of their circumscribed sphere in single precision. It only grows, and its structure
/// is fixed to the bit by the order of insertion. Corners are {x, y}, inclusive; nothing is checked: a min
/// above a max is kept as given, and equal entries are kept and found as often as they were inserted.
/// Threads: one at a time; searches of a tree that nobody changes may run at the same time.
class slRTree {
public:
    /// An empty tree. Throws std::bad_alloc.
    slRTree();
    /// A tree of its own with the same structure. Throws std::bad_alloc.
    slRTree(const slRTree& other) = default;
    slRTree& operator=(const slRTree&) = delete;
    virtual ~slRTree();

    /// Throws std::bad_alloc with the tree unchanged.
    void Insert(const int min[2], const int max[2], const int& identifier);

    /// Takes every node the next Insert can need, so that it cannot fail. Throws std::bad_alloc with the tree
    /// unchanged.
    void Reserve();

    /// Replaces `results` by the identifiers of all rectangles that meet the given one (shared edges and
    /// corners do), depth first, and answers their number. Throws what the growth of `results` throws.
    int Search(const int min[2], const int max[2], std::vector<int>& results) const;

    /// Empties the tree. Cannot fail.
    void RemoveAll() noexcept;

    void swap(slRTree& other) noexcept;

private:
    friend struct RTreeInspector;

    void plant() noexcept;

    rtree::NodePool m_nodes;
    rtree::NodeRef m_root = 0;
    int m_level = 0;          // the root's
    bool m_inverted = false;  // some rectangle has a min above its max
};

}  // namespace vex_util

#endif
