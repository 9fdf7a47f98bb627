#include <gtest/gtest.h>

#include <limits>
#include <new>
#include <utility>

#include "basalt/frame.h"
#include "tests/support/failing_new.h"

namespace {

struct IdentifierReplacement : testing::Test {
    ~IdentifierReplacement() override {
        _REPLACE_CLEANUP();
        _REPLACE_FLAG(false);
    }
};

TEST_F(IdentifierReplacement, first_pair_counts_while_it_is_on_and_chains_are_not_followed) {
    constexpr unsigned int LARGEST = std::numeric_limits<unsigned int>::max();
    for (const auto& [from, to] :
         {std::pair{5U, 9U}, {5U, 7U}, {1U, 2U}, {2U, 3U}, {0U, LARGEST}, {LARGEST, 0U}}) {
        _REPLACE_LOAD(from, to);
    }
    EXPECT_EQ(_REPLACE(5), 5U) << "off at first";
    _REPLACE_FLAG(true);
    for (const auto& [from, to] : {std::pair{5U, 9U}, {1U, 2U}, {0U, LARGEST}, {LARGEST, 0U}, {4U, 4U}}) {
        EXPECT_EQ(_REPLACE(from), to);
    }
    _REPLACE_FLAG(false);
    EXPECT_EQ(_REPLACE(5), 5U);
}

TEST_F(IdentifierReplacement, holds_a_thousand_pairs_and_begins_anew) {
    _REPLACE_FLAG(true);
    EXPECT_EQ(_REPLACE(0), 0U) << "no table yet";
    for (unsigned int i = 0; i < 1001; ++i) {
        _REPLACE_LOAD(i, i + 1);
    }
    EXPECT_EQ(_REPLACE(999), 1000U);
    EXPECT_EQ(_REPLACE(1000), 1000U) << "beyond the thousandth pair";
    _REPLACE_CLEANUP();
    EXPECT_EQ(_REPLACE(999), 999U);
    _REPLACE_LOAD(999, 4);
    EXPECT_EQ(_REPLACE(999), 4U) << "the switch outlives the table";
    _REPLACE_CLEANUP();
    _REPLACE_CLEANUP();  // none is there any more
}

TEST_F(IdentifierReplacement, stores_nothing_without_memory) {
    _REPLACE_FLAG(true);
    {
        const FailAllocation failure(1);
        EXPECT_THROW(_REPLACE_LOAD(5, 9), std::bad_alloc);
    }
    EXPECT_EQ(_REPLACE(5), 5U);
    _REPLACE_LOAD(5, 7);
    EXPECT_EQ(_REPLACE(5), 7U);
}

}  // namespace
