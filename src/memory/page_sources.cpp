#include "basalt/memory/page_sources.h"

#include <cstdint>

#include "basalt/platform/error.h"
#include "src/memory/allocators.h"
#include "src/platform/file_mapping.h"
#include "src/platform/virtual_memory.h"

namespace vex_lib {
namespace {

constexpr std::uint32_t BOUNDARY = std::uint32_t{32} << 20;

// Bytes of the first piece of a range of `rest` bytes. It ends at the next boundary of 32 MiB; a piece that
// begins at a boundary ends a byte before the next. The sum has 32 bits on purpose.
std::uint32_t piece_size(std::uintptr_t start, std::uint32_t rest) {
    const auto offset = static_cast<std::uint32_t>(start % BOUNDARY);
    if (rest + offset < BOUNDARY) {
        return rest;
    }
    return offset == 0 ? BOUNDARY - 1 : BOUNDARY - offset;
}

// Calls `work` with the address and size of each piece of a range; false, with a report, at the first that
// fails. Addresses are numbers here: the range may be invalid.
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

// Whether a size fits in 32 bits; a larger one is reported as an invalid parameter.
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

void* map_view(unsigned long size, unsigned long* handle) {
    if (handle == nullptr) {
        return nullptr;
    }
    *handle = 0;
    if (size > UINT32_MAX) {
        return nullptr;
    }
    const HANDLE mapping = CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, PAGE_READWRITE, 0,
                                              static_cast<DWORD>(size), nullptr);
    if (mapping == nullptr) {
        return nullptr;
    }
    void* const view = MapViewOfFile(mapping, FILE_MAP_ALL_ACCESS, 0, 0, size);
    if (view == nullptr) {
        CloseHandle(mapping);
        return nullptr;
    }
    *handle = reinterpret_cast<std::uintptr_t>(mapping);
    return view;
}

int release_view(void* view, unsigned long handle) {
    if (UnmapViewOfFile(view) == 0) {
        ReportLastError();
        return 0;
    }
    const int result = CloseHandle(reinterpret_cast<HANDLE>(std::uintptr_t{handle}));
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

void* vlMMapFileAllocator::Alloc(void* address, unsigned long size, unsigned long type,
                                 unsigned long* handle) {
    switch (type) {
        case MEM_RESERVE:
            return map_view(size, handle);
        case MEM_COMMIT:
            return address;
        default:
            return nullptr;
    }
}

int vlMMapFileAllocator::Free(void* address, unsigned long, unsigned long type, unsigned long handle) {
    switch (type) {
        case MEM_DECOMMIT:
            return 1;
        case MEM_RELEASE:
            return release_view(address, handle);
        default:
            return 0;
    }
}

}  // namespace vex_lib
