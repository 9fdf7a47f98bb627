// Message texts of error codes: FormatMessageW and LocalFree, for the one use this project has for them.
#ifndef BASALT_SRC_PLATFORM_ERROR_MESSAGE_H
#define BASALT_SRC_PLATFORM_ERROR_MESSAGE_H

#include "basalt/platform/types.h"

inline constexpr DWORD FORMAT_MESSAGE_ALLOCATE_BUFFER = 0x0100;
inline constexpr DWORD FORMAT_MESSAGE_IGNORE_INSERTS = 0x0200;
inline constexpr DWORD FORMAT_MESSAGE_FROM_SYSTEM = 0x1000;

// Puts the message text of an error code into a buffer of its own, for LocalFree to release.
//   flags      the three above together (0x1300); no other set is supported
//   source, arguments  not looked at
//   code       any code; one without a text of its own gives "Unknown error N", N in decimal
//   language   0, the system's default
//   buffer     receives the text's address, null on failure
//   size       least size of the buffer in characters
// Result: the text's length without its terminator. The text has no line break at its end, unlike the
// platform's own: whoever writes it out adds one.
// Failure: 0 with ERROR_INVALID_PARAMETER for other flags, another language or a null buffer, with
// ERROR_NOT_ENOUGH_MEMORY when there is no room for the text.
// Threads: thread-safe.
DWORD FormatMessageW(DWORD flags, const void* source, DWORD code, DWORD language, wchar_t** buffer,
                     DWORD size, void* arguments);

// Releases a buffer of FormatMessageW; null is allowed. Result: null, always.
// Threads: thread-safe.
void* LocalFree(void* block);

#endif
