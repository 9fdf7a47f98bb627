#include "src/sparse/sparse_contents.h"

#include <algorithm>
#include <limits>
#include <new>
#include <utility>

namespace vex_util {
namespace {

template <class Item>
void reserve_one_more(std::vector<Item>& list) {
    if (list.size() == list.capacity()) {
        list.reserve(2 * list.size() + 16);
    }
}

}  // namespace

SparseContents::SparseContents(const SparseContents& source)
    : m_grid(source.m_grid),
      m_elements(source.m_elements.ElementSize(), source.m_elements.ElementsPerChunk()),
      m_blocks(source.m_blocks.CellsPerBlock()) {
    // The clone of the tree comes last, over blocks entered without it.
    for (const ListedBlock& listed : source.m_list) {
        ReserveBlock();
        CopyBlockElements(source, listed.block, EnterReservedBlock(listed.key));
    }
    slRTree(source.m_tree).swap(m_tree);
}

void SparseContents::CopyNonEmptyBlocks(const SparseContents& source) {
    for (const ListedBlock& listed : source.m_list) {
        const std::uint64_t* const filled = source.Filled(listed.block);
        if (std::any_of(filled, filled + source.FilledWords(),
                        [](std::uint64_t word) { return word != 0; })) {
            ReserveBlock();
            m_tree.Reserve();
            const Block block = EnterReservedBlock(listed.key);
            IndexNewestBlock();
            CopyBlockElements(source, listed.block, block);
        }
    }
}

void SparseContents::InsertIntoNewBlock(int x, int y, const void* element) {
    ReserveBlock();
    m_tree.Reserve();
    void* const slot = m_elements.Take();
    const Block block = EnterReservedBlock(m_grid.KeyOf(x, y));
    IndexNewestBlock();
    Fill(block, m_grid.CellOf(x, y), slot, element);
}

void SparseContents::ReserveBlock() {
    if (m_list.size() > static_cast<std::size_t>(std::numeric_limits<int>::max())) {
        throw std::bad_alloc();  // identifiers are ints
    }
    reserve_one_more(m_list);
    m_index.Reserve();
    m_blocks.Reserve();
}

Block SparseContents::EnterReservedBlock(BlockKey key) noexcept {
    const Block block = m_blocks.TakeReserved();
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

void SparseContents::CopyBlockElements(const SparseContents& source, Block from, Block to) {
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
    m_index.Clear();
    m_list.clear();
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
