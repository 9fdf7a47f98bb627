// The plane: measures, predicates, local vectors.
#include "loops.h"

#include <limits>

namespace {

constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();

const Named LOOPS[] = {
    {"horizontal_distance", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_horz_dist(flat(in, 0, i), flat(in, 2, i));
     })},
    {"horizontal_distance_squared", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_horz_distSq(flat(in, 0, i), flat(in, 2, i));
     })},
    {"height_difference", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_vert_dist({0, 0, in[0][i]}, {0, 0, in[1][i]});
     })},
    {"slope_distance", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_slope_dist(point(in, 0, i), point(in, 3, i));
     })},
    {"points_equal",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = nee_equal(point(in, 0, i), point(in, 3, i)); })},
    {"distances_equal",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = geo_dist_equal(in[0][i], in[1][i]) ? 1 : 0; })},
    {"midpoint", loop_of([](std::size_t i, In in, Out out) {
         geo_nee middle{};
         geo_grid_centroid(point(in, 0, i), point(in, 3, i), middle);
         put(middle, out, i);
     })},
    {"grid_bearing", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_grid_bearing(flat(in, 0, i), flat(in, 2, i));
     })},
    {"slope_angle", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_gradient(point(in, 0, i), point(in, 3, i));
     })},
    {"grade", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_gradient2(point(in, 0, i), point(in, 3, i));
     })},
    {"triangle_area", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_triangle_area(flat(in, 0, i), flat(in, 2, i), flat(in, 4, i));
     })},
    {"normalise_bearing",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = _normalisedbearing(in[0][i]); })},
    {"divergence",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = geo_grid_divergence(in[0][i], in[1][i]); })},
    {"divergence_of_lines", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_grid_divergence(flat(in, 0, i), flat(in, 2, i), flat(in, 4, i), flat(in, 6, i));
     })},
    {"bisected_bearing",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = geo_bisected_bearing(in[0][i], in[1][i]); })},
    {"bearing_intersection", loop_of([](std::size_t i, In in, Out out) {
         geo_nee met{};
         const bool meet =
             geo_grid_bb_intersect(flat(in, 0, i), flat(in, 2, i), in[4][i], in[5][i], met) == 1;
         out[0][i] = meet ? met.north : NOT_A_NUMBER;
         out[1][i] = meet ? met.east : NOT_A_NUMBER;
     })},
    {"on_line", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_point_on_line(flat(in, 0, i), flat(in, 2, i), flat(in, 4, i), in[6][i]);
     })},
    {"lines_cross", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = geo_lines_cross(flat(in, 0, i), flat(in, 2, i), flat(in, 4, i), flat(in, 6, i));
     })},
    {"vector_distance", loop_of([](std::size_t i, In in, Out out) {
         geo_vector a = vector(in, 0, i);
         geo_vector b = vector(in, 3, i);
         out[0][i] = geo_vector_length(a, b);
     })},
    {"vector_length", loop_of([](std::size_t i, In in, Out out) {
         geo_vector v = vector(in, 0, i);
         out[0][i] = geo_vector_len(v);
     })},
    {"vector_bearing", loop_of([](std::size_t i, In in, Out out) {
         geo_vector v{in[0][i], in[1][i], 0};
         out[0][i] = geo_vector_direction(v);
     })},
    {"vector_slope_angle", loop_of([](std::size_t i, In in, Out out) {
         geo_vector v = vector(in, 0, i);
         out[0][i] = geo_vector_gradient(v);
     })},
    {"vector_slope_angle_along_x", loop_of([](std::size_t i, In in, Out out) {
         geo_vector v{in[0][i], 0, in[1][i]};
         out[0][i] = geo_vector_x_component_gradient(v);
     })},
    {"vector_slope_angle_along_y", loop_of([](std::size_t i, In in, Out out) {
         geo_vector v{0, in[0][i], in[1][i]};
         out[0][i] = geo_vector_y_component_gradient(v);
     })},
};

}  // namespace

Loop plane_loop(const char* name) {
    return loop_named(LOOPS, name);
}
