/// @file
/// Last error of the calling thread, result codes and the debugger output.
#ifndef BASALT_PLATFORM_ERROR_H
#define BASALT_PLATFORM_ERROR_H

#include "basalt/export.h"
#include "basalt/platform/types.h"

/// @name Error codes, with their Win32 values
/// @{
inline constexpr DWORD ERROR_SUCCESS = 0;                     ///< no error
inline constexpr DWORD ERROR_FILE_NOT_FOUND = 2;              ///< no such file
inline constexpr DWORD ERROR_PATH_NOT_FOUND = 3;              ///< no such folder on the path
inline constexpr DWORD ERROR_TOO_MANY_OPEN_FILES = 4;         ///< too many open files
inline constexpr DWORD ERROR_ACCESS_DENIED = 5;               ///< not allowed
inline constexpr DWORD ERROR_INVALID_HANDLE = 6;              ///< invalid handle
inline constexpr DWORD ERROR_NOT_ENOUGH_MEMORY = 8;           ///< out of memory
inline constexpr DWORD ERROR_NO_MORE_FILES = 18;              ///< a search has ended
inline constexpr DWORD ERROR_WRITE_PROTECT = 19;              ///< read-only medium
inline constexpr DWORD ERROR_GEN_FAILURE = 31;                ///< any other failure
inline constexpr DWORD ERROR_SHARING_VIOLATION = 32;          ///< in use and not shared
inline constexpr DWORD ERROR_NOT_SUPPORTED = 50;              ///< not supported
inline constexpr DWORD ERROR_DEV_NOT_EXIST = 55;              ///< no such device
inline constexpr DWORD ERROR_FILE_EXISTS = 80;                ///< a new file exists already
inline constexpr DWORD ERROR_INVALID_PARAMETER = 87;          ///< invalid argument
inline constexpr DWORD ERROR_DISK_FULL = 112;                 ///< no space left
inline constexpr DWORD ERROR_INSUFFICIENT_BUFFER = 122;       ///< buffer too small
inline constexpr DWORD ERROR_INVALID_NAME = 123;              ///< invalid name
inline constexpr DWORD ERROR_BUSY = 170;                      ///< object busy
inline constexpr DWORD ERROR_FILENAME_EXCED_RANGE = 206;      ///< name too long
inline constexpr DWORD ERROR_FILE_TOO_LARGE = 223;            ///< file too large
inline constexpr DWORD ERROR_INVALID_ADDRESS = 487;           ///< invalid address
inline constexpr DWORD ERROR_ARITHMETIC_OVERFLOW = 534;       ///< a number does not fit its type
inline constexpr DWORD ERROR_OPERATION_ABORTED = 995;         ///< interrupted
inline constexpr DWORD ERROR_NOACCESS = 998;                  ///< memory not accessible
inline constexpr DWORD ERROR_FILE_INVALID = 1006;             ///< file that cannot be mapped
inline constexpr DWORD ERROR_NO_UNICODE_TRANSLATION = 1113;   ///< a character that the encoding lacks
inline constexpr DWORD ERROR_IO_DEVICE = 1117;                ///< device failure
inline constexpr DWORD ERROR_NO_SYSTEM_RESOURCES = 1450;      ///< resources exhausted
inline constexpr DWORD ERROR_TIMEOUT = 1460;                  ///< took too long
inline constexpr DWORD ERROR_RESOURCE_DATA_NOT_FOUND = 1812;  ///< a file without the resource
inline constexpr DWORD ERROR_RESOURCE_TYPE_NOT_FOUND = 1813;  ///< a resource without the value
inline constexpr DWORD ERROR_CANT_RESOLVE_FILENAME = 1921;    ///< links that lead nowhere
/// @}

/// The calling thread's last error code, set by the last failed call of the platform layer on this thread; 0
/// if none has failed. Successful calls do not change it.
/// Threads: thread-safe; each thread has its own.
BASALT_API DWORD GetLastError();

/// Sets the calling thread's last error code, to any value.
/// Threads: thread-safe; each thread has its own.
BASALT_API void SetLastError(DWORD code);

/// An error code as a result code: 0x80070000 with the code's low 16 bits. 0 and codes that are negative
/// result codes already are returned unchanged.
/// Threads: reentrant.
constexpr HRESULT HRESULT_FROM_WIN32(DWORD code) {
    const bool is_result = static_cast<HRESULT>(code) <= 0;
    return static_cast<HRESULT>(is_result ? code : 0x80070000U | (code & 0xFFFFU));
}

/// Writes text to the debugger output: to the handler set below, or else as UTF-8 to standard error.
/// @param text the text, to which no line end is added; null writes nothing
/// Failures to write are ignored. Last error and errno are unchanged.
/// Threads: thread-safe; texts of up to about 200 characters are written whole.
BASALT_API void OutputDebugStringW(const wchar_t* text);

namespace basalt::platform {

/// Receives each debugger output, on the thread that wrote it. The text is not null and valid during the
/// call. The handler may not throw, and several threads may call it at once.
using DebugOutputHandler = void (*)(const wchar_t* text);

/// Replaces the debugger output's handler.
/// @param handler the new handler; null is standard error
/// @return the previous handler, null for standard error. A call in progress on another thread may still
/// reach it.
/// Threads: thread-safe.
BASALT_API DebugOutputHandler SetDebugOutputHandler(DebugOutputHandler handler);

}  // namespace basalt::platform

#endif
