#include "src/sparse/slab.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <new>

namespace vex_util {
namespace {

TEST(Slab, FillsLargePagesWhereLittleOfThemIsLost) {
    constexpr std::size_t KIB = 1024, LARGE = 2048 * KIB;
    EXPECT_EQ(Slab(100 * KIB).Bytes(), 100 * KIB);
    EXPECT_EQ(Slab(512 * KIB, 2 * KIB).Bytes(), LARGE);
    EXPECT_EQ(Slab(520 * KIB, 520 * KIB).Bytes(), 520 * KIB) << "a single block of side 256";
    EXPECT_EQ(Slab(1100 * KIB, 520 * KIB).Bytes(), 1040 * KIB) << "three would leave a quarter";
    EXPECT_EQ(Slab(2200 * KIB, 520 * KIB).Bytes(), 2 * LARGE);
    EXPECT_EQ(Slab(2080 * KIB, 2080 * KIB).Bytes(), 2080 * KIB);
    EXPECT_EQ(Slab(1800 * KIB, 1800 * KIB).Bytes(), LARGE);
    EXPECT_THROW(Slab(SIZE_MAX), std::bad_alloc);
}

}  // namespace
}  // namespace vex_util
