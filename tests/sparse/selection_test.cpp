#include <gtest/gtest.h>

#include <stdexcept>
#include <vector>

#include "tests/sparse/array_inspection.h"
#include "tests/sparse/visit_recorder.h"

namespace vex_util::testing {
namespace {

TEST(Visit, EndsWhenTheCallbackSaysSo) {
    Sparse2DArray array(8, 4, 64);
    for (int i = 0; i < 40; ++i) {
        insert_value(array, i, 0, static_cast<std::uint64_t>(i));
    }
    select(array, 0, 0, 40, 0);
    for (const int stopAfter : {1, 3, 4, 5, 40}) {
        int calls = 0;
        const Visitor stop = [&](const Visited&) { return ++calls < stopAfter; };
        array.IterateAll(call_visitor, &stop);
        EXPECT_EQ(calls, stopAfter);
        calls = 0;
        array.IterateSelected(call_visitor, &stop);
        EXPECT_EQ(calls, stopAfter);
    }
}

TEST(Visit, ChangesAheadTakeEffectAndChangesBehindDoNot) {
    Sparse2DArray array(8, 16, 4);
    for (int x = 0; x < 8; x += 2) {
        insert_value(array, x, 0, static_cast<std::uint64_t>(x));
    }
    std::vector<Visited> seen;
    const Visitor change = [&](const Visited& v) {
        seen.push_back(v);
        if (v.x == 2) {
            array.Remove(4, 0);
            array.Remove(2, 0);
            insert_value(array, 1, 0, 100);
            insert_value(array, 5, 0, 105);
            insert_value(array, 6, 0, 106);
            insert_value(array, 0, 9, 109);
        }
        return true;
    };
    array.IterateAll(call_visitor, &change);
    EXPECT_EQ(seen, (std::vector<Visited>{{0, 0, 0}, {2, 0, 2}, {5, 0, 105}, {6, 0, 106}, {0, 9, 109}}));
}

TEST(Visit, BlocksMadeMeanwhileBelongToAVisitOfAllOnly) {
    Sparse2DArray array(8, 4, 4);
    insert_value(array, 0, 0, 0);
    select(array, 0, 0, 1000, 1000);
    const auto run = [&](bool all) {
        std::vector<int> seen;
        const Visitor grow = [&](const Visited& v) {
            seen.push_back(v.x);
            if (v.x < 400) {
                insert_value(array, v.x + 4, 0, 1);
            }
            return true;
        };
        all ? array.IterateAll(call_visitor, &grow) : array.IterateSelected(call_visitor, &grow);
        return seen;
    };
    EXPECT_EQ(run(false), (std::vector<int>{0}));
    EXPECT_EQ(run(true).size(), 101U);
    check_invariants(array);
}

TEST(Visit, ClearingOrAssigningEndsIt) {
    Sparse2DArray other(8, 2, 4);
    insert_value(other, 7, 7, 7);
    for (const bool assign : {false, true}) {
        for (const bool all : {false, true}) {
            Sparse2DArray array(8, 4, 4);
            for (int i = 0; i < 30; ++i) {
                insert_value(array, i, i, 1);
            }
            select(array, 0, 0, 30, 30);
            int calls = 0;
            const Visitor overtake = [&](const Visited&) {
                if (++calls == 6) {
                    assign ? static_cast<void>(array = other) : array.RemoveAll();
                    insert_value(array, 1, 1, 1);
                }
                return true;
            };
            all ? array.IterateAll(call_visitor, &overtake) : array.IterateSelected(call_visitor, &overtake);
            EXPECT_EQ(calls, 6);
            EXPECT_EQ(visit_all(array).size(), assign ? 2U : 1U);
            check_invariants(array);
        }
    }
}

TEST(Visit, ACallbacksExceptionPassesOutAndReleasesTheLock) {
    Sparse2DArray array(8, 4, 4);
    insert_value(array, 0, 0, 1);
    const Visitor fail = [](const Visited&) -> bool { throw std::runtime_error("from the callback"); };
    EXPECT_THROW(array.IterateAll(call_visitor, &fail), std::runtime_error);
    EXPECT_EQ(visit_all(array).size(), 1U);
}

TEST(Visit, PassesTheElementInPlaceAndTheContextThrough) {
    Sparse2DArray array(8, 4, 4);
    insert_value(array, 2, 3, 1);
    static const void* seenElement = nullptr;
    static const void* seenContext = nullptr;
    array.IterateAll(
        [](int, int, const void* element, const void* context) {
            seenElement = element;
            seenContext = context;
            return true;
        },
        &array);
    EXPECT_EQ(seenElement, array.Find(2, 3));
    EXPECT_EQ(seenContext, &array);
}

}  // namespace
}  // namespace vex_util::testing
