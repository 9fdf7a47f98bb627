// Failures as results: a call sets the last error and returns the value that reports failure.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_FAILURE_H
#define BASALT_SRC_PLATFORM_SYSTEM_FAILURE_H

#include <exception>
#include <utility>

#include "basalt/platform/error.h"

namespace basalt::platform {

// Sets the last error and returns `failed`.
template <class Result>
Result fail_with(DWORD error, Result failed) noexcept {
    SetLastError(error);
    return failed;
}

// The body's result; `failed`, with ERROR_NOT_ENOUGH_MEMORY, when it throws std::bad_alloc or length_error.
template <class Result, class Body>
Result or_out_of_memory(Result failed, Body body) noexcept {
    try {
        return body();
    } catch (const std::exception&) {
        return fail_with(ERROR_NOT_ENOUGH_MEMORY, std::move(failed));
    }
}

}  // namespace basalt::platform

#endif
