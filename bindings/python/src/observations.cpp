// Observations and their reduction to grid points.

#include "basalt/geo.h"
#include "basalt/geo/arrays.h"
#include "universal.h"

namespace basalt_python {

void add_observations(pybind11::module_& m) {
    add(m, "first_face",
        "first_face(horizontal, vertical): (horizontal, vertical) of an observation as on the first "
        "face, radians (geo_normalise_obs).",
        [](double horizontal, double vertical) {
            geo_hvd obs{horizontal, vertical, 0};
            geo_normalise_obs(obs);
            return std::tuple{obs.horizontal, obs.vertical};
        });
    add_blocks<8, 3>(m, "_reduce_observation", "See reduce_observation.",
                     [](const Column* columns, std::size_t count) {
                         geo_hvd observations[BLOCK];
                         geo_nee points[BLOCK];
                         double offsets[BLOCK], scales[BLOCK];
                         read_records(columns, observations, count);
                         read_records(columns + 3, points, count);
                         read_numbers(columns[6], offsets, count);
                         read_numbers(columns[7], scales, count);
                         basalt::reduce(observations, points, offsets, scales, points, count);
                         write_records(columns + 8, points, count);
                     });
    add(m, "_calculate_observation", "See calculate_observation.",
        [](double n1, double e1, double h1, double height1, double n2, double e2, double h2, double height2,
           double scale) {
            geo_hvd out{NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER};  // stays where a field is GEO_NULL
            geo_calc_obs({n1, e1, h1}, height1, {n2, e2, h2}, height2, out, scale);
            return std::tuple{out.horizontal, out.vertical, out.distance};
        });
}

}  // namespace basalt_python
