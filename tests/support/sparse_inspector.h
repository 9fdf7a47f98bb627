// Looks into a sparse array: its invariants, and the slots of its elements.
#ifndef BASALT_TESTS_SUPPORT_SPARSE_INSPECTOR_H
#define BASALT_TESTS_SUPPORT_SPARSE_INSPECTOR_H

#include <cstdint>
#include <unordered_set>
#include <vector>

#include "fuzz/input.h"
#include "src/sparse/sparse_array_storage.h"

namespace vex_util {

using basalt::fuzz::require;

struct SparseInspector {
    // Ends the program at the first broken invariant.
    static void check(const SparseContents& contents, const std::vector<int>& selection) {
        const ElementPool& pool = contents.m_elements;
        const std::size_t cells = contents.m_grid.CellsPerBlock();
        std::unordered_set<const void*> slots(pool.m_free, pool.m_free + pool.m_freeCount);
        require(slots.size() == pool.m_freeCount);  // a free slot is listed once
        require(contents.m_index.Count() == contents.m_list.size());
        for (std::size_t i = 0; i < contents.m_list.size(); ++i) {
            const auto& [key, block] = contents.m_list[i];
            require(contents.m_index.Find(key).cells == block.cells);
            for (std::size_t cell = 0; cell < cells; ++cell) {
                const bool filled = (contents.Filled(block)[cell / 64] >> cell % 64 & 1) != 0;
                require(filled == (block.cells[cell] != nullptr));
                require(!filled || slots.insert(block.cells[cell]).second);  // a slot is free or in one cell
            }
            const int min[2] = {contents.m_grid.X(key, 0), contents.m_grid.Y(key, 0)};
            const int max[2] = {contents.m_grid.X(key, cells - 1), contents.m_grid.Y(key, cells - 1)};
            std::vector<int> found;
            contents.m_tree.Search(min, max, found);
            require(found == std::vector<int>{static_cast<int>(i)});
        }
        const std::size_t each = pool.m_elementsPerChunk, all = pool.m_chunks.size() * each;
        require(pool.m_chunks.size() == pool.m_opened);  // none stays reserved
        require(slots.size() + pool.m_unused == all);    // every slot is free, in a cell or unused
        require(pool.Size() == slots.size() - pool.m_freeCount && all <= pool.FreeCapacity());
        for (const int block : selection) {
            require(block >= 0 && static_cast<std::size_t>(block) < contents.m_list.size());
        }
    }

    // The number of the element's slot, counted from the first chunk's slot 0.
    static std::size_t slot(const SparseContents& contents, const void* element) {
        const std::size_t size = contents.ElementSize();
        for (std::size_t chunk = 0; chunk < contents.m_elements.m_chunks.size(); ++chunk) {
            const auto offset = reinterpret_cast<std::uintptr_t>(element) -
                                reinterpret_cast<std::uintptr_t>(contents.m_elements.m_chunks[chunk]);
            if (offset < size * contents.ElementsPerChunk() && offset % size == 0) {
                return chunk * contents.ElementsPerChunk() + offset / size;
            }
        }
        return require(false), 0;
    }
};

namespace testing {

// An explicit instantiation may name the private member.
struct StorageTag {};
auto storage_member(StorageTag);
template <auto Member>
struct MemberAccess {
    friend auto storage_member(StorageTag /*unused*/) { return Member; }
};
template struct MemberAccess<&Sparse2DArray::m_storage>;

inline void check_invariants(const Sparse2DArray& array) {
    const auto* const storage = array.*storage_member(StorageTag{});
    SparseInspector::check(storage->contents, storage->selection);
}

inline std::size_t slot_of(const Sparse2DArray& array, const void* element) {
    return SparseInspector::slot((array.*storage_member(StorageTag{}))->contents, element);
}

}  // namespace testing
}  // namespace vex_util

#endif
