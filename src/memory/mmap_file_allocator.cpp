#include <cstdint>

#include "basalt/memory/page_sources.h"
#include "src/memory/report_last_error.h"
#include "src/platform/file_mapping.h"

namespace vex_lib {
namespace {

void* reserve(unsigned long size, unsigned long* handle) {
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

int release(void* view, unsigned long handle) {
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

void* vlMMapFileAllocator::Alloc(void* address, unsigned long size, unsigned long type,
                                 unsigned long* handle) {
    switch (type) {
        case MEM_RESERVE:
            return reserve(size, handle);
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
            return release(address, handle);
        default:
            return 0;
    }
}

}  // namespace vex_lib
