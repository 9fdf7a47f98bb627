/// @file
/// Last error of the calling thread and the debugger output.
#ifndef BASALT_PLATFORM_ERROR_H
#define BASALT_PLATFORM_ERROR_H

#include "basalt/export.h"
#include "basalt/platform/types.h"

inline constexpr DWORD ERROR_SUCCESS = 0;
inline constexpr DWORD ERROR_FILE_NOT_FOUND = 2;
inline constexpr DWORD ERROR_PATH_NOT_FOUND = 3;
inline constexpr DWORD ERROR_TOO_MANY_OPEN_FILES = 4;
inline constexpr DWORD ERROR_ACCESS_DENIED = 5;
inline constexpr DWORD ERROR_INVALID_HANDLE = 6;
inline constexpr DWORD ERROR_NOT_ENOUGH_MEMORY = 8;
inline constexpr DWORD ERROR_INVALID_PARAMETER = 87;
inline constexpr DWORD ERROR_DISK_FULL = 112;
inline constexpr DWORD ERROR_INSUFFICIENT_BUFFER = 122;

/// The calling thread's last error code.
BASALT_API DWORD GetLastError();
/// Sets the calling thread's last error code.
BASALT_API void SetLastError(DWORD code);

/// Writes text to the debugger output: the handler set below, by default standard error.
BASALT_API void OutputDebugStringW(const wchar_t* text);

namespace basalt::platform {

/// Receives each piece of debugger output, on the thread that wrote it.
using DebugOutputHandler = void (*)(const wchar_t* text);

/// Replaces the debugger output's handler and answers the one before; null means standard error.
BASALT_API DebugOutputHandler SetDebugOutputHandler(DebugOutputHandler handler);

}  // namespace basalt::platform

#endif
