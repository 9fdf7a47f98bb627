// The nodes of one R-tree: slabs that grow with the tree and are given back all at once.
#ifndef BASALT_SRC_SPARSE_RTREE_POOL_H
#define BASALT_SRC_SPARSE_RTREE_POOL_H

#include <cstddef>
#include <vector>

#include "src/sparse/rtree_node.h"

namespace vex_util::rtree {

class NodePool {
public:
    NodePool() = default;
    // A copy has every node at the same reference. Throws std::bad_alloc.
    NodePool(const NodePool& other);
    NodePool& operator=(const NodePool&) = delete;
    ~NodePool();

    void swap(NodePool& other) noexcept;

    Node& operator[](NodeRef ref) { return m_slabs[ref >> SLAB_BITS].nodes[ref & SLAB_MASK]; }
    const Node& operator[](NodeRef ref) const { return m_slabs[ref >> SLAB_BITS].nodes[ref & SLAB_MASK]; }

    // Makes the next `count` calls of take() sure to succeed; throws std::bad_alloc with nothing changed.
    void reserve(std::size_t count) {
        while (m_spare < count) {
            add_slab();
        }
    }

    // How many more nodes take() gives before the pool has to grow.
    std::size_t spare() const { return m_spare; }

    // Asks for a reserved node; its contents are whatever they were.
    NodeRef take() noexcept;

    // Every node is free again; the first slab stays, so that a small tree can follow without allocating.
    void reset() noexcept;

private:
    static constexpr unsigned SLAB_BITS = 15;  // the largest slab: 6 MiB, three large pages
    static constexpr NodeRef SLAB_MASK = (NodeRef{1} << SLAB_BITS) - 1;
    static constexpr std::size_t MAX_SLABS = std::size_t{1} << (32 - SLAB_BITS);
    static constexpr std::size_t FIRST_SLAB = 8;

    struct Slab {
        Node* nodes;
        std::size_t capacity;
        std::size_t used;
    };

    static Node* allocate_slab(std::size_t capacity);
    static void release_slab(const Slab& slab) noexcept;
    void add_slab();
    void release_all() noexcept;

    std::vector<Slab> m_slabs;
    std::size_t m_current = 0;   // the slab that gives the next node
    std::size_t m_capacity = 0;  // nodes in all slabs
    std::size_t m_spare = 0;     // of them free
};

}  // namespace vex_util::rtree

#endif
