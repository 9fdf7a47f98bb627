#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "basalt/memory/page_sources.h"
#include "basalt/platform/error.h"
#include "src/memory/report_last_error.h"
#include "src/platform/virtual_memory.h"

namespace vex_lib {
namespace {

constexpr std::uint32_t BOUNDARY = std::uint32_t{32} << 20;

// Bytes of the piece at the front of a range of `rest` bytes, which stops at the next boundary of 32 MiB; one
// that begins at a boundary stops a byte short of the next. The sum is meant to have 32 bits.
std::uint32_t piece_size(std::uintptr_t start, std::uint32_t rest) {
    const auto offset = static_cast<std::uint32_t>(start % BOUNDARY);
    if (rest + offset < BOUNDARY) {
        return rest;
    }
    return offset == 0 ? BOUNDARY - 1 : BOUNDARY - offset;
}

// Calls `work` with the address and size of each piece of a range until it answers false, which is reported
// and answered. Addresses are numbers here: the range may be any, null as well.
template <class Work>
bool for_each_piece(void* address, std::uint32_t size, Work work) {
    auto piece = reinterpret_cast<std::uintptr_t>(address);
    for (std::uint32_t rest = size; rest > 0;) {
        const std::uint32_t bytes = piece_size(piece, rest);
        if (!work(reinterpret_cast<void*>(piece), bytes)) {
            ReportLastError();
            return false;
        }
        piece += bytes;
        rest -= bytes;
    }
    return true;
}

// Whether a size has 32 bits; what has more is reported as an invalid parameter.
bool is_in_range(unsigned long size) {
    if (size <= UINT32_MAX) {
        return true;
    }
    SetLastError(ERROR_INVALID_PARAMETER);
    ReportLastError();
    return false;
}

void* reserve(void* address, unsigned long size) {
    if (!is_in_range(size)) {
        return nullptr;
    }
    void* const base = VirtualAlloc(address, size, MEM_RESERVE, PAGE_NOACCESS);
    if (base == nullptr) {
        ReportLastError();
    }
    return base;
}

void* commit(void* address, unsigned long size) {
    if (!is_in_range(size)) {
        return nullptr;
    }
    void* base = nullptr;
    const bool done =
        for_each_piece(address, static_cast<std::uint32_t>(size), [&](void* piece, DWORD bytes) {
            void* const pages = VirtualAlloc(piece, bytes, MEM_COMMIT, PAGE_READWRITE);
            base = base == nullptr ? pages : base;
            return pages != nullptr;
        });
    return done ? base : nullptr;
}

int decommit(void* address, unsigned long size) {
    if (!is_in_range(size)) {
        return 0;
    }
    int result = 0;
    for_each_piece(address, static_cast<std::uint32_t>(size), [&](void* piece, DWORD bytes) {
        result = VirtualFree(piece, bytes, MEM_DECOMMIT);
        return result != 0;
    });
    return result;
}

int release(void* base) {
    const int result = VirtualFree(base, 0, MEM_RELEASE);
    if (result == 0) {
        ReportLastError();
    }
    return result;
}

}  // namespace

void* vlSharedMemoryAllocator::Alloc(void* address, unsigned long size, unsigned long type, unsigned long*) {
    switch (type) {
        case MEM_RESERVE:
            return reserve(address, size);
        case MEM_COMMIT:
            return commit(address, size);
        default:
            return nullptr;
    }
}

int vlSharedMemoryAllocator::Free(void* address, unsigned long size, unsigned long type, unsigned long) {
    switch (type) {
        case MEM_DECOMMIT:
            return decommit(address, size);
        case MEM_RELEASE:
            return release(address);
        default:
            return 0;
    }
}

}  // namespace vex_lib
