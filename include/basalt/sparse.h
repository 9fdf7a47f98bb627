/// @file
/// Sparse two-dimensional array of fixed-size elements with rectangular selection.
#ifndef BASALT_SPARSE_H
#define BASALT_SPARSE_H

#include <cstddef>

#include "basalt/export.h"

namespace basalt {
class SparseCells;
}

/// General classes.
namespace vex_util {

/// Elements of one size at integer cells (x, y) of the whole signed 32-bit plane. Memory is spent on the
/// square blocks of cells that have held an element. Element bytes are copied and never interpreted.
/// basalt::SparseGrid (basalt/sparse_grid.h) is a typed interface over it, with calls for whole rows.
///
/// Pointers handed out (Find, visits) stay valid until that cell's element is removed, or the array is
/// cleared, assigned to or destroyed. Overwriting an element keeps its address.
///
/// Failure: when the process or the shared heap is out of memory, an operation throws std::bad_alloc and
/// leaves the array as it was; only assignment may leave it empty.
///
/// Threads: thread-safe; one recursive lock per array, held by every operation to its end and while a
/// callback runs. Two arrays may be assigned to each other at the same time, also from a visit of one of
/// them. Deadlock: two threads that each visit one array and call the other. A pointer from Find is used
/// outside the lock: no other thread may remove that element, clear or assign meanwhile. Construction and
/// destruction are for one thread.
class BASALT_API Sparse2DArray {
public:
    /// An empty array.
    /// @param elementSize bytes per element; less than 8 counts as 8, and Insert then reads 8
    /// @param blockSide cells per side of a block; rounded up to a power of two, at least 1. If its blocks
    /// are too large to be allocated, every Insert throws std::bad_alloc
    /// @param elementsPerChunk elements allocated from the shared heap at a time; 0 counts as 1
    Sparse2DArray(std::size_t elementSize, std::size_t blockSide, std::size_t elementsPerChunk);

    /// An independent copy: elements, blocks (empty ones too), selection and flag.
    /// Threads: does not lock the source, which must not change meanwhile.
    Sparse2DArray(const Sparse2DArray& source);

    /// Takes over the source's parameters and copies of its elements; blocks without an element are not
    /// copied. Afterwards the selection is empty and the flag is true if there is any block. Self-assignment
    /// changes nothing. A visit of this array that is in progress ends when its callback returns.
    ///
    /// The copy is made before the old elements are released. If there is no memory for both, the old
    /// elements are released and the copy is tried again; if that fails too, std::bad_alloc is thrown and
    /// this array is empty, as after RemoveAll(). The source is unchanged in any case.
    Sparse2DArray& operator=(Sparse2DArray& source);

    /// Releases everything; no other thread may use the array any more.
    ~Sparse2DArray();

    /// Copies the element into the cell, replacing the one already there.
    /// @param x,y cell, any value
    /// @param element at least elementSize readable bytes
    /// @return true
    bool Insert(int x, int y, const void* element);

    /// The cell's element, which may be changed in place; null if the cell is empty.
    /// @param x,y cell, any value
    void* Find(int x, int y);

    /// The cell's element, read-only; null if the cell is empty.
    /// @param x,y cell, any value
    const void* Find(int x, int y) const { return const_cast<Sparse2DArray*>(this)->Find(x, y); }

    /// Empties the cell. Its block stays, and is still selected and visited.
    /// @param x,y cell, any value
    /// @return whether the cell held an element
    bool Remove(int x, int y);

    /// Returns the array to its new state with the same parameters: blocks and elements are released, the
    /// selection is empty and the flag false. A visit in progress ends when its callback returns. Cannot
    /// fail.
    void RemoveAll();

    /// Selects the blocks whose cells meet a rectangle, emptied blocks among them, in place of the old
    /// selection, and clears the selection-dirty flag.
    /// @param min,max two ints each, x then y: corner cells, both inclusive. Corners in the wrong order are
    /// applied as given: blocks with lowest x <= max x and highest x >= min x, and so for y
    /// @return whether any block was selected
    bool Select(const int* const min, const int* const max);

    /// Visits every element of the selected blocks, also those outside the rectangle: blocks in selection
    /// order, rows of a block by ascending y, cells of a row by ascending x.
    ///
    /// The callback may use this array: Find, Insert and Remove take effect at once (a cell not yet visited
    /// is visited with what it holds then); Select changes which blocks follow. RemoveAll and assignment end
    /// the visit when the callback returns. An exception of the callback propagates; the lock is released.
    /// @param visit receives x, y, the element (read-only) and context; returning false ends the visit
    /// @param context passed to the callback unchanged
    void IterateSelected(bool (*visit)(int, int, const void*, const void*), const void* context);

    /// As IterateSelected over all blocks, in the order of their creation; blocks that the callback creates
    /// are visited too. Callers should not depend on the order of blocks.
    void IterateAll(bool (*visit)(int, int, const void*, const void*), const void* context);

    /// Whether a block has been created since the last Select, so that selecting again may find more.
    /// Threads: thread-safe, without the lock.
    bool IsSelectionDirty() const;

    /// Sets the flag.
    /// Threads: thread-safe, without the lock.
    void SetSelectionDirty(bool dirty);

private:
    friend class basalt::SparseCells;
    struct Storage;

    Storage* m_storage;
};

}  // namespace vex_util

#endif
