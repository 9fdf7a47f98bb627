#include "basalt/memory/page_sources.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/virtual_memory.h"
#include "tests/support/debug_output.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/system_failures.h"
#include "tests/support/with_failing_allocations.h"

// The calls of the library into the platform, on their way through.
namespace {

struct Call {
    std::uintptr_t address;
    std::size_t size;
    DWORD type;
    bool operator==(const Call&) const = default;
};
std::vector<Call> calls;
int failing_call = 0;  // counted from 1; 0 for none

bool fails(const Call& call) {
    calls.push_back(call);
    if (static_cast<int>(calls.size()) != failing_call) {
        return false;
    }
    SetLastError(ERROR_NO_SYSTEM_RESOURCES);
    return true;
}

}  // namespace

extern "C" {
void* __real__Z12VirtualAllocPvmjj(void*, std::size_t, DWORD, DWORD);
int __real__Z11VirtualFreePvmj(void*, std::size_t, DWORD);

void* __wrap__Z12VirtualAllocPvmjj(void* address, std::size_t size, DWORD type, DWORD protection) {
    EXPECT_EQ(protection, type == MEM_RESERVE ? PAGE_NOACCESS : PAGE_READWRITE);
    const bool failed = fails({reinterpret_cast<std::uintptr_t>(address), size, type});
    return failed ? nullptr : __real__Z12VirtualAllocPvmjj(address, size, type, protection);
}

int __wrap__Z11VirtualFreePvmj(void* address, std::size_t size, DWORD type) {
    const bool failed = fails({reinterpret_cast<std::uintptr_t>(address), size, type});
    return failed ? 0 : __real__Z11VirtualFreePvmj(address, size, type);
}
}

namespace {

using basalt::test::DebugOutput;
using basalt::test::mapped_balance;
using basalt::test::open_descriptors;
using basalt::test::Pieces;
using basalt::test::report_of;
using basalt::test::SystemFailure;
using Virtual = vex_lib::vlSharedMemoryAllocator;
using Mapped = vex_lib::vlMMapFileAllocator;

constexpr unsigned long COMMIT = 0x1000, RESERVE = 0x2000, DECOMMIT = 0x4000, RELEASE = 0x8000;
constexpr unsigned long BOUNDARY = 0x2000000;
constexpr unsigned long BEYOND = 0x100001000;  // of which the low 32 bits would be a page

// A reservation with a boundary of 32 MiB in it.
class Reserved {
public:
    Reserved() : m_base(static_cast<char*>(Virtual::Alloc(nullptr, 4 * BOUNDARY, RESERVE, nullptr))) {
        EXPECT_NE(m_base, nullptr);
        const auto address = reinterpret_cast<std::uintptr_t>(m_base);
        m_boundary = m_base + (BOUNDARY - address % BOUNDARY);
        calls.clear();
    }
    ~Reserved() {
        failing_call = 0;
        EXPECT_NE(Virtual::Free(m_base, 12345, RELEASE, 0), 0);
    }
    Reserved(const Reserved&) = delete;
    Reserved& operator=(const Reserved&) = delete;

    char* base() const { return m_base; }
    char* boundary() const { return m_boundary; }

private:
    char* m_base;
    char* m_boundary;
};

Call call(const void* address, std::size_t size, DWORD type) {
    return {reinterpret_cast<std::uintptr_t>(address), size, type};
}

TEST(SharedMemoryAllocator, works_in_pieces_that_stop_at_32_mebibytes) {
    const DebugOutput output;
    const Reserved reserved;
    char* const at = reserved.boundary();
    struct Row {
        char* start;
        unsigned long size;
        std::vector<std::pair<char*, std::size_t>> pieces;
    };
    for (const Row& row : {
             Row{at, 0x3000000, {{at, 0x1FFFFFF}, {at + 0x1FFFFFF, 1}, {at + BOUNDARY, 0x1000000}}},
             Row{at - 0x1000, 0x2000, {{at - 0x1000, 0x1000}, {at, 0x1000}}},
             Row{at - 1, 1, {{at - 1, 1}}},
             Row{at, 0x1FFFFFF, {{at, 0x1FFFFFF}}},
             Row{at, BOUNDARY, {{at, 0x1FFFFFF}, {at + 0x1FFFFFF, 1}}},
             Row{at + 1, 0x1FFFFFE, {{at + 1, 0x1FFFFFE}}},
             Row{at + 1, 0x1FFFFFF, {{at + 1, 0x1FFFFFF}}},
         }) {
        std::vector<Call> commits, decommits;
        for (const auto& [start, size] : row.pieces) {
            commits.push_back(call(start, size, MEM_COMMIT));
            decommits.push_back(call(start, size, MEM_DECOMMIT));
        }
        calls.clear();
        auto* const base = static_cast<char*>(Virtual::Alloc(row.start, row.size, COMMIT, nullptr));
        EXPECT_EQ(base, row.start - reinterpret_cast<std::uintptr_t>(row.start) % 4096);
        EXPECT_EQ(calls, commits);
        row.start[0] = row.start[row.size - 1] = 'x';
        calls.clear();
        EXPECT_NE(Virtual::Free(row.start, row.size, DECOMMIT, 0), 0);
        EXPECT_EQ(calls, decommits);
        EXPECT_EQ(Virtual::Alloc(row.start, row.size, COMMIT, nullptr), base);
        EXPECT_EQ(row.start[0] + row.start[row.size - 1], 0) << "zero once more";
        EXPECT_NE(Virtual::Free(row.start, row.size, DECOMMIT, 0), 0);
    }
    // No address: the first piece is reserved as well, a second one cannot be.
    void* const anywhere = Virtual::Alloc(nullptr, 4096, COMMIT, nullptr);
    EXPECT_NE(anywhere, nullptr);
    EXPECT_NE(Virtual::Free(anywhere, 0, RELEASE, 0), 0);
    EXPECT_TRUE(output.take().empty());
    // The sum of rest and offset has 32 bits: it comes to 0x1000, and the range is one piece.
    calls.clear();
    failing_call = 1;
    EXPECT_EQ(Virtual::Alloc(at + 0x2000, 0xFFFFF000, COMMIT, nullptr), nullptr);
    EXPECT_EQ(calls, std::vector{call(at + 0x2000, 0xFFFFF000, MEM_COMMIT)});
    EXPECT_EQ(output.take(), report_of(ERROR_NO_SYSTEM_RESOURCES));
}

TEST(SharedMemoryAllocator, a_failing_piece_ends_it_and_is_reported) {
    const DebugOutput output;
    const Reserved reserved;
    char* const at = reserved.boundary();
    failing_call = 3;
    EXPECT_EQ(Virtual::Alloc(at, 0x3000000, COMMIT, nullptr), nullptr);
    EXPECT_EQ(calls.size(), 3U);
    EXPECT_EQ(output.take(), report_of(ERROR_NO_SYSTEM_RESOURCES));
    at[BOUNDARY - 1] = 'x';  // the first two pieces stay committed
    calls.clear();
    failing_call = 2;
    EXPECT_EQ(Virtual::Free(at, 0x3000000, DECOMMIT, 0), 0);
    EXPECT_EQ(calls.size(), 2U);
    EXPECT_EQ(output.take(), report_of(ERROR_NO_SYSTEM_RESOURCES));
    failing_call = 0;

    EXPECT_EQ(Virtual::Alloc(reserved.base() - 1, 1, COMMIT, nullptr), nullptr);
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_ADDRESS));
    EXPECT_EQ(Virtual::Free(at, 0, RELEASE, 0), 0) << "not the base";
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_ADDRESS));
    EXPECT_EQ(Virtual::Alloc(reserved.base(), 1, RESERVE, nullptr), nullptr) << "taken";
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_ADDRESS));
    EXPECT_EQ(Virtual::Alloc(nullptr, 0, RESERVE, nullptr), nullptr);
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_PARAMETER));
}

TEST(SharedMemoryAllocator, nothing_else_is_served) {
    const DebugOutput output;
    const Reserved reserved;
    for (const unsigned long type : {0UL, COMMIT | RESERVE, DECOMMIT, RELEASE, COMMIT | 1UL << 32}) {
        EXPECT_EQ(Virtual::Alloc(reserved.base(), 1, type, nullptr), nullptr);
    }
    for (const unsigned long type : {0UL, COMMIT, RESERVE, DECOMMIT | RELEASE, RELEASE | 1UL << 32}) {
        EXPECT_EQ(Virtual::Free(reserved.base(), 1, type, 0), 0);
    }
    EXPECT_EQ(Virtual::Alloc(reserved.base(), 0, COMMIT, nullptr), nullptr);
    EXPECT_EQ(Virtual::Free(reserved.base(), 0, DECOMMIT, 0), 0);
    EXPECT_EQ(output.take(), Pieces{});
    SetLastError(ERROR_SUCCESS);
    EXPECT_EQ(Virtual::Alloc(nullptr, BEYOND, RESERVE, nullptr), nullptr);
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_PARAMETER));
    SetLastError(ERROR_SUCCESS);
    EXPECT_EQ(Virtual::Alloc(reserved.base(), BEYOND, COMMIT, nullptr), nullptr);
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_PARAMETER));
    SetLastError(ERROR_SUCCESS);
    EXPECT_EQ(Virtual::Free(reserved.base(), BEYOND, DECOMMIT, 0), 0);
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_PARAMETER));
    EXPECT_EQ(calls, std::vector<Call>{});
}

TEST(MMapFileAllocator, a_reservation_is_usable_at_once) {
    const DebugOutput output;
    const long mapped = mapped_balance();
    const long descriptors = open_descriptors();
    unsigned long handle = 0;
    auto* const view = static_cast<char*>(Mapped::Alloc(nullptr, 100'000, RESERVE, &handle));
    ASSERT_NE(view, nullptr);
    EXPECT_NE(handle, 0U);
    EXPECT_LE(handle, 0xFFFFFFFFU);
    EXPECT_EQ(std::count(view, view + 100'000, 0), 100'000);
    view[99'999] = 'x';
    EXPECT_EQ(Mapped::Alloc(view + 5, 10, COMMIT, nullptr), view + 5);
    EXPECT_EQ(Mapped::Free(view, 100'000, DECOMMIT, handle), 1);
    EXPECT_EQ(view[99'999], 'x');
    EXPECT_EQ(output.take(), Pieces{});
    EXPECT_EQ(Mapped::Free(view + 4096, 0, RELEASE, handle), 0);
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_ADDRESS));
    EXPECT_NE(Mapped::Free(view, 0, RELEASE, handle), 0);
    EXPECT_EQ(output.take(), Pieces{});

    auto* const other = static_cast<char*>(Mapped::Alloc(nullptr, 1, RESERVE, &handle));
    EXPECT_EQ(Mapped::Free(other, 0, RELEASE, handle + (1UL << 32)), 0) << "no 32 bits, never cut";
    EXPECT_EQ(output.take(), report_of(ERROR_INVALID_HANDLE));
    EXPECT_EQ(mapped_balance(), mapped) << "the view was unmapped before";
    EXPECT_EQ(open_descriptors(), descriptors);
}

TEST(MMapFileAllocator, failures_are_null_and_unreported) {
    const DebugOutput output;
    const long mapped = mapped_balance();
    for (const unsigned long size : {0UL, BEYOND}) {
        unsigned long handle = 5;
        EXPECT_EQ(Mapped::Alloc(nullptr, size, RESERVE, &handle), nullptr);
        EXPECT_EQ(handle, 0U);
    }
    EXPECT_EQ(Mapped::Alloc(nullptr, 1, RESERVE, nullptr), nullptr);
    int anything = 0;
    for (const unsigned long type : {0UL, COMMIT | RESERVE, DECOMMIT}) {
        EXPECT_EQ(Mapped::Alloc(&anything, 1, type, nullptr), nullptr);
        EXPECT_EQ(Mapped::Free(nullptr, 1, type == DECOMMIT ? RESERVE : type, 0), 0);
    }
    unsigned long handle = 0;
    {
        const SystemFailure failure(1);
        EXPECT_EQ(Mapped::Alloc(nullptr, 4096, RESERVE, &handle), nullptr);
    }
    EXPECT_EQ(handle, 0U);
    void* view = nullptr;
    with_failing_allocations([&] { view = Mapped::Alloc(nullptr, 4096, RESERVE, &handle); },
                             [&](bool failed) {
                                 EXPECT_EQ(view == nullptr, failed);
                                 EXPECT_EQ(view == nullptr ? 1 : Mapped::Free(view, 0, RELEASE, handle), 1);
                             });
    EXPECT_EQ(mapped_balance(), mapped);
    EXPECT_EQ(output.take(), Pieces{});
}

}  // namespace
