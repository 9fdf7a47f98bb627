// Text from and to the active code page, and integers as text, in the caller's buffers.
#ifndef BASALT_SRC_PLATFORM_TEXT_CONVERSION_H
#define BASALT_SRC_PLATFORM_TEXT_CONVERSION_H

#include <cstddef>

#include "basalt/platform/types.h"

inline constexpr UINT CP_ACP = 0;
inline constexpr DWORD MB_PRECOMPOSED = 1;

// Both conversions: `length` is the source's number of characters, or -1 to include everything up to and with
// its terminator. `capacity` is the destination's number of characters; 0 requests the number needed.
// Result: the number of characters written (no terminator is added), or 0 with ERROR_INSUFFICIENT_BUFFER if
// they do not all fit (the destination's contents are then unspecified), or with ERROR_INVALID_PARAMETER for
// an empty source, a null pointer, another negative count and a code page other than CP_ACP.
// Nothing is allocated. Threads: thread-safe.

// Narrow to wide. Flags are MB_PRECOMPOSED or 0. Each byte that is not part of a character becomes U+FFFD.
int MultiByteToWideChar(UINT code_page, DWORD flags, const char* source, int length, wchar_t* destination,
                        int capacity);

// Wide to narrow. Flags are 0 and the last two null. A character that the code page lacks becomes '?'.
int WideCharToMultiByte(UINT code_page, DWORD flags, const wchar_t* source, int length, char* destination,
                        int capacity, const char* default_character, BOOL* used_default);

using errno_t = int;

// Writes a number in radix 2 to 36, in lower-case digits, and a terminator into a buffer of `size`
// characters: with a minus sign in radix 10, as its 32-bit pattern in the others. Result: 0; EINVAL for a
// null or empty buffer (nothing is written) and for another radix, ERANGE if text and terminator do not fit
// (the text is then empty). Threads: reentrant.
errno_t _itow_s(int value, wchar_t* text, std::size_t size, int radix);

#endif
