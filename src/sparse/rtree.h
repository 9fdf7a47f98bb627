// The R-tree that indexes the blocks of a sparse array.
#ifndef BASALT_SRC_SPARSE_RTREE_H
#define BASALT_SRC_SPARSE_RTREE_H

#include <cstddef>
#include <vector>

#include "src/sparse/rtree_pool.h"

namespace vex_util {

/// Guttman's R-tree with the quadratic split over rectangles of cells with int identifiers; rectangles are
/// measured by the volume of their circumscribed sphere in single precision. Entries are never removed one by
/// one, and the order of insertion determines the structure to the bit. Corners are {x, y}, inclusive.
/// Nothing is checked: a min above a max is kept as given, and equal entries are found as often as they were
/// inserted. Threads: one at a time; concurrent searches of an unchanging tree are safe.
class slRTree {
public:
    /// An empty tree. Throws std::bad_alloc.
    slRTree();
    /// A copy with the same structure. Throws std::bad_alloc.
    slRTree(const slRTree& other) = default;
    slRTree& operator=(const slRTree&) = delete;
    virtual ~slRTree();

    /// Throws std::bad_alloc with the tree unchanged.
    void Insert(const int min[2], const int max[2], const int& identifier);

    /// Allocates every node that so many calls of Insert can need, so that they cannot fail. Throws
    /// std::bad_alloc with the tree unchanged.
    void Reserve(std::size_t inserts);

    /// Replaces `results` by the identifiers of all rectangles that meet the given one (shared edges and
    /// corners do), depth first, and returns their number. Throws what the growth of `results` throws.
    int Search(const int min[2], const int max[2], std::vector<int>& results) const;

    /// Empties the tree. Cannot fail.
    void RemoveAll() noexcept;

    void swap(slRTree& other) noexcept;

private:
    friend struct RTreeInspector;

    void make_root() noexcept;

    rtree::NodePool m_nodes;
    rtree::NodeRef m_root = 0;
    int m_level = 0;          // the root's
    bool m_inverted = false;  // some rectangle has a min above its max
};

}  // namespace vex_util

#endif
