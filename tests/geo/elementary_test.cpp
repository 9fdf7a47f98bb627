// Results are compared with MPFR-quality rows at hard arguments and with the C library's extended precision
// at random ones.
#include "src/geo/elementary/four.h"

#include <gtest/gtest.h>

#include <array>
#include <bit>
#include <cmath>
#include <limits>
#include <string>

#include "tests/geo/plain_forms.h"
#include "tests/support/reference_rows.h"

namespace {

using namespace basalt::geo;

constexpr double INF = std::numeric_limits<double>::infinity();
constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();
constexpr double TINIEST = std::numeric_limits<double>::denorm_min();
constexpr double LARGEST = std::numeric_limits<double>::max();
constexpr double PI = 0x1.921fb54442d18p+1;

/// The same bits, or both NaN.
void expect_same(double got, double expected) {
    EXPECT_TRUE(std::bit_cast<std::uint64_t>(got) == std::bit_cast<std::uint64_t>(expected) ||
                (std::isnan(got) && std::isnan(expected)))
        << got << ", expected " << expected;
}

/// Error in units in the last place of the true value.
double error(double result, long double truth) {
    const int place = std::max(std::ilogb(static_cast<double>(truth)) - 52, -1074);
    return static_cast<double>(std::fabs(result - truth) / std::ldexp(1.0L, place));
}

/// The bounds that elementary.h states.
void expect_close(double a, double x, const std::array<long double, 5>& truth) {
    EXPECT_LE(error(elementary::sin(a), truth[0]), 0.62);
    EXPECT_LE(error(elementary::cos(a), truth[1]), 0.62);
    EXPECT_LE(error(elementary::tan(a), truth[2]), 0.66);
    EXPECT_LE(error(elementary::atan(a), truth[3]), 0.58);
    EXPECT_LE(error(elementary::atan2(a, x), truth[4]), 0.58);
}

TEST(Elementary, HardArgumentsStayWithinTheBounds) {
    const auto rows = read_reference_rows(BASALT_TEST_DATA "/elementary.csv", 7);
    ASSERT_GE(rows.size(), 130U);
    for (const ReferenceRow& row : rows) {
        SCOPED_TRACE(testing::Message() << row[0] << " " << row[1]);
        expect_close(static_cast<double>(row[0]), static_cast<double>(row[1]),
                     {row[2], row[3], row[4], row[5], row[6]});
    }
}

TEST(Elementary, SpecialArgumentsGiveWhatCDefines) {
    constexpr struct {
        double a, sine, cosine, tangent, arctangent;
    } ANGLES[] = {
        {0.0, 0.0, 1.0, 0.0, 0.0},
        {TINIEST, TINIEST, 1.0, TINIEST, TINIEST},
        {1e-300, 1e-300, 1.0, 1e-300, 1e-300},
        {PI / 2, 1.0, 0x1.1a62633145c07p-54, 0x1.d02967c31cdb5p+53, 0x1.00fe987ed02ffp+0},
        {INF, NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER, PI / 2},
        {NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER},
    };
    for (const auto& row : ANGLES) {
        SCOPED_TRACE(row.a);
        for (const double sign : {1.0, -1.0}) {
            expect_same(elementary::sin(sign * row.a), sign * row.sine);
            expect_same(elementary::cos(sign * row.a), row.cosine);
            expect_same(elementary::tan(sign * row.a), sign * row.tangent);
            expect_same(elementary::atan(sign * row.a), sign * row.arctangent);
        }
    }
    // clang-format off
    constexpr double DIRECTIONS[][3] = {
        {0.0, 0.0, 0.0}, {0.0, -0.0, PI}, {0.0, 2.0, 0.0}, {0.0, -2.0, PI}, {2.0, 0.0, PI / 2}, {2.0, -0.0, PI / 2},
        {INF, 1.0, PI / 2}, {1.0, INF, 0.0}, {1.0, -INF, PI}, {INF, INF, PI / 4}, {INF, -INF, PI * 0.75},
        {TINIEST, 1.0, TINIEST}, {TINIEST, 2.0, 0.0}, {TINIEST, -2.0, PI}, {TINIEST, TINIEST, PI / 4},
        {LARGEST, LARGEST, PI / 4}, {LARGEST, TINIEST, PI / 2}, {TINIEST, LARGEST, 0.0},
        {1e-310, -1e-311, 0x1.aba397c7259c7p+0},
        {INF, NOT_A_NUMBER, NOT_A_NUMBER}, {NOT_A_NUMBER, 0.0, NOT_A_NUMBER}};
    // clang-format on
    for (const auto& [y, x, angle] : DIRECTIONS) {
        SCOPED_TRACE(testing::Message() << y << " " << x);
        expect_same(elementary::atan2(y, x), angle);
        expect_same(elementary::atan2(-y, x), -angle);
    }
}

TEST(Elementary, RandomArgumentsStayWithinTheBoundsInOneLaneTwoAndFour) {
    plain::Random random(3);
    double y[4] = {}, x[4] = {};
    for (int round = 0; round < 200'000; ++round) {
        // Angles of every size, often near multiples of pi/4; directions of every slope, often near 1/4.
        const double size = std::exp2(random.real(-30.0, round % 64 == 3 ? 1000.0 : 17.0));
        const double near = round % 3 == 0 ? PI / 4 * random.below(9) : random.real(-8.0, 8.0);
        const double a = y[round % 4] = round % 4 == 3 ? size : near + random.real(-1.0, 1.0) / size;
        const double b = x[round % 4] = round % 5 == 0 ? a * random.real(3.9, 4.1) : random.real(-8.0, 8.0);
        SCOPED_TRACE(testing::Message() << std::hexfloat << a << " " << b);
        const long double exact = a;
        expect_close(a, b,
                     {std::sin(exact), std::cos(exact), std::tan(exact), std::atan(exact),
                      std::atan2(exact, static_cast<long double>(b))});
        // Two errors of 0.62 units give 1.9e-16; the nearest doubles themselves up to 1.57e-16.
        const auto [sine, cosine] = elementary::sin_cos(a);
        EXPECT_LE(std::fabs(1.0L * sine * sine + 1.0L * cosine * cosine - 1.0L), 1.9e-16L);
        expect_same(elementary::sin(-a), -sine);
        const double quarter = std::remainder(a, 1.5);
        EXPECT_LE(elementary::sin(quarter), elementary::sin(std::nextafter(quarter, INF)));
        EXPECT_LE(elementary::atan(a), elementary::atan(std::nextafter(a, INF)));
        const elementary::SineCosineFour of = elementary::sin_cos(elementary::load_four(y));
        const elementary::Four angles = elementary::atan2(elementary::load_four(y), elementary::load_four(x));
        for (int i = 0; i < 4 && round % 4 == 3; ++i) {
            const int other = (i + 1) % 4;
            const elementary::SineCosineTwo two = elementary::sin_cos_two(y[other], y[i]);
            expect_same(elementary::sin(y[i]), of.sine[i]);
            expect_same(elementary::cos(y[i]), of.cosine[i]);
            expect_same(elementary::atan2(y[i], x[i]), angles[i]);
            expect_same(two.second.sine, of.sine[i]);
            expect_same(two.second.cosine, of.cosine[i]);
            expect_same(elementary::atan2_two(y[other], x[other], y[i], x[i]).second, angles[i]);
        }
        ASSERT_FALSE(HasFailure());
    }
}

}  // namespace
