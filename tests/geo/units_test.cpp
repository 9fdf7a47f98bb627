#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

struct Dms {
    int degrees = -1, minutes = -1;
    double seconds = -1.0;
};

Dms dms_of(double radians) {
    Dms d;
    _radtodms(radians, &d.degrees, &d.minutes, &d.seconds);
    return d;
}

double radians_of(int degrees, int minutes, double seconds) {
    double radians = 0.0;
    _dmstorad(degrees, minutes, seconds, &radians);
    return radians;
}

void expect_dms(double radians, int degrees, int minutes, double seconds) {
    const Dms d = dms_of(radians);
    EXPECT_EQ(d.degrees, degrees);
    EXPECT_EQ(d.minutes, minutes);
    EXPECT_NEAR(d.seconds, seconds, 1e-9);
}

TEST(DegreesMinutesSeconds, CarryTheSignOnTheDegrees) {
    expect_dms(_degtorad(-12.5), -12, 30, 0.0);
    expect_dms(_degtorad(-0.5), 0, 30, 0.0);
    EXPECT_NEAR(radians_of(-12, 30, 0.0), -12.5 * PI / 180, 1e-16);
    EXPECT_NEAR(radians_of(1, -30, -36.0), 0.49 * PI / 180, 1e-17);
    EXPECT_NEAR(radians_of(std::numeric_limits<int>::min(), 0, 0.0), -2147483648.0 * PI / 180, 1e-8);
}

TEST(DegreesMinutesSeconds, NeverShowSixtySeconds) {
    for (int minute = 0; minute < 360 * 60; ++minute) {
        const Dms d = dms_of(_degtorad(minute / 60.0) - 1e-12);  // 2e-7 seconds short
        ASSERT_EQ(d.degrees * 60 + d.minutes, minute);
        ASSERT_NEAR(d.seconds, 0.0, 1e-6);
    }
    expect_dms(_degtorad(90.0 - 6e-6 / 3600.0), 89, 59, 59.999994);
}

TEST(DegreesMinutesSeconds, AnswerAnglesWithoutWholeDegrees) {
    EXPECT_EQ(dms_of(NOT_A_NUMBER).degrees, 0);
    EXPECT_TRUE(std::isnan(dms_of(NOT_A_NUMBER).seconds));
    EXPECT_EQ(dms_of(-1e300).degrees, -2147483647);
    EXPECT_EQ(dms_of(-INF).minutes, 2147483647);
}

struct FeetInches {
    bool positive = false;
    int feet = -1;
    double inches = -1.0;
    int numerator = -1, denominator = -1;
};

FeetInches feet_of(double metres, int denominator) {
    FeetInches f;
    _mtoftin(metres, denominator, &f.positive, &f.feet, &f.inches, &f.numerator, &f.denominator);
    return f;
}

void expect_fraction(const FeetInches& f, int numerator, int denominator) {
    EXPECT_EQ(f.numerator, numerator);
    EXPECT_EQ(f.denominator, denominator);
}

constexpr double INCH = 0.3048006096012192 / 12.0;

TEST(FeetAndInches, ReduceTheFractionByHalves) {
    for (const double metres : {1.0, -1.0}) {
        const FeetInches f = feet_of(metres, 16);
        EXPECT_EQ(f.positive, metres > 0.0);
        EXPECT_EQ(f.feet, 3);
        EXPECT_NEAR(f.inches, 3.37, 1e-12);  // a metre is 39.37 inches
        expect_fraction(f, 3, 8);
    }
    expect_fraction(feet_of(1.0, 0), 0, 0);
    expect_fraction(feet_of(5.66 * INCH, 6), 2, 3);
    expect_fraction(feet_of(5.34 * INCH, 12), 1, 3);
    expect_fraction(feet_of(5.5 * INCH, 64), 1, 2);
    const FeetInches next_inch = feet_of(11.99 * INCH, 16);
    expect_fraction(next_inch, 0, 0);
    EXPECT_EQ(next_inch.feet, 0);
    EXPECT_NEAR(next_inch.inches, 11.99, 1e-12);
}

TEST(FeetAndInches, ComeBackWithinHalfAFraction) {
    Random random(7);
    SCOPED_TRACE("seed 7");
    for (int i = 0; i < 20000; ++i) {
        const double metres = random.real(0.0, 1000.0);
        const FeetInches f = feet_of(metres, 64);
        const double whole = std::floor(f.inches);
        double back = 0.0;
        _ftintom(f.feet, whole, f.numerator, f.denominator, &back);
        // A fraction that rounds up to a whole inch is shown as none.
        const double carry = f.denominator == 0 && f.inches - whole > 0.5 ? INCH : 0.0;
        ASSERT_NEAR(back + carry, metres, INCH / 128 + 1e-12) << metres;
    }
    double metres = 0.0;
    _ftintom(-3, 3.0, 3, 8, &metres);
    EXPECT_EQ(metres, -(3 + 3.375 / 12) * 0.3048006096012192);
}

TEST(FeetAndInches, StopAtTheLargestInteger) {
    for (const double metres : {1e18, 1e300, INF}) {
        EXPECT_EQ(feet_of(metres, 16).feet, 2147483647);
        expect_fraction(feet_of(metres, 16), 0, 0);  // whole inches as doubles
    }
    EXPECT_EQ(feet_of(6e8, 16).feet, 1968500000);  // more inches than an integer holds
    EXPECT_EQ(feet_of(NOT_A_NUMBER, 16).feet, 0);
    EXPECT_FALSE(feet_of(NOT_A_NUMBER, 16).positive);
    EXPECT_EQ(feet_of(-INF, -1).feet, 2147483647);
    EXPECT_TRUE(std::isnan(feet_of(INF, std::numeric_limits<int>::min()).inches));
}

TEST(UnboundedBearing, ReducesAnySize) {
    EXPECT_NEAR(_normalisedbearing(150.0), 150.0 - 46 * PI, 1e-12);
    EXPECT_EQ(_normalisedbearing(-1e-300), 0.0);
    EXPECT_EQ(_normalisedbearing(GEO_NULL), GEO_NULL);
    EXPECT_EQ(_normalisedbearing(-INF), -INF);
    EXPECT_TRUE(std::isnan(_normalisedbearing(NOT_A_NUMBER)));
    Random random(9);
    SCOPED_TRACE("seed 9");
    for (int i = 0; i < 2000; ++i) {
        const double angle = random.real(-100.0, 100.0);
        ASSERT_EQ(_normalisedbearing(angle), geo_normalised_bearing(angle));
        const double far = random.real(-1e6, 1e6) * (i % 2 == 0 ? 0.1 : 1e290);
        const double bearing = _normalisedbearing(far);
        ASSERT_TRUE(bearing >= 0.0 && bearing < 2 * PI) << far;
        if (i % 2 == 0) {
            ASSERT_NEAR(std::remainder(bearing - far, 6.283185307179586), 0.0, 1e-6) << far;
        }
    }
}

TEST(Factorial, EndsAtInfinity) {
    EXPECT_EQ(factorial(0), 1.0);
    EXPECT_EQ(factorial(22), 1124000727777607680000.0);
    EXPECT_NEAR(factorial(170) / 7.257415615307994e306, 1.0, 1e-13);
    EXPECT_EQ(factorial(171), INF);
    EXPECT_EQ(factorial(0xFFFFFFFF), INF);
}

}  // namespace
