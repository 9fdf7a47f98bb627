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
std::uint32_t piece_size(const std::byte* start, std::uint32_t rest) {
    const auto offset = static_cast<std::uint32_t>(reinterpret_cast<std::uintptr_t>(start) % BOUNDARY);
    if (rest + offset < BOUNDARY) {
        return rest;
    }
    return offset == 0 ? BOUNDARY - 1 : BOUNDARY - offset;
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
    auto* piece = static_cast<std::byte*>(address);
    for (auto rest = static_cast<std::uint32_t>(size); rest > 0;) {
        const std::uint32_t bytes = piece_size(piece, rest);
        void* const pages = VirtualAlloc(piece, bytes, MEM_COMMIT, PAGE_READWRITE);
        if (pages == nullptr) {
            ReportLastError();
            return nullptr;
        }
        base = base == nullptr ? pages : base;
        piece += bytes;
        rest -= bytes;
    }
    return base;
}

int decommit(void* address, unsigned long size) {
    if (!is_in_range(size)) {
        return 0;
    }
    int result = 0;
    auto* piece = static_cast<std::byte*>(address);
    for (auto rest = static_cast<std::uint32_t>(size); rest > 0;) {
        const std::uint32_t bytes = piece_size(piece, rest);
        result = VirtualFree(piece, bytes, MEM_DECOMMIT);
        if (result == 0) {
            ReportLastError();
            return 0;
        }
        piece += bytes;
        rest -= bytes;
    }
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
