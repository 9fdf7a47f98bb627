// Records what a visit reports.
#ifndef BASALT_TESTS_SPARSE_VISIT_RECORDER_H
#define BASALT_TESTS_SPARSE_VISIT_RECORDER_H

#include <cstdint>
#include <cstring>
#include <functional>
#include <ostream>
#include <vector>

#include "basalt/sparse.h"

namespace vex_util::testing {

struct Visited {
    int x;
    int y;
    std::uint64_t value;
    bool operator==(const Visited&) const = default;
    friend std::ostream& operator<<(std::ostream& out, const Visited& v) {
        return out << '(' << v.x << ", " << v.y << ")=" << v.value;
    }
};

inline std::uint64_t value_at(const void* element) {
    std::uint64_t value = 0;
    std::memcpy(&value, element, sizeof value);
    return value;
}

// Calls back with each element; answering false ends the visit.
using Visitor = std::function<bool(const Visited&)>;

inline bool call_visitor(int x, int y, const void* element, const void* context) {
    return (*static_cast<const Visitor*>(context))({x, y, value_at(element)});
}

inline std::vector<Visited> visit_selected(Sparse2DArray& array) {
    std::vector<Visited> all;
    const Visitor record = [&](const Visited& v) { return all.push_back(v), true; };
    array.IterateSelected(call_visitor, &record);
    return all;
}

inline std::vector<Visited> visit_all(Sparse2DArray& array) {
    std::vector<Visited> all;
    const Visitor record = [&](const Visited& v) { return all.push_back(v), true; };
    array.IterateAll(call_visitor, &record);
    return all;
}

inline void insert_value(Sparse2DArray& array, int x, int y, std::uint64_t value) {
    array.Insert(x, y, &value);
}

inline bool select(Sparse2DArray& array, int minX, int minY, int maxX, int maxY) {
    const int min[2] = {minX, minY};
    const int max[2] = {maxX, maxY};
    return array.Select(min, max);
}

}  // namespace vex_util::testing

#endif
