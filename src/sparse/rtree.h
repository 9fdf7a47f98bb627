// The R-tree that indexes the blocks of a sparse array.
#ifndef BASALT_SRC_SPARSE_RTREE_H
#define BASALT_SRC_SPARSE_RTREE_H

#include <vector>

namespace vex_util {

class slRTree {
public:
    slRTree();
    virtual ~slRTree();
    slRTree(const slRTree&) = delete;
    slRTree& operator=(const slRTree&) = delete;

    void Insert(const int min[2], const int max[2], const int& identifier);
    int Search(const int min[2], const int max[2], std::vector<int>& results) const;
    void RemoveAll();
};

}  // namespace vex_util

#endif
