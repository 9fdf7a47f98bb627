#include "src/platform/virtual_memory.h"

#include <gtest/gtest.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <utility>

#include "basalt/platform/error.h"
#include "tests/platform/error_of.h"

namespace {

using basalt::test::error_of;

constexpr std::size_t GRANULE = 65536, PAGE = 4096;

char* reserve(std::size_t size, void* address = nullptr) {
    return static_cast<char*>(VirtualAlloc(address, size, MEM_RESERVE, PAGE_NOACCESS));
}
char* commit(void* address, std::size_t size) {
    return static_cast<char*>(VirtualAlloc(address, size, MEM_COMMIT, PAGE_READWRITE));
}
BOOL decommit(void* address, std::size_t size) {
    return VirtualFree(address, size, MEM_DECOMMIT);
}
BOOL release(void* base) {
    return VirtualFree(base, 0, MEM_RELEASE);
}

bool is_readable(const void* address) {
    int ends[2];
    EXPECT_EQ(pipe(ends), 0);
    const bool is_read = write(ends[1], address, 1) == 1;
    close(ends[0]), close(ends[1]);
    return is_read;
}

TEST(VirtualMemory, pages_are_usable_from_commit_to_decommit) {
    char* const base = reserve(10 * PAGE);
    EXPECT_TRUE(base != nullptr && reinterpret_cast<std::uintptr_t>(base) % GRANULE == 0);
    EXPECT_EQ(commit(base + 2 * PAGE + 5, PAGE), base + 2 * PAGE) << "two pages hold bytes of the range";
    for (std::size_t page = 0; page < 10; ++page) {
        EXPECT_EQ(is_readable(base + page * PAGE), page == 2 || page == 3) << page;
    }
    mlock(base + 2 * PAGE, 2 * PAGE);  // may fail; locked pages are zero after a decommit too
    std::fill(base + 2 * PAGE, base + 4 * PAGE, 'x');
    EXPECT_EQ(decommit(base + 3 * PAGE + 7, 1), 1);
    EXPECT_FALSE(is_readable(base + 3 * PAGE));
    EXPECT_EQ(commit(base, 10 * PAGE), base);
    EXPECT_EQ(std::count(base, base + 10 * PAGE, 'x'), static_cast<long>(PAGE)) << "the other's stay";
    EXPECT_TRUE(decommit(base, 0) && decommit(base, 10 * PAGE)) << "all of it, and a second time";
    EXPECT_FALSE(is_readable(base + 2 * PAGE));
    EXPECT_EQ(release(base), 1);
}

TEST(VirtualMemory, an_address_is_rounded_down_to_a_granule) {
    char* const base = reserve(4 * GRANULE);
    EXPECT_EQ(error_of(reserve(GRANULE, base + GRANULE)), ERROR_INVALID_ADDRESS) << "taken";
    EXPECT_TRUE(release(base) && reserve(PAGE, base + GRANULE + 5) == base + GRANULE);
    EXPECT_EQ(commit(base + GRANULE, 5 + PAGE), base + GRANULE) << "up to the end of the request";
    char* const committed = commit(nullptr, PAGE);
    ASSERT_NE(committed, nullptr) << "reserves first";
    committed[PAGE - 1] = 'x';
    EXPECT_TRUE(release(base + GRANULE) && release(committed));
}

TEST(VirtualMemory, refuses_addresses_that_are_not_all_in_one_range) {
    char* const base = reserve(GRANULE);
    auto* const low = reinterpret_cast<char*>(PAGE);
    for (const auto& [address, size] :
         {std::pair(base - 1, 2UL), {base + GRANULE - 1, 2}, {low, 2}, {base, SIZE_MAX}}) {
        EXPECT_EQ(error_of(commit(address, size)), ERROR_INVALID_ADDRESS);
        EXPECT_EQ(error_of(decommit(address, size)), ERROR_INVALID_ADDRESS);
    }
    EXPECT_EQ(error_of(decommit(base + PAGE, 0)), ERROR_INVALID_ADDRESS);
    EXPECT_EQ(error_of(release(base + PAGE)), ERROR_INVALID_ADDRESS);
    EXPECT_EQ(release(base), 1);
}

}  // namespace
