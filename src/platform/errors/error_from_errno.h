// From the system's error numbers to the published error codes.
#ifndef BASALT_SRC_PLATFORM_ERRORS_ERROR_FROM_ERRNO_H
#define BASALT_SRC_PLATFORM_ERRORS_ERROR_FROM_ERRNO_H

#include <string_view>

#include "basalt/platform/types.h"

namespace basalt::platform {

// The published code that says the same: 0 for 0, ERROR_GEN_FAILURE for a number without a counterpart.
// EEXIST is ERROR_FILE_EXISTS; rooms in which the same number means more than one thing (EAGAIN of a lock,
// EEXIST of a folder or mapping) set the code themselves.
DWORD error_from_errno(int number);

// Sets the calling thread's last error from errno; call it directly after the call that failed.
void set_last_error_from_errno();

// The published code of an errno value that a call gave for a path: a missing file is told from a missing
// folder.
DWORD error_of_path(std::string_view path, int number);

}  // namespace basalt::platform

#endif
