#include "basalt/memory/page_sources.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/virtual_memory.h"
#include "tests/support/debug_output.h"

// The library's calls of the platform, recorded on their way.
namespace {

struct Call {
    std::uintptr_t address;
    std::size_t size;
    bool operator==(const Call&) const = default;
};
std::vector<Call> calls;
int failing_call = 0;  // from 1; 0 for none

bool fails(const void* address, std::size_t size) {
    calls.push_back({reinterpret_cast<std::uintptr_t>(address), size});
    const bool fails = static_cast<int>(calls.size()) == failing_call;
    fails ? SetLastError(ERROR_NO_SYSTEM_RESOURCES) : void();
    return fails;
}

}  // namespace

extern "C" {
void* __real__Z12VirtualAllocPvmjj(void*, std::size_t, DWORD, DWORD);
int __real__Z11VirtualFreePvmj(void*, std::size_t, DWORD);
void* __wrap__Z12VirtualAllocPvmjj(void* address, std::size_t size, DWORD type, DWORD protection) {
    return fails(address, size) ? nullptr : __real__Z12VirtualAllocPvmjj(address, size, type, protection);
}
int __wrap__Z11VirtualFreePvmj(void* address, std::size_t size, DWORD type) {
    return fails(address, size) ? 0 : __real__Z11VirtualFreePvmj(address, size, type);
}
}

namespace {

using basalt::test::DebugOutput;
using basalt::test::Pieces;
using basalt::test::report_of;
using Virtual = vex_lib::vlSharedMemoryAllocator;
using Mapped = vex_lib::vlMMapFileAllocator;

constexpr unsigned long COMMIT = 0x1000, RESERVE = 0x2000, DECOMMIT = 0x4000, RELEASE = 0x8000;
constexpr unsigned long BOUNDARY = 0x2000000;
constexpr unsigned long BEYOND = 0x100001000;  // its low 32 bits are a page

class PageSources : public testing::Test {
protected:
    PageSources() : m_base(static_cast<char*>(Virtual::Alloc(nullptr, 4 * BOUNDARY, RESERVE, nullptr))) {
        m_at = m_base + (BOUNDARY - reinterpret_cast<std::uintptr_t>(m_base) % BOUNDARY);
        calls.clear();
    }
    ~PageSources() override {
        failing_call = 0;
        EXPECT_NE(Virtual::Free(m_base, 12345, RELEASE, 0), 0);
    }
    void expect_report(DWORD code) const {
        EXPECT_EQ(m_output.take(), code != 1 ? report_of(code) : Pieces{});
    }
    static constexpr DWORD NONE = 1;

    DebugOutput m_output;
    char* m_base;
    char* m_at;  // a multiple of 32 MiB
};

TEST_F(PageSources, ranges_are_served_in_pieces_that_end_at_32_mebibytes) {
    struct Row {
        long start;  // from m_at
        unsigned long size;
        std::vector<Call> pieces;  // from m_at
    };
    const Row rows[] = {{0, 0x3000000, {{0, 0x1FFFFFF}, {0x1FFFFFF, 1}, {BOUNDARY, 0x1000000}}},
                        {-0x1000, 0x2000, {{0UL - 0x1000, 0x1000}, {0, 0x1000}}},
                        {-1, 1, {{~0UL, 1}}},
                        {0, 0x1FFFFFF, {{0, 0x1FFFFFF}}},
                        {0, BOUNDARY, {{0, 0x1FFFFFF}, {0x1FFFFFF, 1}}},
                        {1, 0x1FFFFFF, {{1, 0x1FFFFFF}}}};
    for (const Row& row : rows) {
        std::vector<Call> expected = row.pieces;
        std::ranges::for_each(expected,
                              [&](Call& call) { call.address += reinterpret_cast<std::uintptr_t>(m_at); });
        char* const start = m_at + row.start;
        calls.clear();
        EXPECT_EQ(Virtual::Alloc(start, row.size, COMMIT, nullptr),
                  start - reinterpret_cast<std::uintptr_t>(start) % 4096);
        EXPECT_EQ(calls, expected);
        EXPECT_EQ(start[0] + start[row.size - 1], 0);
        start[0] = start[row.size - 1] = 'x';
        calls.clear();
        EXPECT_NE(Virtual::Free(start, row.size, DECOMMIT, 0), 0);
        EXPECT_EQ(calls, expected);
    }
    expect_report(NONE);
    // The sum of rest and offset has 32 bits: here it is 0x1000, and the range is one piece.
    calls.clear(), failing_call = 1;
    EXPECT_EQ(Virtual::Alloc(m_at + 0x2000, 0xFFFFF000, COMMIT, nullptr), nullptr);
    EXPECT_EQ(calls.size(), 1U);
    expect_report(ERROR_NO_SYSTEM_RESOURCES);
    calls.clear(), failing_call = 3;
    EXPECT_EQ(Virtual::Alloc(m_at, 0x3000000, COMMIT, nullptr), nullptr);
    EXPECT_EQ(calls.size(), 3U);
    expect_report(ERROR_NO_SYSTEM_RESOURCES);
    m_at[BOUNDARY - 1] = 'x';  // the first two pieces stay committed
    calls.clear(), failing_call = 2;
    EXPECT_EQ(Virtual::Free(m_at, 0x3000000, DECOMMIT, 0), 0);
    EXPECT_EQ(calls.size(), 2U);
    expect_report(ERROR_NO_SYSTEM_RESOURCES);
}

TEST_F(PageSources, refusals_are_reported_and_unknown_codes_not) {
    struct Row {
        char* at;
        unsigned long size, type;
        DWORD reported;
    };
    for (const Row& row : {Row{m_base, 1, 0, NONE},
                           {m_base, 1, COMMIT | RESERVE, NONE},
                           {m_base, 1, DECOMMIT, NONE},
                           {m_base, 1, COMMIT | 1UL << 32, NONE},
                           {m_base, 0, COMMIT, NONE},
                           {nullptr, BEYOND, RESERVE, ERROR_INVALID_PARAMETER},
                           {nullptr, 0, RESERVE, ERROR_INVALID_PARAMETER},
                           {m_base, BEYOND, COMMIT, ERROR_INVALID_PARAMETER},
                           {m_base - 1, 1, COMMIT, ERROR_INVALID_ADDRESS},
                           {m_base, 1, RESERVE, ERROR_INVALID_ADDRESS}}) {
        EXPECT_EQ(Virtual::Alloc(row.at, row.size, row.type, nullptr), nullptr) << row.type;
        expect_report(row.reported);
    }
    for (const Row& row : {Row{m_base, 1, 0, NONE},
                           {m_base, 1, COMMIT, NONE},
                           {m_base, 1, DECOMMIT | RELEASE, NONE},
                           {m_base, 1, RELEASE | 1UL << 32, NONE},
                           {m_base, 0, DECOMMIT, NONE},
                           {m_base, BEYOND, DECOMMIT, ERROR_INVALID_PARAMETER},
                           {m_at, 0, RELEASE, ERROR_INVALID_ADDRESS}}) {
        EXPECT_EQ(Virtual::Free(row.at, row.size, row.type, 0), 0) << row.type;
        expect_report(row.reported);
    }
}

TEST_F(PageSources, mapped_reservations_are_usable_at_once) {
    unsigned long handle = 0;
    auto* const view = static_cast<char*>(Mapped::Alloc(nullptr, 100'000, RESERVE, &handle));
    ASSERT_NE(view, nullptr);
    EXPECT_TRUE(handle > 0 && handle <= 0xFFFFFFFF);
    EXPECT_EQ(std::count(view, view + 100'000, 0), 100'000);
    EXPECT_EQ(Mapped::Alloc(view + 5, 10, COMMIT, nullptr), view + 5);
    view[99'999] = 'x';
    EXPECT_EQ(Mapped::Free(view, 100'000, DECOMMIT, handle), 1);
    EXPECT_EQ(view[99'999], 'x');
    EXPECT_EQ(Mapped::Free(view + 4096, 0, RELEASE, handle), 0);
    expect_report(ERROR_INVALID_ADDRESS);
    EXPECT_NE(Mapped::Free(view, 0, RELEASE, handle), 0);
    auto* const other = static_cast<char*>(Mapped::Alloc(nullptr, 1, RESERVE, &handle));
    EXPECT_EQ(Mapped::Free(other, 0, RELEASE, handle + (1UL << 32)), 0);
    expect_report(ERROR_INVALID_HANDLE);
    for (const unsigned long size : {0UL, BEYOND}) {
        handle = 5;
        EXPECT_EQ(Mapped::Alloc(nullptr, size, RESERVE, &handle), nullptr);
        EXPECT_EQ(handle, 0U);
    }
    EXPECT_EQ(Mapped::Alloc(nullptr, 1, RESERVE, nullptr), nullptr);
    for (const unsigned long type : {0UL, COMMIT | RESERVE, 1UL << 32}) {
        EXPECT_EQ(Mapped::Alloc(m_base, 1, type, nullptr), nullptr);
        EXPECT_EQ(Mapped::Free(m_base, 1, type, 0), 0);
    }
    expect_report(NONE);
}

}  // namespace
