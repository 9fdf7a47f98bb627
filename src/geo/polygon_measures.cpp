#include "basalt/geo/polygon_measures.h"

#include "basalt/geo/plane.h"

namespace basalt {

double polygon_area(const geo_nee* vertices, std::size_t count) noexcept {
    double twice = 0.0;
    for (std::size_t i = 2; i < count; ++i) {
        const double north1 = vertices[i - 1].north - vertices[0].north;
        const double east1 = vertices[i - 1].east - vertices[0].east;
        const double north2 = vertices[i].north - vertices[0].north;
        const double east2 = vertices[i].east - vertices[0].east;
        twice += north1 * east2 - east1 * north2;
    }
    return twice * 0.5;
}

double polygon_perimeter(const geo_nee* vertices, std::size_t count) noexcept {
    double length = 0.0;
    for (std::size_t i = 0; i < count; ++i) {
        length += geo_horz_dist(vertices[i > 0 ? i - 1 : count - 1], vertices[i]);
    }
    return length;
}

}  // namespace basalt
