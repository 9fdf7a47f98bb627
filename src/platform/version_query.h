// Version query of the operating system.
#ifndef BASALT_SRC_PLATFORM_VERSION_QUERY_H
#define BASALT_SRC_PLATFORM_VERSION_QUERY_H

#include "basalt/platform/types.h"

struct OSVERSIONINFOW {
    DWORD dwOSVersionInfoSize;
    DWORD dwMajorVersion;
    DWORD dwMinorVersion;
    DWORD dwBuildNumber;
    DWORD dwPlatformId;
    char16_t szCSDVersion[128];
};
static_assert(sizeof(OSVERSIONINFOW) == 276);

BOOL GetVersionExW(OSVERSIONINFOW* information);

#endif
