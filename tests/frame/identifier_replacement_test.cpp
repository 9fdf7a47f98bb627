#include <gtest/gtest.h>

#include <utility>

#include "basalt/frame.h"

namespace {

TEST(IdentifierReplacement, first_of_a_thousand_pairs_counts_and_chains_are_not_followed) {
    constexpr unsigned LARGEST = 0xFFFFFFFF;
    EXPECT_EQ(_REPLACE(5), 5U);
    _REPLACE_FLAG(true);
    EXPECT_EQ(_REPLACE(0), 0U) << "no table yet";
    using Row = std::pair<unsigned, unsigned>;
    for (const auto& [from, to] :
         {Row(5, 9), Row(5, 7), Row(1, 2), Row(2, 3), Row(0, LARGEST), Row(LARGEST, 0)}) {
        _REPLACE_LOAD(from, to);
    }
    for (unsigned i = 6; i < 1001; ++i) {
        _REPLACE_LOAD(i * 10, i);
    }
    for (const auto& [from, to] :
         {Row(5, 9), Row(1, 2), Row(0, LARGEST), Row(LARGEST, 0), Row(4, 4), Row(9990, 999),
          Row(10'000, 10'000)}) {  // the last is beyond the thousandth pair
        EXPECT_EQ(_REPLACE(from), to);
        _REPLACE_FLAG(false);
        EXPECT_EQ(_REPLACE(from), from);
        _REPLACE_FLAG(true);
    }
    _REPLACE_CLEANUP();
    EXPECT_EQ(_REPLACE(5), 5U);
    _REPLACE_LOAD(5, 4);
    EXPECT_EQ(_REPLACE(5), 4U) << "a new table, and the switch stays";
    _REPLACE_CLEANUP();
    _REPLACE_CLEANUP();
    _REPLACE_FLAG(false);
}

}  // namespace
