/// @file
/// The rounding error of a product without a fused multiply-add.
#ifndef BASALT_SRC_GEO_ELEMENTARY_EXACT_PRODUCT_H
#define BASALT_SRC_GEO_ELEMENTARY_EXACT_PRODUCT_H

#include "src/geo/elementary/lane.h"

namespace basalt::geo::elementary {

/// a b - near, by Dekker's halves: exact for a near = a b rounded, and to 2^-51 of itself for one within a
/// few units in the last place.
template <typename Lane>
BASALT_INLINE Lane product_less(const Lane& a, const Lane& b, const Lane& near) {
    const Lane a_head = head_of(a);
    const Lane b_head = head_of(b);
    const Lane a_tail = a - a_head;
    const Lane b_tail = b - b_head;
    return ((a_head * b_head - near) + a_head * b_tail + a_tail * b_head) + a_tail * b_tail;
}

}  // namespace basalt::geo::elementary

#endif
