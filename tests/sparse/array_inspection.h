// Reaches the private storage of an array, so that tests can walk its invariants.
#ifndef BASALT_TESTS_SPARSE_ARRAY_INSPECTION_H
#define BASALT_TESTS_SPARSE_ARRAY_INSPECTION_H

#include "src/sparse/sparse_array_storage.h"

namespace vex_util::testing {

struct StorageTag {};

template <auto Member>
struct MemberAccess {
    friend auto storage_member(StorageTag /*unused*/) { return Member; }
};

auto storage_member(StorageTag tag);

// An explicit instantiation may name private members.
template struct MemberAccess<&Sparse2DArray::m_storage>;

inline void check_invariants(Sparse2DArray& array) {
    const auto* const storage = array.*storage_member(StorageTag{});
    storage->contents.CheckInvariants();
    for (const int identifier : storage->selection) {
        if (identifier < 0 || static_cast<std::size_t>(identifier) >= storage->contents.Blocks().size()) {
            throw std::logic_error("every selected identifier is that of a block");
        }
    }
}

}  // namespace vex_util::testing

#endif
