/// @file
/// Sparse two-dimensional array of fixed-size elements with rectangular selection.
#ifndef BASALT_SPARSE_H
#define BASALT_SPARSE_H

#include <cstddef>

#include "basalt/export.h"

/// General classes.
namespace vex_util {

/// Elements of one size at integer cells (x, y) of the whole signed 32-bit plane. Memory is spent on the
/// square blocks of cells that have held an element. The array copies element bytes and never interprets
/// them.
///
/// Pointers handed out (Find, visits) stay valid until that cell's element is removed, or the array is
/// cleared, assigned to or destroyed; overwriting an element keeps its address.
///
/// Failure: when memory runs out, whether the process's or the shared heap's, an operation leaves by
/// std::bad_alloc and the array is as it was before the call.
///
/// Threads: thread-safe, one recursive lock per array, held by every operation to its end and while a
/// callback runs. Two arrays may be assigned to each other at the same time, by the visitor of one of them
/// too; but two threads that each visit an array and call the other's wait for ever. A pointer from Find is
/// used outside the lock: see to it that no other thread removes, clears or assigns meanwhile. Construction
/// and destruction are for one thread.
class BASALT_API Sparse2DArray {
public:
    /// An empty array.
    /// @param elementSize bytes per element; less than 8 counts as 8, and Insert then reads 8
    /// @param blockSide cells per side of a block; rounded up to a power of two, at least 1. A side whose
    /// blocks
    ///     cannot be allocated is accepted here and makes every Insert leave by std::bad_alloc
    /// @param elementsPerChunk elements obtained from the shared heap at a time; 0 counts as 1
    Sparse2DArray(std::size_t elementSize, std::size_t blockSide, std::size_t elementsPerChunk);

    /// An independent copy: elements, blocks (empty ones too), selection and flag.
    /// Threads: does not lock the source, which must not change meanwhile.
    Sparse2DArray(const Sparse2DArray& source);

    /// Takes over the source's parameters and copies of its elements; blocks without an element are left
    /// behind. Afterwards the selection is empty and the flag tells whether there is any block. Assigning an
    /// array to itself changes nothing. Ends a visit of this array that is under way once its callback
    /// returns. The copy is made before the old elements are given up; where there is no memory for both,
    /// RemoveAll() goes first.
    Sparse2DArray& operator=(Sparse2DArray& source);

    /// Releases everything; no other thread may use the array any more.
    ~Sparse2DArray();

    /// Copies the element into the cell, over the one already there if any.
    /// @param x,y cell, any value
    /// @param element at least elementSize readable bytes
    /// @return true
    bool Insert(int x, int y, const void* element);

    /// The cell's element, which may be changed in place; null if the cell is empty.
    /// @param x,y cell, any value
    void* Find(int x, int y);

    /// Empties the cell. Its block stays, and is still selected and visited.
    /// @param x,y cell, any value
    /// @return whether the cell held an element
    bool Remove(int x, int y);

    /// Back to the new state with the same parameters: all memory is given back, the selection is empty and
    /// the flag false. Ends a visit that is under way once its callback returns. Cannot fail.
    void RemoveAll();

    /// Selects the blocks whose cells meet a rectangle, emptied blocks among them, replacing the old
    /// selection, and lowers the selection-dirty flag.
    /// @param min,max two ints each, x then y: corner cells, both inclusive. A corner beyond the other is
    /// applied
    ///     as given: blocks with lowest x <= max x and highest x >= min x, and so for y
    /// @return whether any block was selected
    bool Select(const int* const min, const int* const max);

    /// Visits every element of the selected blocks, also those outside the rectangle: blocks in selection
    /// order, in a block rows of ascending y, in a row ascending x.
    ///
    /// The callback may use this array: Find, Insert and Remove take effect at once (a cell ahead in the
    /// visit is visited by what it holds then); Select changes which blocks follow. RemoveAll and assignment
    /// end the visit when the callback returns. An exception of the callback passes out, with the lock
    /// released.
    /// @param visit gets x, y, the element (read-only) and context; false ends the visit
    /// @param context passed through, never looked at
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
    struct Storage;

    Storage* m_storage;
};

}  // namespace vex_util

#endif
