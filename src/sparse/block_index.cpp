#include "src/sparse/block_index.h"

namespace vex_util {
namespace {

constexpr std::size_t FIRST_SIZE = 16;

}  // namespace

void BlockIndex::Reserve(std::size_t count) {
    if (2 * (m_count + count) <= m_entries.size()) {
        return;
    }
    std::size_t size = m_entries.empty() ? FIRST_SIZE : 2 * m_entries.size();
    while (size < 2 * (m_count + count)) {
        size *= 2;
    }
    BlockIndex larger;
    larger.m_entries.resize(size);
    larger.m_shift = 64U - static_cast<unsigned>(__builtin_ctzll(size));
    for (const Entry& entry : m_entries) {
        if (entry.block) {
            larger.Place(entry);
        }
    }
    Swap(larger);
}

void BlockIndex::Add(BlockKey key, CellBlock block) noexcept {
    Place({packed(key), block});
}

void BlockIndex::Place(const Entry& added) noexcept {
    std::size_t i = Home(added.key);
    while (m_entries[i].block) {
        i = (i + 1) & (m_entries.size() - 1);
    }
    m_entries[i] = added;
    ++m_count;
}

}  // namespace vex_util
