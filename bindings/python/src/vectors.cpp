// Local vectors: x towards east, y towards north, z upwards.
#include "basalt/geo.h"
#include "basalt/geo/arrays.h"
#include "universal.h"

namespace basalt_python {

void add_vectors(pybind11::module_& m) {
    add(m, "vector_distance",
        "vector_distance(x1, y1, z1, x2, y2, z2): metres between the ends of two vectors "
        "(geo_vector_length).",
        [](double x1, double y1, double z1, double x2, double y2, double z2) {
            geo_vector a{x1, y1, z1};
            geo_vector b{x2, y2, z2};
            return geo_vector_length(a, b);
        });
    add(m, "vector_length", "vector_length(x, y, z): metres (geo_vector_len).",
        [](double x, double y, double z) {
            geo_vector v{x, y, z};
            return geo_vector_len(v);
        });
    add_blocks<2, 1>(m, "vector_bearing",
                     "vector_bearing(x, y): radians in [0, 2 pi), 0 for a vector without horizontal part "
                     "(geo_vector_direction).",
                     [](const Column* columns, std::size_t count) {
                         geo_vector in[BLOCK];
                         double all[BLOCK];
                         each_row<2>(columns, count, [&](std::size_t i, const auto& number) {
                             in[i] = {number(0), number(1), 0};
                         });
                         basalt::bearings(in, all, count);
                         write_numbers(columns[2], all, count);
                     });
    add(m, "vector_slope_angle",
        "vector_slope_angle(x, y, z): radians from the level, positive upwards (geo_vector_gradient).",
        [](double x, double y, double z) {
            geo_vector v{x, y, z};
            return geo_vector_gradient(v);
        });
    add(m, "vector_slope_angle_along_x",
        "vector_slope_angle_along_x(x, z): as vector_slope_angle seen along x; upright where x is not "
        "above 0.1 mm (geo_vector_x_component_gradient).",
        [](double x, double z) {
            geo_vector v{x, 0, z};
            return geo_vector_x_component_gradient(v);
        });
    add(m, "vector_slope_angle_along_y",
        "vector_slope_angle_along_y(y, z): as vector_slope_angle_along_x with y "
        "(geo_vector_y_component_gradient).",
        [](double y, double z) {
            geo_vector v{0, y, z};
            return geo_vector_y_component_gradient(v);
        });
}

}  // namespace basalt_python
