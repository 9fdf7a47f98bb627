// Tells why a call failed.
#ifndef BASALT_TESTS_PLATFORM_ERROR_OF_H
#define BASALT_TESTS_PLATFORM_ERROR_OF_H

#include <gtest/gtest.h>

#include "basalt/platform/error.h"

namespace basalt::test {

// The last error after a call that has to answer nothing: null or zero. It is taken away, so that the next
// call is not credited with it.
template <class Answer>
DWORD error_of(Answer answer) {
    EXPECT_TRUE(answer == Answer{});
    const DWORD error = GetLastError();
    SetLastError(ERROR_SUCCESS);
    return error;
}

}  // namespace basalt::test

#endif
