#include "basalt/geo/polygon_measures.h"

#include "basalt/geo/plane.h"

namespace basalt {

namespace {

/// Vertex i is at(i).
template <class At>
double area(std::size_t count, const At& at) {
    double twice = 0.0;
    for (std::size_t i = 2; i < count; ++i) {
        const double north1 = at(i - 1).north - at(0).north;
        const double east1 = at(i - 1).east - at(0).east;
        const double north2 = at(i).north - at(0).north;
        const double east2 = at(i).east - at(0).east;
        twice += north1 * east2 - east1 * north2;
    }
    return twice * 0.5;
}

}  // namespace

double polygon_area(const geo_nee* vertices, std::size_t count) noexcept {
    return area(count, [=](std::size_t i) -> const geo_nee& { return vertices[i]; });
}

double polygon_area(const double* norths, const double* easts, std::size_t count) noexcept {
    return area(count, [=](std::size_t i) { return geo_nee{norths[i], easts[i], 0.0}; });
}

double polygon_perimeter(const geo_nee* vertices, std::size_t count) noexcept {
    double length = 0.0;
    for (std::size_t i = 0; i < count; ++i) {
        length += geo_horz_dist(vertices[i > 0 ? i - 1 : count - 1], vertices[i]);
    }
    return length;
}

}  // namespace basalt
