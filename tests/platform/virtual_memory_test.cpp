#include "src/platform/virtual_memory.h"

#include <gtest/gtest.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>

#include "basalt/platform/error.h"
#include "src/platform/pages.h"
#include "tests/platform/error_of.h"
#include "tests/support/system_failures.h"
#include "tests/support/threads.h"
#include "tests/support/with_failing_allocations.h"
#include "tests/support/with_failing_calls.h"

namespace {

using basalt::test::error_of;
using basalt::test::mapped_balance;
using basalt::test::SystemFailure;

constexpr std::size_t GRANULE = 65536;

const std::size_t PAGE = basalt::platform::page_size();

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

// Whether bytes can be read, asked of the system.
bool is_readable(const void* address) {
    int ends[2];
    EXPECT_EQ(pipe(ends), 0);
    const bool is_read = write(ends[1], address, 1) == 1;
    close(ends[0]);
    close(ends[1]);
    return is_read;
}

TEST(VirtualMemory, pages_are_usable_from_commit_to_decommit) {
    const long mapped = mapped_balance();
    char* const base = reserve(10 * PAGE);
    ASSERT_NE(base, nullptr);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(base) % GRANULE, 0U);
    EXPECT_FALSE(is_readable(base));

    EXPECT_EQ(commit(base + 2 * PAGE + 5, PAGE), base + 2 * PAGE) << "two pages hold bytes of the range";
    EXPECT_FALSE(is_readable(base + 2 * PAGE - 1));
    EXPECT_FALSE(is_readable(base + 4 * PAGE));
    EXPECT_EQ(std::count(base + 2 * PAGE, base + 4 * PAGE, 0), static_cast<long>(2 * PAGE));
    std::fill(base + 2 * PAGE, base + 4 * PAGE, 'x');
    EXPECT_EQ(commit(base, 10 * PAGE), base);
    EXPECT_EQ(std::count(base, base + 10 * PAGE, 'x'), static_cast<long>(2 * PAGE)) << "contents stay";

    EXPECT_EQ(decommit(base + 3 * PAGE + 7, 1), 1);
    EXPECT_FALSE(is_readable(base + 3 * PAGE));
    EXPECT_EQ(commit(base + 3 * PAGE, 1), base + 3 * PAGE);
    EXPECT_EQ(std::count(base, base + 10 * PAGE, 'x'), static_cast<long>(PAGE));
    EXPECT_EQ(decommit(base, 0), 1) << "all of it";
    EXPECT_EQ(decommit(base, 10 * PAGE), 1) << "what is not committed may be decommitted";
    EXPECT_FALSE(is_readable(base + 2 * PAGE));
    EXPECT_EQ(release(base), 1);
    EXPECT_EQ(mapped_balance(), mapped);
}

TEST(VirtualMemory, decommitted_pages_are_zero_even_in_locked_memory) {
    char* const base = reserve(PAGE);
    ASSERT_EQ(commit(base, PAGE), base);
    base[0] = 'x';
    if (mlock(base, PAGE) != 0) {
        release(base);
        GTEST_SKIP() << "no memory may be locked";
    }
    EXPECT_EQ(decommit(base, PAGE), 1);
    EXPECT_EQ(commit(base, PAGE), base);
    EXPECT_EQ(base[0], 0);
    EXPECT_EQ(release(base), 1);
}

TEST(VirtualMemory, an_address_of_ones_own) {
    char* const base = reserve(4 * GRANULE);
    EXPECT_EQ(error_of(reserve(GRANULE, base + GRANULE)), ERROR_INVALID_ADDRESS) << "taken";
    EXPECT_EQ(release(base), 1);
    EXPECT_EQ(reserve(PAGE, base + GRANULE + 5), base + GRANULE) << "brought down to a granule";
    EXPECT_EQ(commit(base + GRANULE, 5 + PAGE), base + GRANULE) << "up to the end of what was asked for";
    EXPECT_EQ(reserve(PAGE, base + 2 * GRANULE), base + 2 * GRANULE);
    EXPECT_EQ(release(base + GRANULE), 1);
    EXPECT_EQ(release(base + 2 * GRANULE), 1);
    char* const committed = commit(nullptr, PAGE);
    ASSERT_NE(committed, nullptr) << "reserves first";
    committed[PAGE - 1] = 'x';
    EXPECT_EQ(release(committed), 1);
}

TEST(VirtualMemory, what_is_not_reserved_is_refused) {
    char* const base = reserve(GRANULE, nullptr);
    char* const next = reserve(GRANULE, base + GRANULE);  // perhaps, and then it is another reservation
    const long mapped = mapped_balance();
    for (char* const address : {base - 1, base + GRANULE - 1, reinterpret_cast<char*>(PAGE)}) {
        EXPECT_EQ(error_of(commit(address, 2)), ERROR_INVALID_ADDRESS);
        EXPECT_EQ(decommit(address, 2), 0);
    }
    EXPECT_EQ(commit(base, SIZE_MAX), nullptr);
    EXPECT_EQ(decommit(base, SIZE_MAX), 0);
    EXPECT_EQ(decommit(base + PAGE, 0), 0);
    EXPECT_EQ(release(base + PAGE), 0);
    EXPECT_EQ(error_of(release(nullptr)), ERROR_INVALID_ADDRESS);
    EXPECT_EQ(error_of(VirtualAlloc(base, SIZE_MAX, MEM_RESERVE, PAGE_NOACCESS)), ERROR_INVALID_ADDRESS)
        << "beyond the last address";
    EXPECT_EQ(error_of(reserve(SIZE_MAX)), ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_EQ(error_of(reserve(0)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(commit(base, 0), nullptr);
    EXPECT_EQ(VirtualAlloc(nullptr, PAGE, MEM_RESERVE, PAGE_READWRITE), nullptr);
    EXPECT_EQ(VirtualAlloc(nullptr, PAGE, MEM_COMMIT | MEM_RESERVE, PAGE_READWRITE), nullptr);
    EXPECT_EQ(VirtualFree(base, PAGE, MEM_RELEASE), 0);
    EXPECT_EQ(error_of(VirtualFree(base, 0, MEM_RELEASE | MEM_DECOMMIT)), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(mapped_balance(), mapped);
    EXPECT_EQ(release(base), 1);
    EXPECT_EQ(next != nullptr ? release(next) : 1, 1);
}

TEST(VirtualMemory, every_failing_call_leaves_things_as_they_were) {
    const long mapped = mapped_balance();
    char* pages = nullptr;
    basalt::test::with_failing_calls(
        [&] { pages = commit(nullptr, 3 * PAGE); },
        [&](bool fails) {
            // A refused unmapping on the way can be neither repaired nor told.
            EXPECT_TRUE(pages != nullptr || fails);
            if (pages != nullptr) {
                pages[0] = 'x';
                for (const auto call :
                     {+[](char* at) { return commit(at, PAGE) != nullptr ? 1 : 0; },
                      +[](char* at) { return decommit(at, PAGE); }, +[](char* at) { return release(at); }}) {
                    const SystemFailure failure(1);
                    EXPECT_EQ(error_of(call(pages)), ERROR_NOT_ENOUGH_MEMORY);
                }
                EXPECT_EQ(pages[0], 'x');
                EXPECT_EQ(release(pages), 1);
            }
        });
    with_failing_allocations([&] { pages = reserve(PAGE); },
                             [&](bool fails) {
                                 EXPECT_EQ(pages == nullptr, fails);
                                 EXPECT_EQ(pages == nullptr ? 1 : release(pages), 1);
                             });
    EXPECT_GE(mapped_balance(), mapped);
}

TEST(VirtualMemory, threads_keep_to_their_own_ranges) {
    basalt::test::run_threads(4, [&](int i) {
        for (int round = 0; round < 500; ++round) {
            char* const base = reserve(3 * PAGE);
            char* const page = commit(base + PAGE, PAGE);
            ASSERT_EQ(page, base + PAGE);
            ASSERT_EQ(std::count(page, page + PAGE, 0), static_cast<long>(PAGE));
            std::fill(page, page + PAGE, static_cast<char>('a' + i));
            ASSERT_EQ(release(base), 1);
        }
    });
}

}  // namespace
