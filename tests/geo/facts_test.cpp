// The facts of tests/data/geometry.facts, each also on a thread that flushes subnormal numbers.
#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "tests/geo/calls.h"

#if defined(__SSE2__)
#include <xmmintrin.h>
inline void flush_subnormals(bool flushes) {
    _mm_setcsr(flushes ? _mm_getcsr() | 0x8040U : _mm_getcsr() & ~0x8040U);
}
#else
inline void flush_subnormals(bool) {}
#endif

namespace {

using Numbers = std::vector<double>;

double number_of(const std::string& text) {
    char* rest = nullptr;
    const double number = std::strtod(text.c_str(), &rest);
    if (std::string(rest) == "pi") {
        return rest == text.c_str() ? geo_calls::PI : number * geo_calls::PI;
    }
    EXPECT_TRUE(*rest == '\0' || text == "null") << text;
    return text == "null" ? GEO_NULL : number;
}

/// Numbers up to a word, or the line's end.
Numbers numbers_until(std::istream& line, const std::string& word) {
    Numbers numbers;
    for (std::string text; line >> text && text != word;) {
        numbers.push_back(number_of(text));
    }
    return numbers;
}

/// A call by its name, on the polygon that the facts set last.
Numbers results_of(const std::string& name, const Numbers& in, const std::vector<geo_nee>& polygon) {
    const auto n = static_cast<int>(polygon.size());
    if (name == "area_and_perimeter") {
        return {basalt::polygon_area(polygon.data(), polygon.size()),
                basalt::polygon_perimeter(polygon.data(), polygon.size())};
    }
    const geo_nee point = {in[0], in.size() > 1 ? in[1] : 0.0, 99.0};
    if (name == "in_polygon") {
        return {1.0 * geo_point_in_poly(n, polygon.data(), &point)};
    }
    if (name == "in_band" || name == "on_polyline") {
        const auto call = name == "in_band" ? geo_point_in_poly_2 : geo_point_on_polyline;
        return {1.0 * call(n, polygon.data(), &point, in[2])};
    }
    Numbers out;
    for (const geo_calls::Call& call : geo_calls::CALLS) {
        if (name == call.name && in.size() == static_cast<std::size_t>(call.inputs)) {
            call.run(in.data(), out);
        }
    }
    return out;
}

bool agree(double result, double expected, double tolerance) {
    if (std::isnan(expected)) {
        return std::isnan(result);
    }
    return std::bit_cast<std::uint64_t>(result) == std::bit_cast<std::uint64_t>(expected) ||
           (!basalt::is_null(expected) && std::abs(result - expected) <= tolerance && tolerance > 0);
}

void check_facts(bool flushes_subnormals) {
    std::ifstream file(BASALT_TEST_DATA "/geometry.facts");
    std::vector<geo_nee> polygon;
    int facts = 0;
    for (std::string text; std::getline(file, text);) {
        std::istringstream line(text.substr(0, text.find(" subnormal")));
        std::string name;
        if (!(line >> name) || name[0] == '#' || (flushes_subnormals && text.ends_with("subnormal"))) {
            continue;
        }
        SCOPED_TRACE(text);
        const Numbers in = numbers_until(line, "=");
        if (name == "polygon") {
            polygon.clear();
            for (std::size_t i = 0; i < in.size(); i += 2) {
                polygon.push_back({in[i], in[i + 1], 1.0 * static_cast<double>(i)});
            }
            continue;
        }
        const Numbers expected = numbers_until(line, "~");
        double tolerance = 0.0;
        line >> tolerance;
        flush_subnormals(flushes_subnormals);
        const Numbers out = results_of(name, in, polygon);
        flush_subnormals(false);
        EXPECT_EQ(out.size(), expected.size());
        for (std::size_t i = 0; i < std::min(out.size(), expected.size()); ++i) {
            EXPECT_TRUE(agree(out[i], expected[i], tolerance))
                << "result " << i << " is " << testing::PrintToString(out[i]);
        }
        ++facts;
    }
    EXPECT_GT(facts, 300);
}

static_assert(sizeof(geo_nee) == 24 && sizeof(geo_llh) == 24 && sizeof(geo_vector) == 24 &&
              sizeof(geo_hvd) == 24);
static_assert(std::bit_cast<std::uint64_t>(GEO_NULL) == 0x000E61ACF033D1A4U);

TEST(GeometryFacts, HoldWhetherOrNotTheThreadFlushesSubnormals) {
    check_facts(false);
    check_facts(true);
}

}  // namespace
