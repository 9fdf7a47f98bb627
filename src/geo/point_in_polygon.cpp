#include "basalt/geo/plane.h"
#include "src/geo/polygon_edges.h"

using namespace basalt::geo;

namespace {

template <VertexTest TEST>
int crossing_parity(int n, const geo_nee* polygon, const geo_nee& point) {
#if BASALT_HAS_AVX2_FORM
    if (n >= 5 && can_use_avx2()) {
        return crossing_parity_avx2<TEST>(n, polygon, point);
    }
#endif
    return crossing_parity_portable<TEST>(n, polygon, point);
}

bool is_in_a_band(int n, const geo_nee* polygon, const geo_nee& point, double tolerance) {
    // The closing edge: its ends are not adjacent in memory.
    const geo_nee& first = polygon[0];
    const geo_nee& last = polygon[n - 1];
    if (may_be_in_band(last, first, point, band_reach(tolerance)) &&
        geo_point_on_line(first, last, point, tolerance) == 1) {
        return true;
    }
#if BASALT_HAS_AVX2_FORM
    if (n >= 5 && can_use_avx2()) {
        return is_in_a_band_avx2(n, polygon, point, tolerance);
    }
#endif
    return is_in_a_band_portable(n, polygon, point, tolerance);
}

}  // namespace

int geo_point_in_poly(int n, const geo_nee* polygon, const geo_nee* point) {
    return n < 1 ? 0 : crossing_parity<VertexTest::YES>(n, polygon, *point);
}

int geo_point_in_poly_2(int n, const geo_nee* polygon, const geo_nee* point, double tolerance) {
    if (n < 1) {
        return 0;
    }
    // A negative or NaN tolerance has no band. Bands first: a hit decides, whatever the crossings.
    if (tolerance >= 0.0 && is_in_a_band(n, polygon, *point, tolerance)) {
        return 1;
    }
    return crossing_parity<VertexTest::NO>(n, polygon, *point);
}
