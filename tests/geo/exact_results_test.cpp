// Results have the same bits under every compiler, at every optimisation, on every processor: those of
// thousands of random calls are folded into one number a call, kept in tests/data/exact_results.facts.
#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <cstdint>
#include <fstream>
#include <string>
#include <vector>

#include "tests/geo/calls.h"
#include "tests/geo/plain_forms.h"

namespace {

using Numbers = std::vector<double>;

// FNV-1a over whole 64-bit words; every NaN is the same.
void add(std::uint64_t& fold, const Numbers& results) {
    for (const double result : results) {
        fold = (fold ^ (std::isnan(result) ? 1 : std::bit_cast<std::uint64_t>(result))) * 1099511628211U;
    }
}

// Whole numbers, angles, coordinates of a site, and of the globe.
Numbers numbers(plain::Random& random, std::size_t count) {
    const int kind = random.below(4);
    Numbers numbers(count);
    for (double& number : numbers) {
        const double scale = std::vector{1.5, 300.0, 4e6}[static_cast<std::size_t>(kind) % 3];
        number = kind == 3 ? random.below(7) : random.real(-scale, scale);
    }
    return numbers;
}

TEST(ExactResults, AreTheSameOnEveryCompiler) {
    std::ifstream file(BASALT_TEST_DATA "/exact_results.facts");
    const auto expect = [&file](const std::string& call, std::uint64_t fold) {
        std::string name;
        std::uint64_t expected = 0;
        EXPECT_TRUE(file >> name >> expected && name == call && fold == expected) << call << ' ' << fold;
    };
    for (const geo_calls::Call& call : geo_calls::CALLS) {
        plain::Random random(1);
        std::uint64_t fold = 14695981039346656037U;
        for (int round = 0; round < 3000; ++round) {
            Numbers in = numbers(random, static_cast<std::size_t>(call.inputs));
            const double lasts[] = {in.back(), in.back(), 5e-10, random.real(0.0, 9e6)};
            in.back() = lasts[random.below(4)];  // a tolerance, a length, a height
            Numbers out;
            call.run(in.data(), out);
            add(fold, out);
        }
        expect(call.name, fold);
    }
    plain::Random random(1);
    std::uint64_t fold = 14695981039346656037U;
    for (int round = 0; round < 4000; ++round) {
        std::vector<geo_nee> v;
        const Numbers in = numbers(random, 50);
        for (std::size_t i = 0; i < 48; i += 2) {
            v.push_back({in[i], in[i + 1], 40.0});
        }
        add(fold, {1.0 * geo_point_in_poly(23, v.data(), &v[23]), basalt::polygon_area(v.data(), 23),
                   1.0 * geo_point_in_poly_2(23, v.data(), &v[23], std::abs(in[48] / 4)),
                   1.0 * geo_point_on_polyline(23, v.data(), &v[23], std::abs(in[49] / 4))});
    }
    expect("polygons", fold);
}

}  // namespace
