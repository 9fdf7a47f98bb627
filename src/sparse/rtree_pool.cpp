#include "src/sparse/rtree_pool.h"

#include <cstring>
#include <new>
#include <utility>

namespace vex_util::rtree {

NodePool::NodePool(const NodePool& other) : m_current(other.m_current), m_spare(other.m_spare) {
    m_pieces.reserve(other.m_pieces.size());
    for (const Piece& piece : other.m_pieces) {
        m_pieces.push_back({Slab(piece.capacity() * sizeof(Node), sizeof(Node)), piece.used});
        std::memcpy(m_pieces.back().nodes(), piece.nodes(), piece.used * sizeof(Node));
    }
}

void NodePool::swap(NodePool& other) noexcept {
    m_pieces.swap(other.m_pieces);
    std::swap(m_current, other.m_current);
    std::swap(m_spare, other.m_spare);
}

NodeRef NodePool::take() noexcept {
    while (m_pieces[m_current].used == m_pieces[m_current].capacity()) {
        ++m_current;
    }
    --m_spare;
    return static_cast<NodeRef>(m_current << PIECE_BITS | m_pieces[m_current].used++);
}

void NodePool::reset() noexcept {
    if (m_pieces.empty()) {
        return;
    }
    m_pieces.erase(m_pieces.begin() + 1, m_pieces.end());
    m_pieces[0].used = 0;
    m_current = 0;
    m_spare = m_pieces[0].capacity();
}

void NodePool::add_piece() {
    if (m_pieces.size() == MAX_PIECES) {
        throw std::bad_alloc();
    }
    if (m_pieces.size() == m_pieces.capacity()) {
        m_pieces.reserve(m_pieces.size() * 2 + 4);
    }
    // Each slab doubles the pool, up to the largest.
    std::size_t capacity = 0;
    for (const Piece& piece : m_pieces) {
        capacity += piece.capacity();
    }
    capacity = std::clamp(capacity, FIRST_CAPACITY, std::size_t{PIECE_MASK} + 1);
    m_pieces.push_back({Slab(capacity * sizeof(Node), sizeof(Node)), 0});
    m_spare += m_pieces.back().capacity();
}

}  // namespace vex_util::rtree
