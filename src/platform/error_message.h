// Message texts of error codes.
#ifndef BASALT_SRC_PLATFORM_ERROR_MESSAGE_H
#define BASALT_SRC_PLATFORM_ERROR_MESSAGE_H

#include "basalt/platform/types.h"

inline constexpr DWORD FORMAT_MESSAGE_ALLOCATE_BUFFER = 0x0100;
inline constexpr DWORD FORMAT_MESSAGE_IGNORE_INSERTS = 0x0200;
inline constexpr DWORD FORMAT_MESSAGE_FROM_SYSTEM = 0x1000;

// Allocates a buffer, to be released by LocalFree(), with the message text of an error code.
//   flags      the three above together (0x1300)
//   code       any code; "Unknown error N", N in decimal, for those that no report of the library has
//   buffer     receives the text's address, null on failure
//   source, language, size, arguments  null and 0
// Result: the text's length without its terminator. Unlike Win32's, the text does not end with a line break.
// Failure: 0 with ERROR_NOT_ENOUGH_MEMORY if out of memory.
// Threads: thread-safe.
DWORD FormatMessageW(DWORD flags, const void* source, DWORD code, DWORD language, wchar_t** buffer,
                     DWORD size, void* arguments);

// Releases a buffer of FormatMessageW(), or nothing for null. Result: null.
// Threads: thread-safe.
void* LocalFree(void* block);

#endif
