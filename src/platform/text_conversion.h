// Text from and to the active code page, and integers as text, in the caller's buffers.
#ifndef BASALT_SRC_PLATFORM_TEXT_CONVERSION_H
#define BASALT_SRC_PLATFORM_TEXT_CONVERSION_H

#include <cstddef>

#include "basalt/platform/types.h"

inline constexpr UINT CP_ACP = 0;
inline constexpr DWORD MB_PRECOMPOSED = 1;

// Both conversions: the code page is CP_ACP, `length` the source's number of characters and `capacity` the
// destination's. Result: the number of characters written (no terminator is added), or 0 with
// ERROR_INVALID_PARAMETER for a length that is not positive. Nothing is allocated. Threads: thread-safe.

// Narrow to wide. Flags are MB_PRECOMPOSED; the capacity is at least the length. Each byte that is not part
// of a character becomes U+FFFD.
int MultiByteToWideChar(UINT code_page, DWORD flags, const char* source, int length, wchar_t* destination,
                        int capacity);

// Wide to narrow. Flags are 0 and the last two null; the capacity is positive. A character that the code page
// lacks becomes '?'. 0 with ERROR_INSUFFICIENT_BUFFER if they do not all fit; the destination's contents are
// then unspecified.
int WideCharToMultiByte(UINT code_page, DWORD flags, const wchar_t* source, int length, char* destination,
                        int capacity, const char* default_character, BOOL* used_default);

using errno_t = int;

// Writes a number in radix 2 to 36, in lower-case digits, and a terminator into a buffer of `size`
// characters: with a minus sign in radix 10, as its 32-bit pattern in the others. Result: 0; EINVAL for an
// empty buffer (nothing is written) and for another radix, ERANGE if text and terminator do not fit (the text
// is then empty). Threads: reentrant.
errno_t _itow_s(int value, wchar_t* text, std::size_t size, int radix);

#endif
