/// @file
/// Calls on rows, windows and many cells of a sparse array.
#ifndef BASALT_SPARSE_CELLS_H
#define BASALT_SPARSE_CELLS_H

#include <cstddef>
#include <cstdint>

#include "basalt/export.h"
#include "basalt/sparse.h"

namespace basalt {

/// A rectangle of cells; all four bounds are inclusive. A min above its max makes it empty.
struct GridWindow {
    int min_x;  ///< first column
    int min_y;  ///< first row
    int max_x;  ///< last column
    int max_y;  ///< last row
};

/// A cell of a grid.
struct GridCell {
    int x;  ///< column
    int y;  ///< row
};

/// Calls on many cells of a vex_util::Sparse2DArray, each under one lock. SparseGrid is the typed interface
/// to them; both may be mixed with the array's own calls, which they equal in results.
///
/// A row is the cells (x, y), (x + 1, y) ... (x + count - 1, y); cells beyond x = 2^31 - 1 are ignored.
/// `size` is the bytes from one of the caller's elements to the next: the array's element size, or less for
/// elements of less than 8 bytes.
///
/// Cost of a row: one look-up for each block that it crosses, filled or not.
/// Failure: std::bad_alloc, with the array unchanged. Threads: thread-safe, as the array.
class BASALT_API SparseCells {
public:
    using Array = vex_util::Sparse2DArray;  ///< the array of all calls

    /// Inserts a row.
    ///
    /// Blocks are created by ascending x. Slots are taken in the order in which Insert takes them, for the
    /// cells of one block from the last to the first (in blocks wider than 64, for each 64 cells, counted
    /// from the block's edge): a row inserted into empty cells ascends in memory.
    /// @param elements of the cells in order of x, outside the array
    static void insert_row(Array& array, int x, int y, const void* elements, std::size_t size,
                           std::size_t count);

    /// Copies the elements of a row.
    /// @param elements,filled one for each cell; `filled` may be null. Elements of empty cells are not
    /// written
    /// @return how many cells are filled
    static std::size_t copy_row(const Array& array, int x, int y, void* elements, std::size_t size,
                                bool* filled, std::size_t count);

    /// Finds the elements of a row.
    /// @param elements one for each cell; null where it is empty
    /// @return how many cells are filled
    static std::size_t find_row(Array& array, int x, int y, void** elements, std::size_t count);

    /// Empties the cells of a row by ascending x.
    /// @return how many cells were filled
    static std::size_t remove_row(Array& array, int x, int y, std::size_t count);

    /// Finds cells in any order; their cache misses overlap.
    /// @param elements one for each cell; null where it is empty
    /// @return how many cells are filled
    static std::size_t find(Array& array, const GridCell* cells, void** elements, std::size_t count);

    /// Calls `change` with the cell's element, or with null if the cell is empty. A result other than null is
    /// then inserted. An exception of `change` propagates.
    static void update(Array& array, int x, int y, const void* (*change)(void* element, void* context),
                       void* context);

    /// Cells of one row and one block: for each bit i that is set in both `*filled` and `wanted`, cell
    /// (x + i, y) with element `elements[i]`. After a change of `*generation` neither may be read.
    struct Row {
        int x;                            ///< of bit 0
        int y;                            ///< of all
        void* const* elements;            ///< one for each bit
        const std::uint64_t* filled;      ///< cells that hold an element
        std::uint64_t wanted;             ///< cells of the window
        const std::uint64_t* generation;  ///< changes when the array is cleared
    };

    /// Visits the rows with filled cells: of the whole array, blocks in the order of their creation, or of a
    /// window, blocks in the order of Select. In a block by ascending y.
    /// @param window null for the whole array
    /// @param visit may change the array as a visitor of IterateAll may; returning false ends the visit
    static void visit(Array& array, const GridWindow* window, bool (*visit)(const Row& row, void* context),
                      void* context);

    /// How many cells are filled.
    static std::size_t size(const Array& array);

private:
    template <class Work>
    static auto locked(const Array& array, Work work);
};

}  // namespace basalt

#endif
