// Why a call failed.
#ifndef BASALT_TESTS_PLATFORM_ERROR_OF_H
#define BASALT_TESTS_PLATFORM_ERROR_OF_H

#include "basalt/platform/error.h"

namespace basalt::test {

// The last error, cleared, after a call that returned null or 0; no error's code for any other result.
template <class Result>
DWORD error_of(Result result) {
    const DWORD error = GetLastError();
    SetLastError(ERROR_SUCCESS);
    return result == Result{} ? error : 0xFFFFFFFF;
}

}  // namespace basalt::test

#endif
