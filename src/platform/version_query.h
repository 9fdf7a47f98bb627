// Version query of the operating system.
#ifndef BASALT_SRC_PLATFORM_VERSION_QUERY_H
#define BASALT_SRC_PLATFORM_VERSION_QUERY_H

#include "basalt/platform/types.h"

// The published record: its text has 16-bit characters on every system.
struct OSVERSIONINFOW {
    DWORD dwOSVersionInfoSize;
    DWORD dwMajorVersion;
    DWORD dwMinorVersion;
    DWORD dwBuildNumber;
    DWORD dwPlatformId;
    char16_t szCSDVersion[128];
};
static_assert(sizeof(OSVERSIONINFOW) == 276);

inline constexpr DWORD VER_PLATFORM_WIN32s = 0;
inline constexpr DWORD VER_PLATFORM_WIN32_WINDOWS = 1;
inline constexpr DWORD VER_PLATFORM_WIN32_NT = 2;

// Fills the version record, whose size field the caller has set to 276. This system presents itself as
// release 6.2 of the NT family, the highest that the library tells apart.
// Failure: 0 with ERROR_INVALID_PARAMETER for a null record or another size; the record is left alone.
// Threads: reentrant.
BOOL GetVersionExW(OSVERSIONINFOW* information);

#endif
