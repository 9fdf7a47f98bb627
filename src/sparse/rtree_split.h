// Guttman's quadratic split of a full node.
#ifndef BASALT_SRC_SPARSE_RTREE_SPLIT_H
#define BASALT_SRC_SPARSE_RTREE_SPLIT_H

#include "src/sparse/rtree_node.h"

namespace vex_util::rtree {

// Shares the entries of the full `node` and `extra` between `node` and `sibling`, four or five to each; the
// sibling gets the node's level. Source: Guttman, 1984, "R-trees", section 3.5.2.
void split(Node& node, const Entry& extra, Node& sibling);

}  // namespace vex_util::rtree

#endif
