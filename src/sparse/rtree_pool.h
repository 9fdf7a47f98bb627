// The nodes of one R-tree, allocated in slabs and released all at once.
#ifndef BASALT_SRC_SPARSE_RTREE_POOL_H
#define BASALT_SRC_SPARSE_RTREE_POOL_H

#include <cstddef>
#include <vector>

#include "src/sparse/rtree_node.h"
#include "src/sparse/slab.h"

namespace vex_util::rtree {

class NodePool {
public:
    NodePool() = default;
    // Nodes keep their references. Throws std::bad_alloc.
    NodePool(const NodePool& other);
    NodePool& operator=(const NodePool&) = delete;
    ~NodePool() = default;

    void swap(NodePool& other) noexcept;

    Node& operator[](NodeRef ref) { return m_pieces[ref >> PIECE_BITS].nodes()[ref & PIECE_MASK]; }
    const Node& operator[](NodeRef ref) const {
        return m_pieces[ref >> PIECE_BITS].nodes()[ref & PIECE_MASK];
    }

    // Makes the next `count` calls of take() sure to succeed. Throws std::bad_alloc with nothing changed.
    void reserve(std::size_t count) {
        while (m_spare < count) {
            add_piece();
        }
    }

    // Reserved nodes.
    std::size_t spare() const { return m_spare; }

    // A reserved node with undefined contents.
    NodeRef take() noexcept;

    // Releases all nodes but the first slab, so that a small tree can follow without allocating.
    void reset() noexcept;

private:
    static constexpr unsigned PIECE_BITS = 15;  // at most 6 MiB, three large pages
    static constexpr NodeRef PIECE_MASK = (NodeRef{1} << PIECE_BITS) - 1;
    static constexpr std::size_t MAX_PIECES = std::size_t{1} << (32 - PIECE_BITS);
    static constexpr std::size_t FIRST_CAPACITY = 8;

    struct Piece {
        Slab slab;
        std::size_t used = 0;

        Node* nodes() const { return reinterpret_cast<Node*>(slab.Begin()); }
        std::size_t capacity() const { return slab.Bytes() / sizeof(Node); }
    };

    void add_piece();

    std::vector<Piece> m_pieces;
    std::size_t m_current = 0;  // the piece of the next node
    std::size_t m_spare = 0;
};

}  // namespace vex_util::rtree

#endif
