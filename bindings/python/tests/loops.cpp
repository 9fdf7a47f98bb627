// The library's functions in plain loops over arrays, for the bindings to be held against: results and speed.
// Columns of doubles in and out; whole numbers travel in them exactly.
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "basalt/geo.h"

namespace {

using In = const double* const*;
using Out = double* const*;
using Loop = void (*)(std::size_t, In, Out);

struct Named {
    const char* name;
    Loop loop;
};

template <class Body>
constexpr Loop loop_of(Body) {
    return [](std::size_t count, In in, Out out) {
        for (std::size_t i = 0; i < count; ++i) {
            Body{}(i, in, out);
        }
    };
}

geo_nee point(In in, int first, std::size_t i) {
    return {in[first][i], in[first + 1][i], in[first + 2][i]};
}

const Named LOOPS[] = {
    {"horizontal_distance", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_horz_dist({in[0][i], in[1][i], 0}, {in[2][i], in[3][i], 0});
     })},
    {"slope_distance", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_slope_dist(point(in, 0, i), point(in, 3, i));
     })},
    {"grid_bearing", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_grid_bearing({in[0][i], in[1][i], 0}, {in[2][i], in[3][i], 0});
     })},
    {"triangle_area", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] =
             geo_triangle_area({in[0][i], in[1][i], 0}, {in[2][i], in[3][i], 0}, {in[4][i], in[5][i], 0});
     })},
    {"normalise_bearing",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = _normalisedbearing(in[0][i]); })},
    {"follow", loop_of([](std::size_t i, In in, Out out) {
         geo_nee end{};
         geo_grid_follow(point(in, 0, i), in[3][i], in[4][i], in[5][i], end);
         out[0][i] = end.north;
         out[1][i] = end.east;
         out[2][i] = end.elevation;
     })},
    {"reduce_observation", loop_of([](std::size_t i, In in, Out out) {
         geo_nee end{};
         geo_reduce_obs({in[0][i], in[1][i], in[2][i]}, point(in, 3, i), in[6][i], end, in[7][i]);
         out[0][i] = end.north;
         out[1][i] = end.east;
         out[2][i] = end.elevation;
     })},
    {"llh_to_xyz", loop_of([](std::size_t i, In in, Out out) {
         const geo_llh llh{in[0][i], in[1][i], in[2][i]};
         geo_vector xyz{};
         _llh2xyz(&llh, &xyz);
         out[0][i] = xyz.x;
         out[1][i] = xyz.y;
         out[2][i] = xyz.z;
     })},
    {"xyz_to_llh", loop_of([](std::size_t i, In in, Out out) {
         const geo_vector xyz{in[0][i], in[1][i], in[2][i]};
         geo_llh llh{};
         _xyz2llh(&xyz, &llh, 5e-10);
         out[0][i] = llh.latitude;
         out[1][i] = llh.longitude;
         out[2][i] = llh.height;
     })},
    {"direct", loop_of([](std::size_t i, In in, Out out) {
         geo_llh end{};
         geo_vincenty_direct({in[0][i], in[1][i], 0}, in[2][i], in[3][i], out[2][i], end);
         out[0][i] = end.latitude;
         out[1][i] = end.longitude;
     })},
    {"great_circle_distance", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_vincenty_distance({in[0][i], in[1][i], 0}, {in[2][i], in[3][i], 0});
     })},
    {"cross_track", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_vincenty_crosstrack({in[0][i], in[1][i], 0}, {in[2][i], in[3][i], 0},
                                             {in[4][i], in[5][i], 0});
     })},
    {"mjd_to_gps", loop_of([](std::size_t i, In in, Out out) {
         std::uint16_t week = 0;
         _mjd2gps(static_cast<std::uint32_t>(in[0][i]), in[1][i], week, out[1][i]);
         out[0][i] = week;
     })},
    {"radians_to_dms", loop_of([](std::size_t i, In in, Out out) {
         int degrees = 0, minutes = 0;
         _radtodms(in[0][i], &degrees, &minutes, &out[2][i]);
         out[0][i] = degrees;
         out[1][i] = minutes;
     })},
};

}  // namespace

// False for a name that is not there.
extern "C" bool run_loop(const char* name, std::size_t count, In in, Out out) {
    for (const Named& named : LOOPS) {
        if (std::strcmp(named.name, name) == 0) {
            named.loop(count, in, out);
            return true;
        }
    }
    return false;
}

// Points against one outline, gathered once, as a C++ caller has it.
extern "C" void in_polygon_loop(std::size_t count, In points, std::size_t vertices, const geo_nee* outline,
                                bool* inside) {
    for (std::size_t i = 0; i < count; ++i) {
        const geo_nee here{points[0][i], points[1][i], 0};
        inside[i] = geo_point_in_poly(static_cast<int>(vertices), outline, &here) != 0;
    }
}
