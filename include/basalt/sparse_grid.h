/// @file
/// Sparse grid of values of one type, with calls for rows, windows and many cells at once.
#ifndef BASALT_SPARSE_GRID_H
#define BASALT_SPARSE_GRID_H

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <new>
#include <type_traits>

#include "basalt/sparse_cells.h"

namespace basalt {

/// Values of a trivially copyable type at integer cells (x, y) of the whole signed 32-bit plane; memory is
/// spent on the square blocks of cells that have held one.
///
/// Pointers and references to values stay valid until the cell is removed, or the grid is cleared, assigned
/// to or destroyed; overwriting and moving the grid keep them. A moved-from grid is empty.
///
/// Failure: std::bad_alloc, with the grid unchanged.
///
/// Threads: thread-safe as vex_util::Sparse2DArray, except construction, destruction, moving, and the first
/// call on a moved-from grid. Each call takes the lock once, and holds it while a function of the caller
/// runs. That function may use the same grid, cells not yet visited are visited with what they hold then, and
/// clear() ends a visit when the function returns. Its exceptions propagate.
template <class T>
class SparseGrid {
    static_assert(std::is_trivially_copyable_v<T>, "values are copied as bytes");
    static_assert(alignof(T) <= alignof(std::max_align_t), "slots have the alignment of the heap");

public:
    /// An empty grid. Throws std::bad_alloc.
    /// @param block_side cells per side of a block; rounded up to a power of two, at least 1
    /// @param elements_per_chunk values allocated at a time; 0 counts as 1
    explicit SparseGrid(std::size_t block_side = 16, std::size_t elements_per_chunk = 64)
        : m_block_side(block_side), m_elements_per_chunk(elements_per_chunk) {
        array();
    }
    /// Moves leave an empty grid.
    SparseGrid(SparseGrid&&) noexcept = default;
    /// As above.
    SparseGrid& operator=(SparseGrid&&) noexcept = default;
    ~SparseGrid() = default;

    /// Copies the value into the cell, replacing the one already there.
    void insert(int x, int y, const T& value) {
        if constexpr (sizeof(T) >= sizeof(void*)) {
            array().Insert(x, y, &value);
        } else {
            unsigned char slot[SLOT] = {};
            std::memcpy(slot, &value, sizeof(T));
            array().Insert(x, y, slot);
        }
    }

    /// The cell's value, which may be changed in place; null if the cell is empty.
    T* find(int x, int y) { return m_array ? static_cast<T*>(m_array->Find(x, y)) : nullptr; }
    /// As above.
    const T* find(int x, int y) const {
        return m_array ? static_cast<const T*>(m_array->Find(x, y)) : nullptr;
    }

    /// Calls f(T&) with the cell's value, or with T{} that is then inserted if the cell was empty. When f
    /// throws, an empty cell stays empty. f must not remove the cell or clear the grid.
    template <class F>
    void update(int x, int y, F f) {
        struct Context {
            F& f;
            alignas(T) unsigned char fresh[SLOT] = {};
        } context{f};
        SparseCells::update(
            array(), x, y,
            [](void* element, void* at) -> const void* {
                Context& c = *static_cast<Context*>(at);
                if (element != nullptr) {
                    c.f(*static_cast<T*>(element));
                    return nullptr;
                }
                c.f(*::new (c.fresh) T{});
                return c.fresh;
            },
            &context);
    }

    /// Empties the cell.
    /// @return whether it was filled
    bool remove(int x, int y) { return m_array && m_array->Remove(x, y); }

    /// Calls f(int x, int y, T&) for every filled cell: blocks in the order of their creation, rows of a
    /// block by ascending y, cells of a row by ascending x. Blocks that f creates are visited too.
    template <class F>
    void for_each(F f) {
        visit<T, false>(nullptr, f);
    }
    /// As above.
    template <class F>
    void for_each(F f) const {
        visit<const T, false>(nullptr, f);
    }

    /// The same for the filled cells of a window, blocks in the order of Sparse2DArray::Select. Blocks that f
    /// creates are not visited.
    template <class F>
    void for_each(const GridWindow& window, F f) {
        visit<T, false>(&window, f);
    }
    /// As above.
    template <class F>
    void for_each(const GridWindow& window, F f) const {
        visit<const T, false>(&window, f);
    }

    /// Calls f(int x, int y, T* values, std::size_t count) for every run of filled cells (x, y) ...
    /// (x + count - 1, y) whose values adjoin in memory, of one row and one block, 64 cells at most. Rows
    /// that were inserted as such are long runs. The order is that of for_each.
    template <class F>
    void for_each_span(F f) {
        visit<T, true>(nullptr, f);
    }
    /// As above.
    template <class F>
    void for_each_span(const GridWindow& window, F f) {
        visit<T, true>(&window, f);
    }

    /// Inserts values[i] at cell (x + i, y); cells beyond x = 2^31 - 1 are ignored. For the order of slots
    /// see SparseCells::insert_row.
    /// @param values outside the grid
    void insert_row(int x, int y, const T* values, std::size_t count) {
        SparseCells::insert_row(array(), x, y, values, sizeof(T), count);
    }

    /// Copies the value of cell (x + i, y) to values[i] if it is filled, and reports in filled[i] whether it
    /// is.
    /// @param filled may be null
    /// @return how many are filled
    std::size_t copy_row(int x, int y, std::size_t count, T* values, bool* filled) const {
        if (m_array) {
            return SparseCells::copy_row(*m_array, x, y, values, sizeof(T), filled, count);
        }
        for (std::size_t i = 0; filled != nullptr && i < count; ++i) {
            filled[i] = false;
        }
        return 0;
    }

    /// Empties cells (x, y) ... (x + count - 1, y).
    /// @return how many were filled
    std::size_t remove_row(int x, int y, std::size_t count) {
        return m_array ? SparseCells::remove_row(*m_array, x, y, count) : 0;
    }

    /// Finds cells (x, y) ... (x + count - 1, y), as find does.
    /// @return how many are filled
    std::size_t find_row(int x, int y, std::size_t count, T** values) {
        return SparseCells::find_row(array(), x, y, reinterpret_cast<void**>(values), count);
    }

    /// Finds many cells in any order, as find does; on a large grid faster than one by one, because their
    /// cache misses overlap.
    /// @return how many are filled
    std::size_t find_cells(const GridCell* cells, std::size_t count, T** values) {
        return SparseCells::find(array(), cells, reinterpret_cast<void**>(values), count);
    }

    /// How many cells are filled.
    std::size_t size() const { return m_array ? SparseCells::size(*m_array) : 0; }

    /// Empties the grid and releases its memory.
    void clear() {
        if (m_array) {
            m_array->RemoveAll();
        }
    }

private:
    static constexpr std::size_t SLOT = sizeof(T) < sizeof(void*) ? sizeof(void*) : sizeof(T);

    vex_util::Sparse2DArray& array() {
        if (!m_array) {
            m_array =
                std::make_unique<vex_util::Sparse2DArray>(sizeof(T), m_block_side, m_elements_per_chunk);
        }
        return *m_array;
    }

    // Spans: f takes runs of values; otherwise single ones.
    template <class Value, bool Spans, class F>
    void visit(const GridWindow* window, F& f) const {
        if (m_array) {
            SparseCells::visit(
                *m_array, window,
                [](const SparseCells::Row& row, void* at) {
                    return visit_row<Value, Spans>(row, *static_cast<F*>(at));
                },
                std::addressof(f));
        }
    }

    template <class Value, bool Spans, class F>
    static bool visit_row(const SparseCells::Row& row, F& f) {
        const std::uint64_t generation = *row.generation;
        std::uint64_t left = row.wanted;
        // The bits are read again after each call of f, which may have changed them.
        while (const std::uint64_t bits = *row.filled & left) {
            const int first = __builtin_ctzll(bits);
            auto* const value = static_cast<Value*>(row.elements[first]);
            const int x = static_cast<int>(static_cast<unsigned>(row.x) + static_cast<unsigned>(first));
            int end = first + 1;
            if constexpr (Spans) {
                while (end < 64 && (bits >> end & 1) != 0 && row.elements[end] == value + (end - first)) {
                    ++end;
                }
                f(x, row.y, value, static_cast<std::size_t>(end - first));
            } else {
                f(x, row.y, *value);
            }
            if (*row.generation != generation) {
                return false;
            }
            left &= end < 64 ? ~std::uint64_t{0} << end : 0;
        }
        return true;
    }

    std::unique_ptr<vex_util::Sparse2DArray> m_array;  // null in a moved-from grid
    std::size_t m_block_side;
    std::size_t m_elements_per_chunk;
};

}  // namespace basalt

#endif
