// Survey geometry with any doubles at all. What each answers is tested elsewhere; here it has to come to an
// end at once, write nothing but its results, and stay within the ranges that hold for any input.
#include <cmath>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <limits>
#include <numbers>
#include <vector>

#include "basalt/geo.h"
#include "fuzz/input.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;

constexpr double PI = std::numbers::pi;

class Numbers {
public:
    explicit Numbers(Input& input) : m_input(input) {}

    // Where formulas turn, near there, of every size, and any bits.
    double number() {
        constexpr double INF = std::numeric_limits<double>::infinity();
        constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();
        constexpr double SPECIAL[] = {0.0,    -0.0,      1.0,          -1.0, PI,   PI / 2,      2 * PI,
                                      100.0,  6378137.0, 1e-4,         5e-4, 1e10, 1e154,       1e308,
                                      5e-324, GEO_NULL,  GEO_INFINITY, INF,  -INF, NOT_A_NUMBER};
        const unsigned choice = m_input.byte();
        if (choice < 80) {
            return SPECIAL[choice % std::size(SPECIAL)];
        }
        if (choice < 120) {
            const double at = SPECIAL[m_input.byte() % std::size(SPECIAL)];
            return choice % 2 == 0 ? std::nextafter(at, 1e300) : -at;
        }
        if (choice < 180) {
            return (m_input.byte() - 128) / 40.0;  // radians
        }
        if (choice < 220) {
            return static_cast<int>(m_input.word()) / 256.0;  // metres
        }
        const std::uint64_t bits = m_input.double_word();
        double value = 0;
        std::memcpy(&value, &bits, sizeof value);
        return value;
    }
    geo_nee point() { return {number(), number(), number()}; }
    geo_llh place() { return {number(), number(), number()}; }
    geo_vector vector() { return {number(), number(), number()}; }

private:
    Input& m_input;
};

// A bearing of finite angles that are not too large to be reduced.
void require_bearing(double bearing) {
    require(std::isnan(bearing) || (bearing >= 0 && bearing < 2 * PI));
}

void measures(Numbers& in) {
    const geo_nee a = in.point();
    const geo_nee b = in.point();
    const geo_nee c = in.point();
    const geo_nee d = in.point();
    const double x = in.number();
    const double y = in.number();
    require(!(geo_horz_dist(a, b) < 0) && !(geo_slope_dist(a, b) < 0) && !(geo_triangle_area(a, b, c) < 0));
    require_bearing(geo_grid_bearing(a, b));
    require(!(std::abs(geo_gradient(a, b)) > PI / 2));
    geo_gradient2(a, b);
    geo_horz_distSq(a, b);
    geo_vert_dist(a, b);
    require(nee_equal(a, b) == nee_equal(b, a) && geo_dist_equal(x, y) == geo_dist_equal(y, x));
    const double reduced = geo_normalised_bearing(x);
    require(!(std::abs(x) <= 100) || x == GEO_NULL || (reduced >= 0 && reduced < 2 * PI));
    geo_grid_divergence(x, y);
    require(!(geo_grid_divergence(a, b, c, d) > PI + 1e-9));
    geo_bisected_bearing(x, y);
    geo_nee out = {};
    geo_grid_centroid(a, b, out);
    require(geo_grid_bb_intersect(a, b, x, y, out) <= 1);
    geo_lines_cross(a, b, c, d);
    require(geo_point_on_line(a, b, c, x) <= 1);
    geo_vector v = in.vector();
    geo_vector w = in.vector();
    geo_vector sum = {};
    require(!(geo_vector_length(v, w) < 0) && !(geo_vector_len(v) < 0));
    require_bearing(geo_vector_direction(v));
    for (const double slope :
         {geo_vector_gradient(v), geo_vector_x_component_gradient(v), geo_vector_y_component_gradient(v)}) {
        require(!(std::abs(slope) > PI / 2));
    }
    geo_vector_add(v, w, sum);
    require(&geo_vector_reverse(v) == &v);
}

void polygons(Numbers& in, std::size_t count) {
    std::vector<geo_nee> vertices(count);  // exactly what may be read
    for (geo_nee& vertex : vertices) {
        vertex = in.point();
    }
    const int n = static_cast<int>(count);
    const double tolerance = in.number();
    for (const geo_nee& point : {in.point(), vertices.empty() ? geo_nee{} : vertices.back()}) {
        for (const int answer : {geo_point_in_poly(n, vertices.data(), &point),
                                 geo_point_in_poly_2(n, vertices.data(), &point, tolerance),
                                 geo_point_on_polyline(n, vertices.data(), &point, tolerance)}) {
            require(answer == 0 || (answer == 1 && n > 0));
        }
    }
}

void observations(Numbers& in) {
    const geo_nee from = in.point();
    const geo_nee to = in.point();
    geo_hvd obs = {in.number(), in.number(), in.number()};
    geo_nee out = {};
    geo_reduce_obs(obs, from, in.number(), out, in.number());
    geo_calc_obs(from, in.number(), to, in.number(), obs, in.number());
    require(&geo_normalise_obs(obs) == &obs);
    geo_grid_follow(from, in.number(), in.number(), in.number(), out);
    geo_grid_follow2(from, in.number(), in.number(), in.number(), out);
    geo_grid_follow3(from, in.number(), in.number(), in.number(), out);
    geo_arc_angle_to_length(in.number(), in.number());
    geo_arc_length_to_angle(in.number(), in.number());
    geo_arc_to_chord(in.number(), in.number());
    geo_spiral_deflection(in.number(), in.number());
    double x = 0;
    double y = 0;
    const double length = in.number();
    geo_spiral_deltas(length, in.number(), in.number(), x, y);
    require(std::abs(length) == GEO_NULL || (x == GEO_NULL) == (y == GEO_NULL));
}

void geodesy(Numbers& in) {
    const geo_vector xyz = in.vector();
    geo_llh llh = {};
    if (_xyz2llh(&xyz, &llh, in.number()) != 0) {
        require(!(std::abs(llh.latitude) > PI / 2) && !(std::abs(llh.longitude) > PI));
    }
    const geo_llh place = in.place();
    const geo_llh other = in.place();
    const geo_llh third = in.place();
    geo_vector out = {};
    _llh2xyz(&place, &out);
    geo_nee local = {};
    const geo_vector origin = in.vector();
    require(_xyz2nez(&origin, &xyz, &local) == 1);
    double meridian = 0;
    double prime_vertical = 0;
    _wgs84curvature(in.number(), meridian, prime_vertical);
    require(llh_equal(place, other) == llh_equal(other, place));
    double azimuth = 0;
    geo_llh end = {};
    geo_vincenty_direct(place, in.number(), in.number(), azimuth, end);
    require(!(geo_vincenty_distance(place, other) < 0));
    require_bearing(geo_vincenty_bearing(place, other));
    geo_vincenty_crosstrack(place, other, third);
    double six[6] = {in.number(), in.number(), in.number(), in.number(), in.number(), in.number()};
    require(Varxyz2varllh(&xyz, six, six) == 1 && Varxyz2varneu(&xyz, six, six) == 1);
}

void units(Numbers& in, Input& input) {
    int whole = 0;
    int minutes = 0;
    double rest = 0;
    const double x = in.number();
    _radtodms(x, &whole, &minutes, &rest);
    require(minutes >= 0 && (minutes < 60 || !(std::abs(x) < 1e7)));
    _dmstorad(static_cast<int>(input.word()), static_cast<int>(input.word()), x, &rest);
    _degtorad(x);
    bool positive = false;
    int numerator = 0;
    int denominator = 0;
    const int fraction = static_cast<int>(input.word());
    _mtoftin(x, fraction, &positive, &whole, &rest, &numerator, &denominator);
    require(whole >= 0 && (denominator != 0 || numerator == 0));
    _ftintom(static_cast<int>(input.word()), x, numerator, denominator, &rest);
    _ftintom(static_cast<int>(input.word()), x, static_cast<int>(input.word()),
             static_cast<int>(input.word()), &rest);
    const double bearing = _normalisedbearing(x);
    require(!std::isfinite(x) || x == GEO_NULL || (bearing >= 0 && bearing < 2 * PI));
    factorial(input.word());
}

void time_scales(Numbers& in, Input& input) {
    std::uint16_t year = 0;
    std::uint16_t month = 0;
    std::uint16_t day = 0;
    std::uint16_t weekday = 0;
    const std::uint32_t mjd = input.word();
    _mjd2greg(mjd, year, month, day, weekday);
    require(month <= 12 && day <= 31 && weekday <= 6);
    constexpr std::uint32_t FIRST_DAY_OF_YEAR_1 = 0U - 678575;  // before MJD 0: counted backwards from 2^32
    const bool is_day = mjd <= 23257590 || mjd >= FIRST_DAY_OF_YEAR_1;
    require(!is_day || _greg2mjd(year, month, day) == mjd);
    _greg2mjd(static_cast<std::uint16_t>(input.word()), static_cast<std::uint16_t>(input.word()),
              static_cast<std::uint16_t>(input.word()));
    double seconds = 0;
    std::uint16_t week = 0;
    _mjd2gps(mjd, in.number(), week, seconds);
    _gps2mjd(week, in.number());
    SYSTEMTIME time = {};
    const std::uint64_t milliseconds = input.double_word();
    require(_javatime2systemtime(milliseconds, &time) == &time);
    _systime2javatime(&time);
    for (std::uint16_t* const field :
         {&time.wYear, &time.wMonth, &time.wDay, &time.wHour, &time.wMinute, &time.wMilliseconds}) {
        *field = static_cast<std::uint16_t>(input.word());
    }
    _systime2javatime(&time);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    Numbers numbers(input);
    for (int round = 0; round < 20 && !input.is_over(); ++round) {
        switch (input.byte() % 6) {
            case 0:
                measures(numbers);
                break;
            case 1:
                polygons(numbers, input.byte() % 12);
                break;
            case 2:
                observations(numbers);
                break;
            case 3:
                geodesy(numbers);
                break;
            case 4:
                units(numbers, input);
                break;
            default:
                time_scales(numbers, input);
                break;
        }
    }
    return 0;
}
