#include "basalt/geo/units.h"

#include <cmath>
#include <cstdint>
#include <limits>

#include "src/geo/constants.h"
#include "src/geo/directions.h"

using namespace basalt::geo;

namespace {

constexpr double METRES_PER_FOOT = 0.3048006096012192;
constexpr double INCHES_PER_FOOT = 12.0;
constexpr double SECONDS_ROUNDING = 5e-6;
/// Larger angles are first reduced by fmod; radians. 160,000 steps of 2 pi.
constexpr double MOST_STEPPED = 1e6;
constexpr std::uint32_t LARGEST_FINITE_FACTORIAL = 170;

/// Whole part of a value above -1, clamped to the largest int; 0 for NaN.
int whole_part(double value) {
    constexpr double FIRST_TOO_LARGE = 2147483648.0;
    if (value < FIRST_TOO_LARGE) {
        return static_cast<int>(value);
    }
    return std::isnan(value) ? 0 : std::numeric_limits<int>::max();
}

/// Numerator of the fraction of an inch, rounded to the nearest 1 / denominator. By fmod, which is exact: an
/// int would overflow.
int fraction_numerator(double inches, int denominator) {
    const double rest = std::fmod(std::trunc(denominator * inches + 0.5), denominator);
    return std::isnan(rest) ? 0 : static_cast<int>(rest);
}

bool is_even(int value) {
    return value % 2 == 0;
}

}  // namespace

double _degtorad(double degrees) {
    return degrees * RADIANS_PER_DEGREE;
}

void _radtodms(double radians, int* degrees, int* minutes, double* seconds) {
    const double angle = radians / RADIANS_PER_DEGREE;
    double rest = std::abs(angle) * 3600.0 + SECONDS_ROUNDING;
    const int whole_degrees = whole_part(rest / 3600.0);
    rest -= whole_degrees * 3600.0;
    const int whole_minutes = whole_part(rest / 60.0);
    rest -= whole_minutes * 60.0;
    *degrees = angle >= 0.0 ? whole_degrees : -whole_degrees;
    *minutes = whole_minutes;
    *seconds = rest - SECONDS_ROUNDING;
}

void _dmstorad(int degrees, int minutes, double seconds, double* radians) {
    const double size = std::abs(static_cast<double>(degrees)) * RADIANS_PER_DEGREE +
                        minutes / 60.0 * RADIANS_PER_DEGREE + seconds / 3600.0 * RADIANS_PER_DEGREE;
    *radians = degrees < 0 ? -size : size;
}

void _mtoftin(double metres, int fractionDenominator, bool* positive, int* feet, double* inches,
              int* numerator, int* denominator) {
    const double total = std::abs(metres / METRES_PER_FOOT * INCHES_PER_FOOT);
    int parts = 0;
    int of = 0;
    if (fractionDenominator != 0) {
        of = fractionDenominator;
        parts = fraction_numerator(total, of);
        if (parts == 0) {
            of = 0;
        } else {
            while (is_even(parts) && is_even(of)) {
                of /= 2;
                parts = fraction_numerator(total, of);
            }
        }
    }
    *positive = metres >= 0.0;
    *feet = whole_part(std::trunc(total) / INCHES_PER_FOOT);
    *inches = std::fmod(total, INCHES_PER_FOOT);
    *numerator = parts;
    *denominator = of;
}

void _ftintom(int feet, double inches, int numerator, int denominator, double* metres) {
    const double all = denominator == 0 ? inches : inches + static_cast<double>(numerator) / denominator;
    const double part = all / INCHES_PER_FOOT;
    *metres = (feet >= 0 ? feet + part : feet - part) * METRES_PER_FOOT;
}

double _normalisedbearing(double angle) {
    if (basalt::is_null(angle) || !std::isfinite(angle)) {
        return angle;
    }
    return to_one_turn(std::abs(angle) > MOST_STEPPED ? std::fmod(angle, TWO_PI) : angle);
}

double factorial(std::uint32_t n) {
    if (n > LARGEST_FINITE_FACTORIAL) {
        return std::numeric_limits<double>::infinity();
    }
    double product = n == 0 ? 1.0 : n;
    for (std::uint32_t i = n; i > 2; --i) {
        product *= i - 1;
    }
    return product;
}
