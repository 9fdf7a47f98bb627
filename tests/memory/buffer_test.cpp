#include "basalt/memory/buffer.h"

#include <gtest/gtest.h>
#include <malloc.h>

namespace {

using vex_lib::vlVmBuffer;

constexpr unsigned long LARGEST = 0xFFFFFFFF;

// What a block of this size holds with its rounding by the heap, 0 for none.
std::size_t usable(const vlVmBuffer& buffer, std::size_t size) {
    const std::size_t bytes = malloc_usable_size(buffer.GetData());
    return bytes >= size && bytes < size + 32 && size != 0 ? size : bytes;
}

TEST(Buffer, rounds_its_first_size_up_by_the_step) {
    constexpr unsigned long ROWS[][3] = {
        {100, 64, 128},  {128, 64, 192},        {100, 0, 100},        {0, 0, 0},
        {0, 64, 64},     {4096, 4096, 8192},    {4095, 4096, 4096},   {LARGEST + 1, 0, 0},
        {LARGEST, 1, 0}, {LARGEST - 15, 16, 0}, {1, LARGEST + 65, 0}, {LARGEST + 65, 64, 0}};
    for (const auto& [size, step, expected] : ROWS) {
        EXPECT_EQ(usable(vlVmBuffer(size, 7, step), expected), expected) << size << " by " << step;
    }
}

TEST(Buffer, resizes_exactly_downwards_and_by_the_step_upwards_and_refuses_more_than_32_bits) {
    vlVmBuffer buffer(100, 0, 64);
    static_cast<char*>(buffer.GetData())[49] = 'x';
    bool is_kept = true;
    constexpr unsigned long ROWS[][2] = {{128, 128}, {129, 192}, {50, 50}, {51, 64}, {0, 0}, {64, 128}};
    for (const auto& [size, expected] : ROWS) {
        const void* const block = buffer.ReSize(size);
        EXPECT_EQ(block, buffer.GetData());
        EXPECT_EQ(usable(buffer, expected), expected) << size;
        is_kept = is_kept && size != 0;
        EXPECT_TRUE(!is_kept || static_cast<const char*>(block)[49] == 'x') << size;
    }
    for (const std::uint64_t size : {LARGEST - 62, LARGEST, LARGEST + 1, (LARGEST + 1) * 16 + 1, ~0UL}) {
        EXPECT_EQ(buffer.ReSize(size), nullptr) << size;
        EXPECT_EQ(usable(buffer, 128), 128U);
    }
    EXPECT_EQ(vlVmBuffer(1, 0, LARGEST + 1).ReSize(1), nullptr);
}

}  // namespace
