#include <gtest/gtest.h>

#include <cstring>
#include <type_traits>

#include "basalt/memory.h"
#include "tests/support/failing_new.h"
#include "tests/support/heap_calls.h"

namespace {

using basalt::test::HeapFailure;
using vex_lib::vlVmBuffer;

constexpr unsigned long LARGEST = 0xFFFFFFFF;

TEST(VmBuffer, rounds_its_first_size_up_by_the_step) {
    struct Row {
        unsigned long size, step;
        std::size_t bytes;  // 0: empty
    };
    constexpr Row ROWS[] = {
        {100, 64, 128},        {128, 64, 192},     {100, 0, 100},         {0, 0, 0},
        {0, 64, 64},           {4096, 4096, 8192}, {4095, 4096, 4096},    {1, 1, 2},
        {LARGEST + 1, 0, 0},   {LARGEST, 1, 0},    {LARGEST - 15, 16, 0}, {1, LARGEST + 65, 0},
        {LARGEST + 65, 64, 0},
    };
    for (const Row& row : ROWS) {
        SCOPED_TRACE(testing::Message() << row.size << " by " << row.step);
        const long before = basalt::test::live_heap_blocks();
        {
            const vlVmBuffer buffer(row.size, 7, row.step);
            const std::size_t asked = basalt::test::last_heap_request();
            ASSERT_EQ(buffer.GetData() != nullptr, row.bytes != 0);
            if (row.bytes != 0) {
                EXPECT_EQ(asked, row.bytes);
                std::memset(buffer.GetData(), 1, row.bytes);
            }
        }
        EXPECT_EQ(basalt::test::live_heap_blocks(), before);
    }
}

TEST(VmBuffer, resizes_exactly_downwards_and_by_the_step_upwards) {
    vlVmBuffer buffer(100, 0, 64);
    void* const data = buffer.GetData();
    std::memcpy(data, "kept", 5);
    const auto requested_by = [&](std::uint64_t size) {
        void* const block = buffer.ReSize(size);
        const std::size_t request = basalt::test::last_heap_request();
        EXPECT_TRUE(block != nullptr && block == buffer.GetData());
        return request;
    };
    EXPECT_EQ(buffer.ReSize(128), data);
    EXPECT_EQ(requested_by(129), 192U);
    EXPECT_EQ(requested_by(50), 50U);
    EXPECT_STREQ(static_cast<char*>(buffer.GetData()), "kept");
    EXPECT_EQ(requested_by(51), 64U);

    EXPECT_EQ(buffer.ReSize(0), nullptr);
    EXPECT_EQ(buffer.GetData(), nullptr);
    EXPECT_EQ(requested_by(64), 128U) << "grows again from nothing";
}

TEST(VmBuffer, keeps_its_block_when_it_cannot_grow) {
    vlVmBuffer buffer(100, 0, 16);
    void* const data = buffer.GetData();
    for (const std::uint64_t size : {LARGEST - 14, LARGEST, LARGEST + 1, (LARGEST + 1) * 16 + 1, ~0UL}) {
        EXPECT_EQ(buffer.ReSize(size), nullptr) << size;
    }
    const auto resized_without_memory = [&](std::uint64_t size) {
        const HeapFailure failure(1);
        return buffer.ReSize(size);
    };
    EXPECT_EQ(resized_without_memory(1000), nullptr);
    EXPECT_EQ(resized_without_memory(50), nullptr);
    EXPECT_EQ(buffer.GetData(), data);
    EXPECT_EQ(buffer.ReSize(112), data) << "the size is the old one";

    vlVmBuffer no_step(1, 0, LARGEST + 1);
    EXPECT_EQ(no_step.ReSize(1), nullptr);
    const auto made_without_memory = [] {
        const HeapFailure failure(1);
        return vlVmBuffer(10, 0, 0);
    };
    vlVmBuffer empty = made_without_memory();
    EXPECT_EQ(empty.GetData(), nullptr);
    EXPECT_NE(empty.ReSize(10), nullptr);
}

TEST(VmBuffer, exercise_leaves_nothing_behind) {
    const long before = basalt::test::live_heap_blocks();
    vlVmBuffer::Test();
    EXPECT_NO_THROW({
        const FailAllocation failure(1, true);
        vlVmBuffer::Test();
    });
    EXPECT_EQ(basalt::test::live_heap_blocks(), before);
    static_assert(!std::is_copy_constructible_v<vlVmBuffer> && !std::is_copy_assignable_v<vlVmBuffer>);
    static_assert(sizeof(vlVmBuffer) == sizeof(void*) + 4 * sizeof(std::uint32_t));
}

}  // namespace
