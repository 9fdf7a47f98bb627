// The system's error numbers as Win32 error codes.
#ifndef BASALT_SRC_PLATFORM_ERRORS_ERROR_FROM_ERRNO_H
#define BASALT_SRC_PLATFORM_ERRORS_ERROR_FROM_ERRNO_H

#include <string_view>

#include "basalt/platform/types.h"

namespace basalt::platform {

// The corresponding code: 0 for 0, ERROR_GEN_FAILURE for a number without one. EEXIST is ERROR_FILE_EXISTS;
// callers for which a number means something else (EAGAIN of a lock) set the code themselves.
DWORD error_from_errno(int number);

// The code for an errno value of a call with a path; distinguishes a missing file from a missing folder.
DWORD error_of_path(std::string_view path, int number);

}  // namespace basalt::platform

#endif
