#include <gtest/gtest.h>

#include <utility>

#include "basalt/frame.h"

namespace {

TEST(IdentifierReplacement, first_of_a_thousand_pairs_counts_and_chains_are_not_followed) {
    constexpr unsigned LARGEST = 0xFFFFFFFF;
    EXPECT_EQ(_REPLACE(5), 5U);
    _REPLACE_FLAG(true);
    EXPECT_EQ(_REPLACE(0), 0U) << "no table yet";
    for (const auto& [from, to] :
         {std::pair{5U, 9U}, {5U, 7U}, {1U, 2U}, {2U, 3U}, {0U, LARGEST}, {LARGEST, 0U}}) {
        _REPLACE_LOAD(from, to);
    }
    for (const auto& [from, to] : {std::pair{5U, 9U}, {1U, 2U}, {0U, LARGEST}, {LARGEST, 0U}, {4U, 4U}}) {
        EXPECT_EQ(_REPLACE(from), to);
    }
    _REPLACE_FLAG(false);
    EXPECT_EQ(_REPLACE(5), 5U);
    for (unsigned i = 6; i < 1001; ++i) {
        _REPLACE_LOAD(i * 10, i);
    }
    _REPLACE_FLAG(true);
    EXPECT_EQ(_REPLACE(9990), 999U);
    EXPECT_EQ(_REPLACE(10'000), 10'000U) << "beyond the thousandth pair";
    _REPLACE_CLEANUP();
    EXPECT_EQ(_REPLACE(5), 5U);
    _REPLACE_LOAD(5, 4);
    EXPECT_EQ(_REPLACE(5), 4U) << "a new table, and the switch stays";
    _REPLACE_CLEANUP();
    _REPLACE_CLEANUP();
    _REPLACE_FLAG(false);
}

}  // namespace
