// The measure of the R-tree: the volume of a rectangle's circumscribed sphere.
#ifndef BASALT_SRC_SPARSE_RTREE_VOLUME_H
#define BASALT_SRC_SPARSE_RTREE_VOLUME_H

#include "src/sparse/rtree_node.h"
#include "src/sparse/rtree_simd.h"

namespace vex_util::rtree {

// 0x40490FDC, one unit in the last place above the float nearest to pi.
inline constexpr float UNIT_SPHERE_VOLUME = 3.141593F;

// Four rectangles with coordinates rounded to float. Rounding is monotonic, so combining rounded coordinates
// gives the same volume.
struct Rect4 {
    Float4 minX, minY, maxX, maxY;
};

inline Rect4 combine(const Rect4& a, const Rect4& b) {
    return {min4(a.minX, b.minX), min4(a.minY, b.minY), max4(a.maxX, b.maxX), max4(a.maxY, b.maxY)};
}

// One rectangle four times.
inline Rect4 all4(const Rect& r) {
    return {to_float(all4(r.minX)), to_float(all4(r.minY)), to_float(all4(r.maxX)), to_float(all4(r.maxY))};
}

// Entries first .. first + 3 of a node; those from its count on are undefined.
inline Rect4 load_rects(const Node& node, int first) {
    return {to_float(load4(node.minX + first)), to_float(load4(node.minY + first)),
            to_float(load4(node.maxX + first)), to_float(load4(node.maxY + first))};
}

// The order of operations is part of the tree's behaviour: ties are decided by exact equality.
inline Float4 spherical_volume(const Rect4& r) {
    const Float4 h0 = (r.maxX - r.minX) * 0.5F;
    const Float4 h1 = (r.maxY - r.minY) * 0.5F;
    const Float4 radius = sqrt4(h0 * h0 + h1 * h1);
    return (radius * radius) * UNIT_SPHERE_VOLUME;
}

}  // namespace vex_util::rtree

#endif
