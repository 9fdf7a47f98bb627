#include <gtest/gtest.h>

#include <optional>
#include <stdexcept>

#include "basalt/util/hex.h"

namespace {

using basalt::ParseDateFromHexString;
using basalt::StringToHexString;

// The date's value when it is valid. The object was valid before, with another date.
std::optional<double> parse(const std::string& text) {
    COleDateTime date(1.0);
    EXPECT_TRUE(ParseDateFromHexString(StringToHexString(text), date));
    return date.GetStatus() == COleDateTime::valid ? std::optional(date.m_dt) : std::nullopt;
}

TEST(HexDate, day_month_and_year) {
    COleDateTime date;
    date.SetStatus(COleDateTime::invalid);
    EXPECT_TRUE(ParseDateFromHexString("3031303232303231", date));
    EXPECT_EQ(date.GetStatus(), COleDateTime::valid);
    EXPECT_EQ(date.m_dt, 44228.0);
    EXPECT_EQ(parse("29022020"), 43890.0);
    EXPECT_EQ(parse("30121899"), 0.0);
    EXPECT_EQ(parse("01010100"), -657434.0);
    EXPECT_EQ(parse("31129999"), 2958465.0);
    EXPECT_EQ(parse("1 2 2021"), 44228.0) << "blanks before a field are skipped";
    EXPECT_EQ(parse("01022021 and more"), 44228.0);
    EXPECT_EQ(parse("+1+22021"), 44228.0) << "a sign is part of a field";
}

TEST(HexDate, what_is_no_date_is_invalid) {
    for (const char* const text :
         {"29022021", "31042021", "00012021", "32012021", "01132021", "01002021", "", "01", "0102",
          "01010099", "01010000", "abcdefgh", "01/02/21", "-1022021", "01-12021", "0102-999", "0x010101"}) {
        EXPECT_FALSE(parse(text)) << text;
    }
}

TEST(HexDate, zero_byte_is_refused_and_the_date_left_alone) {
    COleDateTime date(5.0);
    EXPECT_THROW(ParseDateFromHexString("3031003232303231", date), std::runtime_error);
    EXPECT_EQ(date.m_dt, 5.0);
    EXPECT_EQ(date.GetStatus(), COleDateTime::valid);
}

}  // namespace
