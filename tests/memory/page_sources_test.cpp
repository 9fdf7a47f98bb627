#include "basalt/memory/page_sources.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <utility>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/virtual_memory.h"
#include "tests/support/debug_output.h"

// The library's calls of the platform, recorded on their way.
namespace {

using Calls = std::vector<std::pair<std::uintptr_t, std::size_t>>;  // address from `origin`, size
Calls calls;
std::uintptr_t origin = 0;
std::size_t failing_call = 0;  // from 1; 0 for none

bool passes(const void* address, std::size_t size) {
    calls.emplace_back(reinterpret_cast<std::uintptr_t>(address) - origin, size);
    return calls.size() != failing_call || (SetLastError(ERROR_NO_SYSTEM_RESOURCES), false);
}

}  // namespace

extern "C" {
void* __real__Z12VirtualAllocPvmjj(void*, std::size_t, DWORD, DWORD);
int __real__Z11VirtualFreePvmj(void*, std::size_t, DWORD);
void* __wrap__Z12VirtualAllocPvmjj(void* address, std::size_t size, DWORD type, DWORD protection) {
    return passes(address, size) ? __real__Z12VirtualAllocPvmjj(address, size, type, protection) : nullptr;
}
int __wrap__Z11VirtualFreePvmj(void* address, std::size_t size, DWORD type) {
    return passes(address, size) ? __real__Z11VirtualFreePvmj(address, size, type) : 0;
}
}

namespace {

using basalt::test::DebugOutput;
using basalt::test::Pieces;
using basalt::test::report_of;
using Virtual = vex_lib::vlSharedMemoryAllocator;
using Mapped = vex_lib::vlMMapFileAllocator;

constexpr unsigned long COMMIT = 0x1000, RESERVE = 0x2000, DECOMMIT = 0x4000, RELEASE = 0x8000;
constexpr unsigned long MIB32 = 0x2000000;
constexpr unsigned long WIDE = 1UL << 32, BEYOND = WIDE + 4096;
constexpr DWORD NONE = 1;

class PageSources : public testing::Test {
protected:
    PageSources() : m_base(static_cast<char*>(Virtual::Alloc(nullptr, 4 * MIB32, RESERVE, nullptr))) {
        m_at = m_base + (MIB32 - reinterpret_cast<std::uintptr_t>(m_base) % MIB32);
    }
    ~PageSources() override { EXPECT_NE(Virtual::Free(m_base, 12345, RELEASE, 0), 0); }
    static void expect_report(DWORD code) {
        EXPECT_EQ(DebugOutput::take(), code != NONE ? report_of(code) : Pieces{});
    }
    template <class Result>
    static void expect_refused(Result result, DWORD code) {
        EXPECT_EQ(result, Result{});
        expect_report(code);
    }
    DebugOutput m_output;
    char *m_base, *m_at;  // m_at is a multiple of 32 MiB
};

TEST_F(PageSources, ranges_are_served_in_pieces_that_end_at_32_mebibytes_up_to_the_first_that_fails) {
    origin = reinterpret_cast<std::uintptr_t>(m_at);
    struct Row {
        std::uintptr_t start;  // from m_at
        unsigned long size;
        std::size_t failing;
        Calls pieces;
    };
    for (const auto& [start, size, failing, pieces] :
         {Row{0, 0x3000000, 0, {{0, 0x1FFFFFF}, {0x1FFFFFF, 1}, {MIB32, 0x1000000}}},
          {0UL - 0x1000, 0x2000, 0, {{0UL - 0x1000, 0x1000}, {0, 0x1000}}},
          {~0UL, 1, 0, {{~0UL, 1}}},
          {0, 0x1FFFFFF, 0, {{0, 0x1FFFFFF}}},
          {0, MIB32, 0, {{0, 0x1FFFFFF}, {0x1FFFFFF, 1}}},
          {1, 0x1FFFFFF, 0, {{1, 0x1FFFFFF}}},
          {0, 0x3000000, 2, {{0, 0x1FFFFFF}, {0x1FFFFFF, 1}}},
          {0, 0x3000000, 3, {{0, 0x1FFFFFF}, {0x1FFFFFF, 1}, {MIB32, 0x1000000}}},
          // The sum of rest and offset has 32 bits: here it is 0x1000, and the range is one piece.
          {0x2000, 0xFFFFF000, 1, {{0x2000, 0xFFFFF000}}}}) {
        SCOPED_TRACE(testing::Message() << start << ' ' << size << ' ' << failing);
        char* const at = m_at + static_cast<std::ptrdiff_t>(start);
        void* const page = at - reinterpret_cast<std::uintptr_t>(at) % 4096;
        calls.clear(), failing_call = failing;
        EXPECT_EQ(Virtual::Alloc(at, size, COMMIT, nullptr), failing == 0 ? page : nullptr);
        EXPECT_EQ(std::exchange(calls, {}), pieces);
        expect_report(failing != 0 ? ERROR_NO_SYSTEM_RESOURCES : NONE);
        for (std::size_t i = 0; i < pieces.size() - (failing != 0); ++i) {  // these stay committed
            m_at[static_cast<std::ptrdiff_t>(pieces[i].first + pieces[i].second - 1)] = 'x';
        }
        EXPECT_EQ(Virtual::Free(at, size, DECOMMIT, 0), failing == 0);
        EXPECT_EQ(calls, pieces);
        expect_report(failing != 0 ? ERROR_NO_SYSTEM_RESOURCES : NONE);
    }
    failing_call = 0;
}

TEST_F(PageSources, refusals_are_reported_and_unknown_codes_not) {
    for (const unsigned long type : {0UL, COMMIT | RESERVE, DECOMMIT | RELEASE, COMMIT | WIDE}) {
        EXPECT_TRUE(!Virtual::Alloc(m_base, 1, type, nullptr) && !Mapped::Alloc(m_base, 1, type, nullptr));
        EXPECT_EQ(Virtual::Free(m_base, 1, type << 2, 0) + Mapped::Free(m_base, 1, type << 2, 0), 0) << type;
    }
    expect_refused(Virtual::Alloc(m_base, 1, DECOMMIT, nullptr), NONE);
    expect_refused(Virtual::Alloc(m_base, 0, COMMIT, nullptr), NONE);
    expect_refused(Virtual::Alloc(m_base, BEYOND, RESERVE, nullptr), ERROR_INVALID_PARAMETER);
    expect_refused(Virtual::Alloc(m_base, 0, RESERVE, nullptr), ERROR_INVALID_PARAMETER);
    expect_refused(Virtual::Alloc(m_base, BEYOND, COMMIT, nullptr), ERROR_INVALID_PARAMETER);
    expect_refused(Virtual::Alloc(m_base - 1, 1, COMMIT, nullptr), ERROR_INVALID_ADDRESS);
    expect_refused(Virtual::Alloc(m_base, 1, RESERVE, nullptr), ERROR_INVALID_ADDRESS);
    expect_refused(Virtual::Free(m_base, 1, COMMIT, 0), NONE);
    expect_refused(Virtual::Free(m_base, 0, DECOMMIT, 0), NONE);
    expect_refused(Virtual::Free(m_base, BEYOND, DECOMMIT, 0), ERROR_INVALID_PARAMETER);
    expect_refused(Virtual::Free(m_at, 0, RELEASE, 0), ERROR_INVALID_ADDRESS);
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
    expect_refused(Mapped::Free(view + 4096, 0, RELEASE, handle), ERROR_INVALID_ADDRESS);
    expect_refused(Mapped::Free(view, 0, RELEASE, handle + WIDE), ERROR_INVALID_HANDLE);
    for (const unsigned long size : {0UL, BEYOND}) {
        handle = 5;
        EXPECT_EQ(Mapped::Alloc(nullptr, size, RESERVE, &handle), nullptr);
        EXPECT_EQ(handle, 0U);
    }
    expect_refused(Mapped::Alloc(nullptr, 1, RESERVE, nullptr), NONE);
}

}  // namespace
