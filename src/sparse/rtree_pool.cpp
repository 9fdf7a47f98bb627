#include "src/sparse/rtree_pool.h"

#include <cstring>
#include <new>
#include <utility>

namespace vex_util::rtree {

NodePool::NodePool(const NodePool& other) {
    m_slabs.reserve(other.m_slabs.size());
    try {
        for (const Slab& slab : other.m_slabs) {
            m_slabs.push_back({allocate_slab(slab.capacity), slab.capacity, slab.used});
            std::memcpy(m_slabs.back().nodes, slab.nodes, slab.used * sizeof(Node));
        }
    } catch (...) {
        release_all();
        throw;
    }
    m_current = other.m_current;
    m_capacity = other.m_capacity;
    m_spare = other.m_spare;
}

NodePool::~NodePool() {
    release_all();
}

void NodePool::swap(NodePool& other) noexcept {
    m_slabs.swap(other.m_slabs);
    std::swap(m_current, other.m_current);
    std::swap(m_capacity, other.m_capacity);
    std::swap(m_spare, other.m_spare);
}

NodeRef NodePool::take() noexcept {
    // Reserving ahead can leave the current slab with a few nodes and a fresh one behind it.
    while (m_slabs[m_current].used == m_slabs[m_current].capacity) {
        ++m_current;
    }
    --m_spare;
    return static_cast<NodeRef>(m_current << SLAB_BITS | m_slabs[m_current].used++);
}

void NodePool::reset() noexcept {
    if (m_slabs.empty()) {
        return;
    }
    for (std::size_t i = 1; i < m_slabs.size(); ++i) {
        release_slab(m_slabs[i]);
    }
    m_slabs.resize(1, Slab{});
    m_slabs[0].used = 0;
    m_current = 0;
    m_capacity = m_spare = m_slabs[0].capacity;
}

Node* NodePool::allocate_slab(std::size_t capacity) {
    return static_cast<Node*>(::operator new (capacity * sizeof(Node), std::align_val_t{alignof(Node)}));
}

void NodePool::release_slab(const Slab& slab) noexcept {
    ::operator delete (slab.nodes, std::align_val_t{alignof(Node)});
}

void NodePool::add_slab() {
    if (m_slabs.size() == MAX_SLABS) {
        throw std::bad_alloc();
    }
    if (m_slabs.size() == m_slabs.capacity()) {
        m_slabs.reserve(m_slabs.size() * 2 + 4);
    }
    // Each slab doubles the pool until slabs are as large as they get.
    const std::size_t capacity = std::clamp(m_capacity, FIRST_SLAB, static_cast<std::size_t>(SLAB_MASK) + 1);
    m_slabs.push_back({allocate_slab(capacity), capacity, 0});
    m_capacity += capacity;
    m_spare += capacity;
}

void NodePool::release_all() noexcept {
    for (const Slab& slab : m_slabs) {
        release_slab(slab);
    }
}

}  // namespace vex_util::rtree
