// Short forms of the sparse array's calls for elements of 8 bytes, and recorded visits.
#ifndef BASALT_TESTS_SPARSE_VISIT_RECORDER_H
#define BASALT_TESTS_SPARSE_VISIT_RECORDER_H

#include <cstdint>
#include <cstring>
#include <functional>
#include <vector>

#include "basalt/sparse.h"

namespace vex_util::testing {

struct Visited {
    int x, y;
    std::uint64_t value;
    bool operator==(const Visited&) const = default;
};
using Visits = std::vector<Visited>;

inline std::uint64_t value_at(const void* element) {
    std::uint64_t value = 0;
    std::memcpy(&value, element, sizeof value);
    return value;
}

inline void insert_value(Sparse2DArray& array, int x, int y, std::uint64_t value) {
    array.Insert(x, y, &value);
}

inline bool select(Sparse2DArray& array, int min_x, int min_y, int max_x, int max_y) {
    const int min[2] = {min_x, min_y}, max[2] = {max_x, max_y};
    return array.Select(min, max);
}

// Receives each element; false ends the visit.
using Visitor = std::function<bool(const Visited&)>;

// Visits all elements, or those of the selected blocks.
inline void visit(Sparse2DArray& array, bool all, const Visitor& visitor) {
    const auto call = [](int x, int y, const void* element, const void* context) {
        return (*static_cast<const Visitor*>(context))({x, y, value_at(element)});
    };
    all ? array.IterateAll(call, &visitor) : array.IterateSelected(call, &visitor);
}

inline Visits visits(Sparse2DArray& array, bool all) {
    Visits seen;
    visit(array, all, [&](const Visited& v) { return seen.push_back(v), true; });
    return seen;
}
}  // namespace vex_util::testing

#endif
