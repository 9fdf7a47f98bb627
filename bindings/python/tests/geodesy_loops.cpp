// The ellipsoid, lines on it, and covariances of positions.
#include "loops.h"

namespace {

void covariance(int (*transform)(const geo_vector*, const double*, double*), std::size_t i, In in, Out out) {
    const geo_vector position = vector(in, 0, i);
    double given[6], made[6];
    for (int k = 0; k < 6; ++k) {
        given[k] = in[3 + k][i];
    }
    transform(&position, given, made);
    for (int k = 0; k < 6; ++k) {
        out[k][i] = made[k];
    }
}

const Named LOOPS[] = {
    {"llh_to_xyz", loop_of([](std::size_t i, In in, Out out) {
         const geo_llh llh{in[0][i], in[1][i], in[2][i]};
         geo_vector xyz{};
         _llh2xyz(&llh, &xyz);
         out[0][i] = xyz.x;
         out[1][i] = xyz.y;
         out[2][i] = xyz.z;
     })},
    {"xyz_to_llh", loop_of([](std::size_t i, In in, Out out) {
         const geo_vector xyz = vector(in, 0, i);
         geo_llh llh{};
         _xyz2llh(&xyz, &llh, 5e-10);
         out[0][i] = llh.latitude;
         out[1][i] = llh.longitude;
         out[2][i] = llh.height;
     })},
    {"xyz_to_local", loop_of([](std::size_t i, In in, Out out) {
         const geo_vector origin = vector(in, 0, i);
         const geo_vector there = vector(in, 3, i);
         geo_nee end{};
         _xyz2nez(&origin, &there, &end);
         put(end, out, i);
     })},
    {"curvature_radii",
     loop_of([](std::size_t i, In in, Out out) { _wgs84curvature(in[0][i], out[0][i], out[1][i]); })},
    {"llh_equal", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = llh_equal({in[0][i], in[1][i], in[2][i]}, {in[3][i], in[4][i], in[5][i]});
     })},
    {"covariance_to_llh",
     loop_of([](std::size_t i, In in, Out out) { covariance(&Varxyz2varllh, i, in, out); })},
    {"covariance_to_neu",
     loop_of([](std::size_t i, In in, Out out) { covariance(&Varxyz2varneu, i, in, out); })},
    {"direct", loop_of([](std::size_t i, In in, Out out) {
         geo_llh end{};
         geo_vincenty_direct(place(in, 0, i), in[2][i], in[3][i], out[2][i], end);
         out[0][i] = end.latitude;
         out[1][i] = end.longitude;
     })},
    {"great_circle_distance", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_vincenty_distance(place(in, 0, i), place(in, 2, i));
     })},
    {"great_circle_bearing", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_vincenty_bearing(place(in, 0, i), place(in, 2, i));
     })},
    {"cross_track", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_vincenty_crosstrack(place(in, 0, i), place(in, 2, i), place(in, 4, i));
     })},
};

}  // namespace

Loop geodesy_loop(const char* name) {
    return loop_named(LOOPS, name);
}
