// Survey geometry: every call with any doubles has to return at once and stay in its range; arrays
// have to agree with single calls, and predicates with their plain forms.
#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <cstdint>
#include <iterator>
#include <vector>

#include "basalt/geo.h"
#include "fuzz/input.h"
#include "src/geo/polygon_edges.h"
#include "tests/geo/calls.h"
#include "tests/geo/plain_forms.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using namespace basalt::geo;
using namespace plain;

// Where formulas turn, near there, metres or radians, and any bits.
double number(Input& input) {
    constexpr double SPECIAL[] = {0.0,       -0.0,         1.0,   PI,          PI / 2, 2 * PI, 100.0,
                                  1e-4,      5e-4,         1e-8,  1e-12,       1e-170, 1e-200, 5e-324,
                                  6378137.0, 1e10,         2e100, 1e154,       1e160,  1e308,  1.7e308,
                                  GEO_NULL,  GEO_INFINITY, INF,   NOT_A_NUMBER};
    const unsigned choice = input.byte();
    const double special = SPECIAL[choice % std::size(SPECIAL)];
    const double numbers[] = {special, -special, std::nextafter(special, 1e300), (choice - 128.0) / 40.0};
    if (choice < 192) {
        return numbers[choice % 4];
    }
    const std::uint64_t bits = input.double_word();
    return choice < 224 ? static_cast<double>(static_cast<std::int64_t>(bits) >> 30) / 256.0
                        : std::bit_cast<double>(bits);
}

void any_numbers(Input& input) {
    const geo_calls::Call& call = geo_calls::CALLS[input.byte() % std::size(geo_calls::CALLS)];
    std::vector<double> in(static_cast<std::size_t>(call.inputs));
    for (double& value : in) {
        value = number(input);
    }
    std::vector<double> out;
    call.run(in.data(), out);
    require(!(out.at(0) < call.low) && !(out[0] > call.high));
}

template <class Record>
bool same(const Record& a, const Record& b) {
    using Numbers = std::array<double, sizeof(Record) / sizeof(double)>;
    const auto x = std::bit_cast<Numbers>(a);
    return std::equal(x.begin(), x.end(), std::bit_cast<Numbers>(b).begin(), [](double m, double n) {
        return std::bit_cast<std::uint64_t>(m) == std::bit_cast<std::uint64_t>(n) ||
               (std::isnan(m) && std::isnan(n));
    });
}

// Arrays have the bits of the single calls.
void arrays(Input& input) {
    constexpr std::size_t COUNT = 7;
    geo_llh llh[COUNT], llh_of_one[COUNT] = {}, ends[COUNT], geodetic[COUNT] = {};
    geo_vector xyz[COUNT] = {}, xyz_of_one[COUNT] = {};
    double azimuths[COUNT], distances[COUNT], at_ends[COUNT];
    std::size_t refused = 0, not_settled = 0;
    const double tolerance = input.byte() % 4 == 0 ? number(input) : 5e-10;
    for (std::size_t i = 0; i < COUNT; ++i) {
        const bool is_any = input.byte() % 8 == 0;
        llh[i] =
            is_any ? geo_llh{number(input), number(input), number(input)}
                   : geo_llh{(input.byte() - 128) / 82.0, (input.byte() - 128) / 41.0, input.byte() * 100.0};
        azimuths[i] = is_any ? number(input) : input.byte() / 41.0;
        distances[i] = is_any ? number(input) : input.byte() * 5e4;
        refused += _llh2xyz(&llh[i], &xyz_of_one[i]) == 0 ? 1 : 0;
        not_settled += _xyz2llh(&xyz_of_one[i], &llh_of_one[i], tolerance) == 0 ? 1 : 0;
    }
    require(basalt::to_cartesian(llh, xyz, COUNT) == refused);
    require(basalt::to_geodetic(xyz_of_one, geodetic, COUNT, tolerance) == not_settled);
    basalt::direct(llh, azimuths, distances, ends, at_ends, COUNT);
    basalt::GeodesicInverse lines[COUNT] = {};
    basalt::inverse(llh, ends, lines, COUNT);
    double sphere[2][COUNT], plane[COUNT], bearings[COUNT];
    geo_nee points[COUNT];
    std::transform(llh, llh + COUNT, points, [](const geo_llh& at) {
        return geo_nee{at.latitude, at.longitude, at.height};
    });
    basalt::distances(llh, ends, sphere[0], COUNT);
    basalt::bearings(llh, ends, sphere[1], COUNT);
    basalt::bearings(points, points + 1, plane, COUNT - 1);
    geo_vector vectors[COUNT];
    geo_hvd sights[COUNT];
    geo_nee followed[COUNT], reduced[COUNT];
    bool is_on[COUNT] = {};
    std::transform(llh, llh + COUNT, vectors,
                   [](const geo_llh& at) { return std::bit_cast<geo_vector>(at); });
    std::transform(llh, llh + COUNT, sights, [](const geo_llh& at) { return std::bit_cast<geo_hvd>(at); });
    basalt::bearings(vectors, bearings, COUNT);
    decltype(basalt::follow)* const arrays_followed[] = {basalt::follow, basalt::follow_grade,
                                                         basalt::follow_height_change};
    decltype(geo_grid_follow)* const follow_one[] = {geo_grid_follow, geo_grid_follow2, geo_grid_follow3};
    const unsigned form = input.byte() % 3;
    arrays_followed[form](points, azimuths, distances, bearings, followed, COUNT);
    basalt::reduce(sights, followed, azimuths, distances, reduced, COUNT);
    basalt::on_segments(points, points + 1, followed, azimuths, is_on, COUNT - 1);
    for (std::size_t i = 0; i < COUNT; ++i) {
        double at_end = 0;
        geo_llh end = {};
        geo_vincenty_direct(llh[i], azimuths[i], distances[i], at_end, end);
        require(same(xyz[i], xyz_of_one[i]) && same(geodetic[i], llh_of_one[i]));
        require(same(ends[i], end) && same(at_ends[i], at_end));
        require(same(lines[i], basalt::geodesic_inverse(llh[i], end)));
        require(same(sphere[0][i], geo_vincenty_distance(llh[i], end)));
        require(same(sphere[1][i], geo_vincenty_bearing(llh[i], end)));
        require(i == 0 || same(plane[i - 1], geo_grid_bearing(points[i - 1], points[i])));
        geo_nee point = {};
        require(same(bearings[i], geo_vector_direction(vectors[i])));
        follow_one[form](points[i], azimuths[i], distances[i], bearings[i], point);
        require(same(followed[i], point));
        geo_reduce_obs(sights[i], followed[i], azimuths[i], point, distances[i]);
        require(same(reduced[i], point));
        require(i == 0 || is_on[i - 1] == (geo_point_on_line(points[i - 1], points[i], followed[i - 1],
                                                             azimuths[i - 1]) == 1));
    }
}

// Every form of each predicate.
void compare_polygons(const std::vector<geo_nee>& v, const geo_nee& p, double tolerance) {
    const auto n = static_cast<int>(v.size());
    const geo_nee& first = v[0];
    const geo_nee& last = v.back();
    const geo_nee& middle = v[v.size() / 2];
    const int inside = plain::point_in_poly(n, v.data(), p);
    const int in_band = plain::point_in_poly_2(n, v.data(), p, tolerance);
    const int on_line = plain::point_on_line(first, last, p, tolerance);
    require(geo_point_in_poly(n, v.data(), &p) == inside);
    require(crossing_parity_portable<VertexTest::YES>(n, v.data(), p) == inside);
    require(geo_point_in_poly_2(n, v.data(), &p, tolerance) == in_band);
    const bool band = tolerance >= 0.0 && (is_in_a_band_portable(n, v.data(), p, tolerance) || on_line == 1);
    require((band || crossing_parity_portable<VertexTest::NO>(n, v.data(), p) == 1) == (in_band == 1));
    const basalt::PreparedPolygon prepared(v);
    require(prepared.contains(p) == (inside == 1) && prepared.contains(p, tolerance) == (in_band == 1));
    const int on_polyline = plain::point_on_polyline(n, v.data(), p, tolerance);
    require(geo_point_on_polyline(n, v.data(), &p, tolerance) == on_polyline);
    require(geo_point_on_line(first, last, p, tolerance) == on_line);
    require(geo_lines_cross(first, last, middle, p) == plain::lines_cross(first, last, middle, p));
}

// Values of a grid that many share, some one unit in the last place beside it, and any other numbers.
void awkward_polygon(Random& random) {
    constexpr double TOLERANCES[] = {0.0,  1e-300, 1e-9, 0.25, 0.5,   1.0,          1e6,     1e200,
                                     -0.0, -0.1,   -INF, INF,  1e308, NOT_A_NUMBER, GEO_NULL};
    const auto coordinate = [&random] {
        const std::uint32_t bits[] = {random.bits(), random.bits(), random.bits()};
        Input input(reinterpret_cast<const std::uint8_t*>(bits), sizeof bits);
        const double grid = random.below(6);
        const double numbers[] = {number(input), random.real(0.0, 5.0),
                                  std::nextafter(grid, random.below(2) * 9.0)};
        const int choice = random.below(24);
        return choice < 7 ? numbers[choice == 0 ? 0 : 1 + choice % 2] : grid;
    };
    std::vector<geo_nee> v(static_cast<std::size_t>(1 + random.below(random.below(16) == 0 ? 70 : 12)));
    for (geo_nee& vertex : v) {
        vertex = {coordinate(), coordinate(), NOT_A_NUMBER};
    }
    if (random.below(3) == 0) {
        v.push_back(v.front());
    }
    compare_polygons(v, {coordinate(), coordinate(), NOT_A_NUMBER}, TOLERANCES[random.below(15)]);
}

// A point on or near a corner or side of the band of an edge.
void star_polygon(Random& random) {
    const double scale = std::pow(10.0, random.below(14) - 5);
    const geo_nee centre = {random.real(-1.0, 1.0) * 6e6, random.real(-1.0, 1.0) * 5e5, 0.0};
    const int n = 3 + random.below(60);
    std::vector<geo_nee> v;
    for (int i = 0; i < n; ++i) {
        const double r = scale * random.real(0.6, 1.0);
        v.push_back(
            {centre.north + r * std::cos(2 * PI * i / n), centre.east + r * std::sin(2 * PI * i / n), 0.0});
    }
    const auto at = static_cast<std::size_t>(random.below(n));
    const geo_nee& a = v[at];
    const geo_nee& b = v[(at + 1) % v.size()];
    const double length = geo_horz_dist(a, b);
    const double tolerance = random.below(4) == 0 ? 0.0 : length * std::pow(10.0, -random.below(13));
    const double beyond = (random.below(2) == 0 ? -tolerance : length + tolerance) / length;
    const double along = random.below(2) == 0 ? random.real(0.0, 1.0) : beyond;
    const double beside = tolerance * (random.below(3) - 1) * (1.0 + 1e-15 * (random.below(9) - 4)) / length;
    const double dn = b.north - a.north;
    const double de = b.east - a.east;
    compare_polygons(v, {a.north + along * dn - beside * de, a.east + along * de + beside * dn, 0.0},
                     tolerance);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    for (int round = 0; round < 20 && !input.is_over(); ++round) {
        const unsigned choice = input.byte();
        if (choice < 128) {
            choice < 112 ? any_numbers(input) : arrays(input);
            continue;
        }
        Random random(input.double_word());
        choice % 2 == 0 ? awkward_polygon(random) : star_polygon(random);
    }
    return 0;
}
