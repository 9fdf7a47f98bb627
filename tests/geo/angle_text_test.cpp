#include <gtest/gtest.h>

#include <cmath>

#include "basalt/geo.h"

namespace {

using basalt::AngleStyle;
using basalt::format_angle;
using basalt::parse_angle;

TEST(AngleText, ReadsDegreesMinutesSecondsWithSignOrHemisphere) {
    constexpr struct {
        const char* text;
        double degrees;  // NaN: nothing
    } ROWS[] = {
        {"12-30-00.0", 12.5},
        {"-12 30 0", -12.5},
        {"12:30", 12.5},
        {"+12.5", 12.5},
        {"12\xC2\xB0"
         "30'18\"S",
         -12.505},
        {"W 8-30", -8.5},
        {"N47d30m", 47.5},
        {"12  30  18 E", 12.505},
        {"12d30'18\" n", 12.505},
        {"-0-30-00", -0.5},
        {"359-59-60", NAN},
        {"360", 360},
        {" 359-59-59.64 ", 359.9999},
        {"90S", -90},
        {"180w", -180},
        {"", NAN},
        {"-", NAN},
        {"12-30-", NAN},
        {"12-60", NAN},
        {"12.5-30", NAN},
        {"90.001N", NAN},
        {"180.5E", NAN},
        {"360.1", NAN},
        {"-5S", NAN},
        {"12-30-00x", NAN},
        {"1e2", NAN},
        {"12'30", NAN},
        {"1..2", NAN},
        {"NAN", NAN},
        {"12-30-18-5", NAN},
        {"1,5", NAN},
        {"S12S", NAN},
    };
    for (const auto& row : ROWS) {
        const std::optional<double> angle = parse_angle(row.text);
        EXPECT_EQ(angle.has_value(), !std::isnan(row.degrees)) << row.text;
        EXPECT_TRUE(!angle || std::abs(*angle - _degtorad(row.degrees)) < 1e-15) << row.text;
    }
}

TEST(AngleText, IsRoundedOnceAndReadBack) {
    constexpr struct {
        double degrees;
        int decimals;
        AngleStyle style;
        const char* text;
    } ROWS[] = {
        {12.5, 1, AngleStyle::sign, "12-30-00.0"},
        {-0.5, 0, AngleStyle::sign, "-0-30-00"},
        {-12.505, 3, AngleStyle::latitude, "12-30-18.000S"},
        {-1e-9, 1, AngleStyle::sign, "0-00-00.0"},
        {-1e-9, 1, AngleStyle::longitude, "0-00-00.0E"},
        {59.99999999, 2, AngleStyle::latitude, "60-00-00.00N"},
        {200.0, -3, AngleStyle::longitude, "160-00-00W"},
        {1.0 / 3600, 9, AngleStyle::sign, "0-00-01.000000000"},
        {0.1 / 3600, 3, AngleStyle::sign, "0-00-00.100"},
        {NAN, 1, AngleStyle::sign, ""},
        {1e200, 1, AngleStyle::sign, ""},
        {-INFINITY, 1, AngleStyle::longitude, ""},
    };
    for (const auto& row : ROWS) {
        EXPECT_EQ(format_angle(_degtorad(row.degrees), row.decimals, row.style), row.text);
    }
    for (int i = -36000; i <= 36000; i += 7) {
        const double angle = _degtorad(i / 100.0);
        ASSERT_NEAR(parse_angle(format_angle(angle, 9)).value_or(9.0), angle, 3e-15) << i;
    }
}

}  // namespace
