#include "src/sparse/block_pool.h"

#include <algorithm>
#include <cstring>
#include <limits>

namespace vex_util {
namespace {

// A new slab adds an eighth to the memory so far: few slabs, little of it unused.
constexpr std::size_t GROWTH_DIVISOR = 8;

// The bytes of larger blocks would not fit the address space.
constexpr std::size_t MOST_CELLS = std::numeric_limits<std::ptrdiff_t>::max() / (4 * sizeof(void*));

}  // namespace

std::size_t BlockPool::BlockBytes() const noexcept {
    const std::size_t bytes = FilledWords() * sizeof(std::uint64_t) + m_cellsPerBlock * sizeof(void*);
    // Whole cache lines, unless the block is so small that the rounding would show.
    return bytes < 4 * CACHE_LINE ? bytes : (bytes + CACHE_LINE - 1) & ~(CACHE_LINE - 1);
}

void BlockPool::AddSlab() {
    if (m_cellsPerBlock > MOST_CELLS) {
        throw std::bad_alloc();
    }
    const std::size_t blockBytes = BlockBytes();
    if (m_slabs.size() == m_slabs.capacity()) {
        m_slabs.reserve(2 * m_slabs.size() + 8);
    }
    const Slab& slab = m_slabs.emplace_back(std::max(blockBytes, m_bytes / GROWTH_DIVISOR), blockBytes);
    m_spare += slab.Bytes() / blockBytes;
    m_bytes += slab.Bytes();
}

void BlockPool::ReleaseReserved() noexcept {
    for (; m_slabs.size() > m_opened; m_slabs.pop_back()) {
        m_bytes -= m_slabs.back().Bytes();
    }
    m_spare = m_left;
}

CellBlock BlockPool::Take() noexcept {
    const std::size_t bytes = BlockBytes();
    if (m_left == 0) {
        const Slab& slab = m_slabs[m_opened++];
        m_next = slab.Begin();
        m_left = slab.Bytes() / bytes;
    }
    std::byte* const memory = m_next;
    std::memset(memory, 0, bytes);
    m_next += bytes;
    --m_left;
    --m_spare;
    return {reinterpret_cast<void**>(memory)};
}

void BlockPool::Clear() noexcept {
    BlockPool(m_cellsPerBlock).Swap(*this);
}

}  // namespace vex_util
