// For calls that may not throw: std::bad_alloc and std::length_error as an error code.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_OUT_OF_MEMORY_H
#define BASALT_SRC_PLATFORM_SYSTEM_OUT_OF_MEMORY_H

#include <exception>

#include "basalt/platform/error.h"

namespace basalt::platform {

// The body's result; `failed`, with ERROR_NOT_ENOUGH_MEMORY set, when it throws.
template <class Result, class Body>
Result or_out_of_memory(Result failed, Body body) noexcept {
    try {
        return body();
    } catch (const std::exception&) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return failed;
    }
}

// Sets the last error and returns `failed`.
template <class Result>
Result fail_with(DWORD error, Result failed) noexcept {
    SetLastError(error);
    return failed;
}

}  // namespace basalt::platform

#endif
