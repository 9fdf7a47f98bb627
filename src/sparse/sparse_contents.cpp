#include "src/sparse/sparse_contents.h"

#include <algorithm>
#include <limits>
#include <new>
#include <utility>

namespace vex_util {
namespace {

// Doubles at least, so that adding one by one stays linear.
template <class Item>
void reserve_more(std::vector<Item>& list, std::size_t count) {
    if (list.capacity() - list.size() < count) {
        list.reserve(std::max(list.size() + count, 2 * list.size() + 16));
    }
}

}  // namespace

SparseContents::SparseContents(const SparseContents& source)
    : m_grid(source.m_grid),
      m_elements(source.m_elements.ElementSize(), source.m_elements.ElementsPerChunk()),
      m_blocks(source.m_blocks.CellsPerBlock()) {
    // Blocks are entered without the tree, which is cloned.
    for (const ListedBlock& listed : source.m_list) {
        ReserveBlocks(1);
        CopyBlockElements(source, listed.block, EnterReservedBlock(listed.key));
    }
    slRTree(source.m_tree).swap(m_tree);
}

void SparseContents::CopyNonEmptyBlocks(const SparseContents& source) {
    for (const ListedBlock& listed : source.m_list) {
        const std::uint64_t* const filled = source.Filled(listed.block);
        if (std::any_of(filled, filled + source.FilledWords(),
                        [](std::uint64_t word) { return word != 0; })) {
            ReserveBlocks(1);
            m_tree.Reserve(1);
            const CellBlock block = EnterReservedBlock(listed.key);
            IndexNewestBlock();
            CopyBlockElements(source, listed.block, block);
        }
    }
}

void SparseContents::InsertIntoNewBlock(int x, int y, const void* element) {
    ReserveBlocks(1);
    m_tree.Reserve(1);
    void* const slot = m_elements.Take();
    const CellBlock block = EnterReservedBlock(m_grid.KeyOf(x, y));
    IndexNewestBlock();
    Fill(block, m_grid.CellOf(x, y), slot, element);
}

void SparseContents::ReserveBlocks(std::size_t count) {
    constexpr std::size_t MOST = std::size_t{std::numeric_limits<int>::max()} + 1;  // identifiers are ints
    if (count > MOST - m_list.size()) {
        throw std::bad_alloc();
    }
    reserve_more(m_list, count);
    m_index.Reserve(count);
    m_blocks.Reserve(count);
}

CellBlock SparseContents::EnterReservedBlock(BlockKey key) noexcept {
    const CellBlock block = m_blocks.Take();
    m_index.Add(key, block);
    m_list.push_back({key, block});
    m_lastKey = packed(key);
    m_lastBlock = block;
    return block;
}

void SparseContents::IndexNewestBlock() noexcept {
    const BlockKey key = m_list.back().key;
    const std::size_t last = m_grid.CellsPerBlock() - 1;
    const int min[2] = {m_grid.X(key, 0), m_grid.Y(key, 0)};
    const int max[2] = {m_grid.X(key, last), m_grid.Y(key, last)};
    m_tree.Insert(min, max, static_cast<int>(m_list.size() - 1));
}

void SparseContents::CopyBlockElements(const SparseContents& source, CellBlock from, CellBlock to) {
    const std::uint64_t* const filled = source.Filled(from);
    for (std::size_t word = 0; word < source.FilledWords(); ++word) {
        for (std::uint64_t bits = filled[word]; bits != 0; bits &= bits - 1) {
            const std::size_t cell = word * 64 + static_cast<std::size_t>(__builtin_ctzll(bits));
            Fill(to, cell, m_elements.Take(), from.cells[cell]);
        }
    }
}

void SparseContents::Clear() noexcept {
    m_blocks.Clear();
    m_elements.Clear();
    BlockIndex().Swap(m_index);
    std::vector<ListedBlock>().swap(m_list);
    m_tree.RemoveAll();
    m_lastBlock = {};
}

void SparseContents::Swap(SparseContents& other) noexcept {
    std::swap(m_grid, other.m_grid);
    m_elements.Swap(other.m_elements);
    m_blocks.Swap(other.m_blocks);
    m_index.Swap(other.m_index);
    m_list.swap(other.m_list);
    m_tree.swap(other.m_tree);
    std::swap(m_lastKey, other.m_lastKey);
    std::swap(m_lastBlock, other.m_lastBlock);
}

}  // namespace vex_util
