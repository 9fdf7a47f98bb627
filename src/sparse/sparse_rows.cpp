// Rows of cells of a sparse array.
#include <algorithm>
#include <bit>
#include <climits>
#include <cstring>
#include <new>

#include "src/sparse/sparse_contents.h"

namespace vex_util {
namespace {

// How many of the slots, from the first on, adjoin in memory.
std::size_t adjoining(void* const* slots, std::size_t count, std::size_t size) {
    std::size_t run = 1;
    while (run < count && slots[run] == static_cast<char*>(slots[0]) + run * size) {
        ++run;
    }
    return run;
}

}  // namespace

// Cells of a row that share a block and a word of its bits.
struct SparseContents::RowPiece {
    BlockKey key;
    CellBlock block;    // null if it does not exist
    std::size_t start;  // index in the row
    std::size_t cell;   // index in the block
    std::size_t count;  // 1 .. 64

    std::uint64_t Mask() const { return ~std::uint64_t{0} >> (64 - count) << cell % 64; }
    void** Slots() const { return block.cells + cell; }
};

template <class Step>
void SparseContents::EachPiece(int x, int y, std::size_t count, Step step) {
    const std::size_t widest = std::min<std::size_t>(m_grid.Side(), 64);
    count = std::min(count, static_cast<std::size_t>(std::int64_t{INT_MAX} - x + 1));
    for (std::size_t start = 0; start < count;) {
        const int at = static_cast<int>(x + static_cast<std::int64_t>(start));
        const std::size_t cell = m_grid.CellOf(at, y);
        const BlockKey key = m_grid.KeyOf(at, y);
        const RowPiece piece{key, FindBlock(key), start, cell,
                             std::min(widest - cell % widest, count - start)};
        step(piece);
        start += piece.count;
    }
}

// Allocates all that a row needs before any of it is inserted. Throws std::bad_alloc.
void SparseContents::ReserveRow(int x, int y, std::size_t count) {
    std::size_t blocks = 0;
    std::size_t slots = 0;
    std::uint64_t missing = 0;
    EachPiece(x, y, count, [&](const RowPiece& piece) {
        slots += piece.count;
        if (piece.block) {
            slots -= static_cast<std::size_t>(std::popcount(Word(piece.block, piece.cell) & piece.Mask()));
        } else if (blocks == 0 || packed(piece.key) != missing) {
            missing = packed(piece.key);
            ++blocks;
        }
    });
    try {
        if (blocks != 0) {
            ReserveBlocks(blocks);
            m_tree.Reserve(blocks);
        }
        m_elements.Reserve(slots);
    } catch (const std::bad_alloc&) {
        // The process is out of memory: keep none of it.
        m_blocks.ReleaseReserved();
        m_elements.ReleaseReserved();
        throw;
    }
}

bool SparseContents::InsertRow(int x, int y, const char* elements, std::size_t size, std::size_t count) {
    ReserveRow(x, y, count);
    const std::size_t slotSize = m_elements.ElementSize();
    bool created = false;
    EachPiece(x, y, count, [&](RowPiece piece) {
        if (!piece.block) {
            piece.block = EnterReservedBlock(piece.key);
            IndexNewestBlock();
            created = true;
        }
        void** const slots = piece.Slots();
        std::uint64_t& word = Word(piece.block, piece.cell);
        if ((word & piece.Mask()) == 0) {
            m_elements.TakeRow(slots, piece.count);
        } else {
            for (std::size_t i = piece.count; i-- != 0;) {
                if (slots[i] == nullptr) {
                    m_elements.TakeRow(slots + i, 1);
                }
            }
        }
        word |= piece.Mask();
        const char* const from = elements + piece.start * size;
        for (std::size_t i = 0; i < piece.count;) {
            const std::size_t run = size == slotSize ? adjoining(slots + i, piece.count - i, size) : 1;
            if (size < slotSize) {
                std::memset(slots[i], 0, slotSize);
            }
            std::memcpy(slots[i], from + i * size, std::min(size, slotSize) * run);
            i += run;
        }
    });
    return created;
}

std::size_t SparseContents::CopyRow(int x, int y, char* elements, std::size_t size, bool* filled,
                                    std::size_t count) {
    const std::size_t slotSize = m_elements.ElementSize();
    std::size_t found = 0;
    if (filled != nullptr) {
        std::fill_n(filled, count, false);
    }
    EachPiece(x, y, count, [&](const RowPiece& piece) {
        if (!piece.block) {
            return;
        }
        void* const* const slots = piece.Slots();
        for (std::size_t i = 0; i < piece.count;) {
            if (slots[i] == nullptr) {
                ++i;
                continue;
            }
            const std::size_t run = size == slotSize ? adjoining(slots + i, piece.count - i, size) : 1;
            std::memcpy(elements + (piece.start + i) * size, slots[i], std::min(size, slotSize) * run);
            if (filled != nullptr) {
                std::fill_n(filled + piece.start + i, run, true);
            }
            found += run;
            i += run;
        }
    });
    return found;
}

std::size_t SparseContents::FindRow(int x, int y, void** elements, std::size_t count) noexcept {
    std::size_t found = 0;
    std::fill_n(elements, count, nullptr);
    EachPiece(x, y, count, [&](const RowPiece& piece) {
        if (piece.block) {
            std::copy_n(piece.Slots(), piece.count, elements + piece.start);
            found += static_cast<std::size_t>(std::popcount(Word(piece.block, piece.cell) & piece.Mask()));
        }
    });
    return found;
}

std::size_t SparseContents::FindCells(const basalt::GridCell* cells, void** elements,
                                      std::size_t count) const noexcept {
    constexpr std::size_t GROUP = 32;  // cache misses that overlap
    void** places[GROUP];
    std::size_t found = 0;
    while (count != 0) {
        const std::size_t size = std::min(count, GROUP);
        for (std::size_t i = 0; i < size; ++i) {
            m_index.Prefetch(m_grid.KeyOf(cells[i].x, cells[i].y));
        }
        for (std::size_t i = 0; i < size; ++i) {
            const CellBlock block = m_index.Find(m_grid.KeyOf(cells[i].x, cells[i].y));
            places[i] = block ? block.cells + m_grid.CellOf(cells[i].x, cells[i].y) : nullptr;
            __builtin_prefetch(places[i]);
        }
        for (std::size_t i = 0; i < size; ++i) {
            elements[i] = places[i] != nullptr ? *places[i] : nullptr;
            __builtin_prefetch(elements[i]);
            found += elements[i] != nullptr ? 1 : 0;
        }
        cells += size;
        elements += size;
        count -= size;
    }
    return found;
}

std::size_t SparseContents::RemoveRow(int x, int y, std::size_t count) noexcept {
    const std::size_t before = m_elements.Size();
    EachPiece(x, y, count, [&](const RowPiece& piece) {
        if (!piece.block) {
            return;
        }
        m_elements.GiveRow(piece.Slots(), piece.count);
        std::fill_n(piece.Slots(), piece.count, nullptr);
        Word(piece.block, piece.cell) &= ~piece.Mask();
    });
    return before - m_elements.Size();
}

}  // namespace vex_util
