// The state of a sparse array: its lock, contents and selection.
#ifndef BASALT_SRC_SPARSE_SPARSE_ARRAY_STORAGE_H
#define BASALT_SRC_SPARSE_SPARSE_ARRAY_STORAGE_H

#include <atomic>
#include <cstdint>
#include <vector>

#include "basalt/sparse.h"
#include "src/sparse/critical_section_wrapper.h"
#include "src/sparse/sparse_contents.h"

namespace vex_util {

// Guarded by the lock, except for the selection-dirty flag.
struct Sparse2DArray::Storage {
    Storage(std::size_t elementSize, std::size_t blockSide, std::size_t elementsPerChunk)
        : contents(elementSize, blockSide, elementsPerChunk) {}
    Storage(const Storage& source)
        : contents(source.contents),
          selection(source.selection),
          selectionDirty(source.selectionDirty.load(std::memory_order_relaxed)) {}
    Storage& operator=(const Storage&) = delete;

    // Drops the selection and ends visits.
    void RenewContents(bool dirty) noexcept {
        selection.clear();
        selectionDirty.store(dirty, std::memory_order_relaxed);
        ++generation;
    }

    CriticalSectionWrapper lock;
    SparseContents contents;
    std::vector<int> selection;    // identifiers of the selected blocks, in the tree's order
    std::vector<int> found;        // result of a search, before it replaces the selection
    std::uint64_t generation = 0;  // counts clearing and assignment, which end visits
    std::atomic<bool> selectionDirty{false};
};

}  // namespace vex_util

#endif
