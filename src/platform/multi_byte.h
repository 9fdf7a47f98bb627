// Text from and to the active code page, in buffers of the caller's.
#ifndef BASALT_SRC_PLATFORM_MULTI_BYTE_H
#define BASALT_SRC_PLATFORM_MULTI_BYTE_H

#include "basalt/platform/types.h"

inline constexpr UINT CP_ACP = 0;
inline constexpr DWORD MB_PRECOMPOSED = 1;

// What both share: the source has so many characters, or ends with and includes its terminator where that is
// -1; the result has none of its own. `room` counts the destination's characters; 0 asks for the room needed.
// The result is the number of characters written, or 0: ERROR_INSUFFICIENT_BUFFER when they do not all fit
// (what the destination then holds is open), ERROR_INVALID_PARAMETER for an empty source, a null pointer, a
// negative count and everything but the code page CP_ACP. Nothing is allocated.
// Threads: thread-safe.

// Narrow to wide. Flags are MB_PRECOMPOSED or 0. Each byte that belongs to no character becomes U+FFFD.
int MultiByteToWideChar(UINT code_page, DWORD flags, const char* source, int length, wchar_t* destination,
                        int room);

// Wide to narrow. Flags are 0 and the last two null. What the code page lacks becomes its default, `?`.
int WideCharToMultiByte(UINT code_page, DWORD flags, const wchar_t* source, int length, char* destination,
                        int room, const char* default_character, BOOL* used_default);

#endif
