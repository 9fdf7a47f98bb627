#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "basalt/geo.h"

namespace {

using namespace basalt;
using enum AngleStyle;
using Texts = std::vector<std::string>;

TEST(AngleText, ReadsDegreesMinutesSecondsWithSignOrHemisphere) {
    for (const std::string row :
         {"12-30-00.0=12.5", "-12 30 0=-12.5", "12:30=12.5", "+12.5=12.5", "W 8-30=-8.5",
          "12\302\26030'18\"S=-12.505", "N47d30m=47.5", "12  30  18 E=12.505", "12d30'18\" n=12.505",
          "-0-30-00=-0.5", " 359-59-59.64 =359.9999", "360=360", "90S=-90", "180w=-180"}) {
        const std::size_t end = row.find('=');
        const double angle = _degtorad(std::stod(row.substr(end + 1)));
        EXPECT_NEAR(parse_angle(row.substr(0, end)).value_or(NAN), angle, 1e-15) << row;
    }
    for (const char* const text :
         {"359-59-60", "", "-", "12-30-", "12-60", "12.5-30", "90.001N", "180.5E", "360.1", "-5S",
          "12-30-00x", "1e2", "12'30", "1..2", "NAN", "12-30-18-5", "1,5", "S12S", "12 N 30"}) {
        EXPECT_EQ(parse_angle(text), std::nullopt) << text;
    }
}

TEST(AngleText, IsRoundedOnceAndReadBack) {
    const auto text = [](double degrees, int decimals, AngleStyle style) {
        return format_angle(_degtorad(degrees), decimals, style);
    };
    EXPECT_EQ(
        (Texts{text(12.5, 1, sign), text(-0.5, 0, sign), text(-1e-9, 1, sign), text(1.0 / 3600, 9, sign),
               text(0.1 / 3600, 3, sign), text(NAN, 1, sign), text(1e200, 1, sign)}),
        (Texts{"12-30-00.0", "-0-30-00", "0-00-00.0", "0-00-01.000000000", "0-00-00.100", "", ""}));
    EXPECT_EQ((Texts{text(-12.505, 3, latitude), text(59.99999999, 2, latitude), text(-1e-9, 1, longitude),
                     text(200.0, -3, longitude), text(-INFINITY, 1, longitude)}),
              (Texts{"12-30-18.000S", "60-00-00.00N", "0-00-00.0E", "160-00-00W", ""}));
    for (int i = -36000; i <= 36000; i += 7) {
        const double angle = _degtorad(i / 100.0);
        ASSERT_NEAR(parse_angle(format_angle(angle, 9)).value_or(9.0), angle, 3e-15) << i;
    }
}

}  // namespace
