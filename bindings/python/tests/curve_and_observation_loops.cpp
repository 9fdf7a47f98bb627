// Arcs, spirals, bearings followed, observations.
#include "loops.h"

namespace {

const Named LOOPS[] = {
    {"arc_length",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = geo_arc_angle_to_length(in[0][i], in[1][i]); })},
    {"arc_angle",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = geo_arc_length_to_angle(in[0][i], in[1][i]); })},
    {"arc_half_chord",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = geo_arc_to_chord(in[0][i], in[1][i]); })},
    {"spiral_deflection",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = geo_spiral_deflection(in[0][i], in[1][i]); })},
    {"spiral_deltas", loop_of([](std::size_t i, In in, Out out) {
         geo_spiral_deltas(in[0][i], in[1][i], in[2][i], out[0][i], out[1][i]);
     })},
    {"follow", loop_of([](std::size_t i, In in, Out out) {
         geo_nee end{};
         geo_grid_follow(point(in, 0, i), in[3][i], in[4][i], in[5][i], end);
         put(end, out, i);
     })},
    {"follow_grade", loop_of([](std::size_t i, In in, Out out) {
         geo_nee end{};
         geo_grid_follow2(point(in, 0, i), in[3][i], in[4][i], in[5][i], end);
         put(end, out, i);
     })},
    {"follow_height_change", loop_of([](std::size_t i, In in, Out out) {
         geo_nee end{};
         geo_grid_follow3(point(in, 0, i), in[3][i], in[4][i], in[5][i], end);
         put(end, out, i);
     })},
    {"first_face", loop_of([](std::size_t i, In in, Out out) {
         geo_hvd obs{in[0][i], in[1][i], 0};
         geo_normalise_obs(obs);
         out[0][i] = obs.horizontal;
         out[1][i] = obs.vertical;
     })},
    {"reduce_observation", loop_of([](std::size_t i, In in, Out out) {
         geo_nee end{};
         geo_reduce_obs({in[0][i], in[1][i], in[2][i]}, point(in, 3, i), in[6][i], end, in[7][i]);
         put(end, out, i);
     })},
    {"calculate_observation", loop_of([](std::size_t i, In in, Out out) {
         geo_hvd obs{};
         geo_calc_obs(point(in, 0, i), in[6][i], point(in, 3, i), in[7][i], obs, in[8][i]);
         out[0][i] = obs.horizontal;
         out[1][i] = obs.vertical;
         out[2][i] = obs.distance;
     })},
};

}  // namespace

Loop curve_and_observation_loop(const char* name) {
    return loop_named(LOOPS, name);
}
