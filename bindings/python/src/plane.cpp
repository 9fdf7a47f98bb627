// Measures of the plane, curves and the intersection of bearings.
#include <cstddef>

#include "basalt/geo.h"
#include "basalt/geo/arrays.h"
#include "universal.h"

namespace basalt_python {

namespace {

using Point = std::tuple<double, double, double>;

geo_nee flat(double north, double east) {
    return {north, east, 0};
}

// Bearings from the points of the first two columns to those of the next.
void read_bearings(const Column* columns, double* bearings, std::size_t count) {
    geo_nee from[BLOCK], to[BLOCK];
    each_row<4>(columns, count, [&](std::size_t i, const auto& number) {
        from[i] = flat(number(0), number(1));
        to[i] = flat(number(2), number(3));
    });
    basalt::bearings(from, to, bearings, count);
}

// Arguments: a point, a bearing, a distance and what gives the height; the point reached.
template <auto FOLLOW>
void add_follow(pybind11::module_& m, const char* name, const char* text) {
    add_blocks<6, 3>(m, name, text, [](const Column* columns, std::size_t count) {
        geo_nee points[BLOCK];
        double bearings[BLOCK], distances[BLOCK], rises[BLOCK];
        read_records(columns, points, count);
        read_numbers(columns[3], bearings, count);
        read_numbers(columns[4], distances, count);
        read_numbers(columns[5], rises, count);
        FOLLOW(points, bearings, distances, rises, points, count);
        write_records(columns + 6, points, count);
    });
}

}  // namespace

void add_plane(pybind11::module_& m) {
    add(m, "horizontal_distance",
        "horizontal_distance(north1, east1, north2, east2): metres (geo_horz_dist).",
        [](double n1, double e1, double n2, double e2) { return geo_horz_dist(flat(n1, e1), flat(n2, e2)); });
    add(m, "horizontal_distance_squared",
        "horizontal_distance_squared(north1, east1, north2, east2): square metres (geo_horz_distSq).",
        [](double n1, double e1, double n2, double e2) {
            return geo_horz_distSq(flat(n1, e1), flat(n2, e2));
        });
    add(m, "height_difference",
        "height_difference(elevation1, elevation2): metres, positive where the second is higher "
        "(geo_vert_dist).",
        [](double h1, double h2) {
            return geo_vert_dist({0, 0, h1}, {0, 0, h2});
        });
    add(m, "points_equal",
        "points_equal(north1, east1, elevation1, north2, east2, elevation2): whether each differs by less "
        "than 0.5 mm (nee_equal).",
        [](double n1, double e1, double h1, double n2, double e2, double h2) {
            return nee_equal({n1, e1, h1}, {n2, e2, h2}) != 0;
        });
    add(m, "distances_equal",
        "distances_equal(distance1, distance2): whether they differ by less than 0.5 mm, or both are "
        "GEO_NULL (geo_dist_equal).",
        [](double a, double b) { return geo_dist_equal(a, b); });
    add(m, "midpoint",
        "midpoint(north1, east1, elevation1, north2, east2, elevation2): (north, east, elevation); "
        "GEO_NULL where either point's is (geo_grid_centroid).",
        [](double n1, double e1, double h1, double n2, double e2, double h2) {
            geo_nee out{};
            geo_grid_centroid({n1, e1, h1}, {n2, e2, h2}, out);
            return Point{out.north, out.east, out.elevation};
        });
    add(m, "slope_distance",
        "slope_distance(north1, east1, elevation1, north2, east2, elevation2): metres (geo_slope_dist).",
        [](double n1, double e1, double h1, double n2, double e2, double h2) {
            return geo_slope_dist({n1, e1, h1}, {n2, e2, h2});
        });
    add_blocks<4, 1>(m, "grid_bearing",
                     "grid_bearing(north1, east1, north2, east2): radians in [0, 2 pi), 0 for equal points "
                     "(geo_grid_bearing).",
                     [](const Column* columns, std::size_t count) {
                         double all[BLOCK];
                         read_bearings(columns, all, count);
                         write_numbers(columns[4], all, count);
                     });
    add(m, "slope_angle",
        "slope_angle(north1, east1, elevation1, north2, east2, elevation2): radians from the level, "
        "positive uphill (geo_gradient).",
        [](double n1, double e1, double h1, double n2, double e2, double h2) {
            return geo_gradient({n1, e1, h1}, {n2, e2, h2});
        });
    add(m, "grade",
        "grade(north1, east1, elevation1, north2, east2, elevation2): rise over run, positive uphill "
        "(geo_gradient2).",
        [](double n1, double e1, double h1, double n2, double e2, double h2) {
            return geo_gradient2({n1, e1, h1}, {n2, e2, h2});
        });
    add(m, "normalise_bearing", "normalise_bearing(angle): radians in [0, 2 pi) (_normalisedbearing).",
        [](double angle) { return _normalisedbearing(angle); });
    add(m, "divergence",
        "divergence(bearing1, bearing2): the turn from the one to the other, radians (geo_grid_divergence).",
        [](double b1, double b2) { return geo_grid_divergence(b1, b2); });
    add_blocks<8, 1>(
        m, "divergence_of_lines",
        "divergence_of_lines(a_north1, a_east1, a_north2, a_east2, b_north1, b_east1, b_north2, b_east2): "
        "the angle between two directions, each from one point to another, radians (geo_grid_divergence).",
        [](const Column* columns, std::size_t count) {
            double a[BLOCK], b[BLOCK];
            read_bearings(columns, a, count);
            read_bearings(columns + 4, b, count);
            for (std::size_t i = 0; i < count; ++i) {
                columns[8][i] = geo_grid_divergence(a[i], b[i]);
            }
        });
    add(m, "bisected_bearing", "bisected_bearing(bearing1, bearing2): radians (geo_bisected_bearing).",
        [](double b1, double b2) { return geo_bisected_bearing(b1, b2); });
    add(m, "triangle_area",
        "triangle_area(north1, east1, north2, east2, north3, east3): square metres (geo_triangle_area).",
        [](double n1, double e1, double n2, double e2, double n3, double e3) {
            return geo_triangle_area(flat(n1, e1), flat(n2, e2), flat(n3, e3));
        });
    add(m, "bearing_intersection",
        "bearing_intersection(north1, east1, north2, east2, bearing1, bearing2): (north, east) where two "
        "rays meet; NaN where they do not (geo_grid_bb_intersect).",
        [](double n1, double e1, double n2, double e2, double b1, double b2) {
            geo_nee out{NOT_A_NUMBER, NOT_A_NUMBER, 0};
            const int met = geo_grid_bb_intersect(flat(n1, e1), flat(n2, e2), b1, b2, out);
            return met == 1 ? std::tuple{out.north, out.east} : std::tuple{NOT_A_NUMBER, NOT_A_NUMBER};
        });

    add(m, "arc_length", "arc_length(angle, radius): metres of an arc (geo_arc_angle_to_length).",
        [](double angle, double radius) { return geo_arc_angle_to_length(angle, radius); });
    add(m, "arc_angle", "arc_angle(length, radius): radians of an arc (geo_arc_length_to_angle).",
        [](double length, double radius) { return geo_arc_length_to_angle(length, radius); });
    add(m, "arc_half_chord",
        "arc_half_chord(radius, separation): metres, for an arc that stands off its chord by the "
        "separation; the diameter where that reaches the radius (geo_arc_to_chord).",
        [](double radius, double separation) { return geo_arc_to_chord(radius, separation); });
    add(m, "spiral_deflection",
        "spiral_deflection(length, spiral_constant): radians; the constant is 2 R L, square metres "
        "(geo_spiral_deflection).",
        [](double length, double constant) { return geo_spiral_deflection(length, constant); });
    add(m, "_spiral_deltas", "spiral_deltas(length, spiral_constant, tolerance): (x, y), metres.",
        [](double length, double constant, double tolerance) {
            double x = 0, y = 0;
            geo_spiral_deltas(length, constant, tolerance, x, y);
            return std::tuple{x, y};
        });

    add_follow<&basalt::follow>(
        m, "follow",
        "follow(north, east, elevation, bearing, distance, slope_angle): the point reached over a "
        "horizontal distance (geo_grid_follow).");
    add_follow<&basalt::follow_grade>(
        m, "follow_grade",
        "follow_grade(north, east, elevation, bearing, distance, grade): as follow, the slope a ratio "
        "(geo_grid_follow2).");
    add_follow<&basalt::follow_height_change>(
        m, "follow_height_change",
        "follow_height_change(north, east, elevation, bearing, distance, height_change): as follow, with "
        "the change of height in metres (geo_grid_follow3).");
}

}  // namespace basalt_python
