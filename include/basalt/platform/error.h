/// @file
/// Last error of the calling thread, result codes and the debugger output.
#ifndef BASALT_PLATFORM_ERROR_H
#define BASALT_PLATFORM_ERROR_H

#include "basalt/export.h"
#include "basalt/platform/types.h"

/// @name Error codes, with their published values
/// @{
inline constexpr DWORD ERROR_SUCCESS = 0;                     ///< no error
inline constexpr DWORD ERROR_INVALID_FUNCTION = 1;            ///< no valid operation
inline constexpr DWORD ERROR_FILE_NOT_FOUND = 2;              ///< no such file
inline constexpr DWORD ERROR_PATH_NOT_FOUND = 3;              ///< no such folder on the path
inline constexpr DWORD ERROR_TOO_MANY_OPEN_FILES = 4;         ///< no more descriptors
inline constexpr DWORD ERROR_ACCESS_DENIED = 5;               ///< not allowed
inline constexpr DWORD ERROR_INVALID_HANDLE = 6;              ///< no valid handle
inline constexpr DWORD ERROR_NOT_ENOUGH_MEMORY = 8;           ///< no room for the request
inline constexpr DWORD ERROR_OUTOFMEMORY = 14;                ///< memory exhausted
inline constexpr DWORD ERROR_NOT_SAME_DEVICE = 17;            ///< files on different devices
inline constexpr DWORD ERROR_NO_MORE_FILES = 18;              ///< a search has ended
inline constexpr DWORD ERROR_WRITE_PROTECT = 19;              ///< read-only medium
inline constexpr DWORD ERROR_GEN_FAILURE = 31;                ///< a failure without a code of its own
inline constexpr DWORD ERROR_SHARING_VIOLATION = 32;          ///< in use and not shared
inline constexpr DWORD ERROR_LOCK_VIOLATION = 33;             ///< a part is locked
inline constexpr DWORD ERROR_NOT_SUPPORTED = 50;              ///< not supported
inline constexpr DWORD ERROR_DEV_NOT_EXIST = 55;              ///< no such device
inline constexpr DWORD ERROR_FILE_EXISTS = 80;                ///< a new file exists already
inline constexpr DWORD ERROR_INVALID_PARAMETER = 87;          ///< an argument is not valid
inline constexpr DWORD ERROR_DISK_FULL = 112;                 ///< no space left
inline constexpr DWORD ERROR_INSUFFICIENT_BUFFER = 122;       ///< buffer too small
inline constexpr DWORD ERROR_INVALID_NAME = 123;              ///< no valid name
inline constexpr DWORD ERROR_DIR_NOT_EMPTY = 145;             ///< folder not empty
inline constexpr DWORD ERROR_BUSY = 170;                      ///< object busy
inline constexpr DWORD ERROR_ALREADY_EXISTS = 183;            ///< an object of this name exists already
inline constexpr DWORD ERROR_FILENAME_EXCED_RANGE = 206;      ///< name too long
inline constexpr DWORD ERROR_FILE_TOO_LARGE = 223;            ///< file too large
inline constexpr DWORD ERROR_DIRECTORY = 267;                 ///< not the name of a folder
inline constexpr DWORD ERROR_INVALID_ADDRESS = 487;           ///< no valid address
inline constexpr DWORD ERROR_ARITHMETIC_OVERFLOW = 534;       ///< a number does not fit its type
inline constexpr DWORD ERROR_OPERATION_ABORTED = 995;         ///< interrupted
inline constexpr DWORD ERROR_NOACCESS = 998;                  ///< memory not accessible
inline constexpr DWORD ERROR_FILE_INVALID = 1006;             ///< file changed from outside
inline constexpr DWORD ERROR_NO_UNICODE_TRANSLATION = 1113;   ///< a character the encoding lacks
inline constexpr DWORD ERROR_IO_DEVICE = 1117;                ///< device failure
inline constexpr DWORD ERROR_NO_SYSTEM_RESOURCES = 1450;      ///< resources exhausted
inline constexpr DWORD ERROR_COMMITMENT_LIMIT = 1455;         ///< no more memory to be had
inline constexpr DWORD ERROR_TIMEOUT = 1460;                  ///< took too long
inline constexpr DWORD ERROR_RESOURCE_DATA_NOT_FOUND = 1812;  ///< a file without the resource
inline constexpr DWORD ERROR_RESOURCE_TYPE_NOT_FOUND = 1813;  ///< a resource without the value
inline constexpr DWORD ERROR_CANT_RESOLVE_FILENAME = 1921;    ///< links that lead nowhere
/// @}

/// The calling thread's last error code: what the last failed call of the platform layer on this thread
/// left behind, 0 on a thread where none has failed. Successful calls leave it alone.
/// Threads: thread-safe; each thread has its own.
BASALT_API DWORD GetLastError();

/// Sets the calling thread's last error code; any value is kept as given.
/// Threads: thread-safe; each thread has its own.
BASALT_API void SetLastError(DWORD code);

/// An error code as a result code: 0x80070000 with the code's low 16 bits. A code that is 0, or already a
/// negative result code, comes back as it is.
/// Threads: reentrant.
constexpr HRESULT HRESULT_FROM_WIN32(DWORD code) {
    const bool is_result = static_cast<HRESULT>(code) <= 0;
    return static_cast<HRESULT>(is_result ? code : 0x80070000U | (code & 0xFFFFU));
}

/// Writes text to the debugger output: to the handler set below, or else as UTF-8 to standard error.
/// @param text the text, written as it is without a line end added; null writes nothing
/// What the output does with it is not reported. Last error and errno are as before the call.
/// Threads: thread-safe; texts of up to about 200 characters are written whole.
BASALT_API void OutputDebugStringW(const wchar_t* text);

namespace basalt::platform {

/// Receives each piece of debugger output, on the thread that wrote it. The text is never null and is
/// valid during the call; the handler may not throw and may be called by several threads at once.
using DebugOutputHandler = void (*)(const wchar_t* text);

/// Replaces the debugger output's handler.
/// @param handler the new handler; null is standard error
/// @return the handler before, null for standard error. A call already under way on another thread may
/// still reach it.
/// Threads: thread-safe.
BASALT_API DebugOutputHandler SetDebugOutputHandler(DebugOutputHandler handler);

}  // namespace basalt::platform

#endif
