// The edge between calls that may not throw and the text and tables they are written with.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_OUT_OF_MEMORY_H
#define BASALT_SRC_PLATFORM_SYSTEM_OUT_OF_MEMORY_H

#include <exception>

#include "basalt/platform/error.h"

namespace basalt::platform {

// The body's result; when that runs out of memory (or of the length of a text), `failed` with
// ERROR_NOT_ENOUGH_MEMORY.
template <class Result, class Body>
Result or_out_of_memory(Result failed, Body body) noexcept {
    try {
        return body();
    } catch (const std::exception&) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return failed;
    }
}

// `failed`, with the error set.
template <class Result>
Result fail_with(DWORD error, Result failed) noexcept {
    SetLastError(error);
    return failed;
}

}  // namespace basalt::platform

#endif
