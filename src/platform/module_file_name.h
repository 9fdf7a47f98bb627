// Name of the running program's file.
#ifndef BASALT_SRC_PLATFORM_MODULE_FILE_NAME_H
#define BASALT_SRC_PLATFORM_MODULE_FILE_NAME_H

#include "basalt/platform/types.h"

// Full name of the file that the running program was started from, whatever name it was called by. A file
// that was replaced or deleted since has " (deleted)" after its name. `module` is null, the only one there
// is; `name` has room for `size` characters, the terminator included. Result: the characters written, without
// the terminator. A longer name is cut at `size` - 1 with a terminator, and `size` is the result with
// ERROR_INSUFFICIENT_BUFFER. Failure: 0, with ERROR_INVALID_HANDLE for another module,
// ERROR_INVALID_PARAMETER for no room, ERROR_NOT_ENOUGH_MEMORY. Threads: thread-safe.
DWORD GetModuleFileNameW(HINSTANCE module, wchar_t* name, DWORD size);

#endif
