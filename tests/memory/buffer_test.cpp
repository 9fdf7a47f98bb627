#include "basalt/memory/buffer.h"

#include <gtest/gtest.h>
#include <malloc.h>

namespace {

using vex_lib::vlVmBuffer;

constexpr unsigned long LARGEST = 0xFFFFFFFF;

// Whether a buffer's block has this size, 0 for none.
void expect_size(const vlVmBuffer& buffer, std::size_t size) {
    const std::size_t usable = malloc_usable_size(buffer.GetData());  // rounded up a little
    EXPECT_TRUE(size == 0 ? buffer.GetData() == nullptr : usable >= size && usable < size + 32) << usable;
}

TEST(Buffer, rounds_its_first_size_up_by_the_step) {
    constexpr unsigned long ROWS[][3] = {
        {100, 64, 128},  {128, 64, 192},        {100, 0, 100},        {0, 0, 0},
        {0, 64, 64},     {4096, 4096, 8192},    {4095, 4096, 4096},   {LARGEST + 1, 0, 0},
        {LARGEST, 1, 0}, {LARGEST - 15, 16, 0}, {1, LARGEST + 65, 0}, {LARGEST + 65, 64, 0}};
    for (const auto& [size, step, expected] : ROWS) {
        SCOPED_TRACE(testing::Message() << size << " by " << step);
        expect_size(vlVmBuffer(size, 7, step), expected);
    }
}

TEST(Buffer, resizes_exactly_downwards_and_by_the_step_upwards) {
    vlVmBuffer buffer(100, 0, 64);
    constexpr unsigned long ROWS[][2] = {{128, 128}, {129, 192}, {50, 50}, {51, 64}, {0, 0}, {64, 128}};
    for (const auto& [size, expected] : ROWS) {
        void* const block = buffer.ReSize(size);
        EXPECT_EQ(block, buffer.GetData());
        expect_size(buffer, expected);
    }
    for (const std::uint64_t size : {LARGEST - 62, LARGEST, LARGEST + 1, (LARGEST + 1) * 16 + 1, ~0UL}) {
        EXPECT_EQ(buffer.ReSize(size), nullptr) << size;
        expect_size(buffer, 128);
    }
    vlVmBuffer no_step(1, 0, LARGEST + 1);
    EXPECT_EQ(no_step.ReSize(1), nullptr);
}

}  // namespace
