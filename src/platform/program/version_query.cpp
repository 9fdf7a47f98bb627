#include "src/platform/version_query.h"

#include "basalt/platform/error.h"

BOOL GetVersionExW(OSVERSIONINFOW* information) {
    if (information == nullptr || information->dwOSVersionInfoSize != sizeof(OSVERSIONINFOW)) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return 0;
    }
    *information = {.dwOSVersionInfoSize = sizeof(OSVERSIONINFOW),
                    .dwMajorVersion = 6,
                    .dwMinorVersion = 2,
                    .dwBuildNumber = 9200,
                    .dwPlatformId = VER_PLATFORM_WIN32_NT,
                    .szCSDVersion = {}};
    return 1;
}
