#include "src/frame/os_detection.h"

#include "src/frame/environment_state.h"

namespace basalt::frame {

namespace {

constexpr DWORD ANY = 0xFFFFFFFF;

struct Release {
    DWORD platform;
    DWORD major;
    DWORD lowest_minor;
    DWORD highest_minor;
    basalt_os code;
};

constexpr Release RELEASES[] = {
    {VER_PLATFORM_WIN32s, ANY, 0, ANY, 1},         // Win32s
    {VER_PLATFORM_WIN32_WINDOWS, ANY, 0, 0, 2},    // Windows 95
    {VER_PLATFORM_WIN32_WINDOWS, ANY, 10, 10, 3},  // Windows 98
    {VER_PLATFORM_WIN32_WINDOWS, ANY, 90, 90, 4},  // Windows Me
    {VER_PLATFORM_WIN32_NT, 4, 0, ANY, 5},         // Windows NT 4.0
    {VER_PLATFORM_WIN32_NT, 5, 0, 0, 6},           // Windows 2000
    {VER_PLATFORM_WIN32_NT, 5, 1, 2, 7},           // Windows XP, Server 2003
    {VER_PLATFORM_WIN32_NT, 6, 0, 0, 9},           // Windows Vista, Server 2008
    {VER_PLATFORM_WIN32_NT, 6, 1, 1, 10},          // Windows 7
    {VER_PLATFORM_WIN32_NT, 6, 2, 2, 11},          // Windows 8
};

bool is_release(const OSVERSIONINFOW& version, const Release& release) {
    return version.dwPlatformId == release.platform &&
           (release.major == ANY || version.dwMajorVersion == release.major) &&
           version.dwMinorVersion >= release.lowest_minor && version.dwMinorVersion <= release.highest_minor;
}

}  // namespace

basalt_os release_code(const OSVERSIONINFOW& version) {
    for (const Release& release : RELEASES) {
        if (is_release(version, release)) {
            return release.code;
        }
    }
    return 0;
}

void detect_operating_system() {
    environment.os_version_number.store(0);
    OSVERSIONINFOW version{};
    version.dwOSVersionInfoSize = sizeof version;
    if (GetVersionExW(&version) == 0) {
        return;
    }
    if (const basalt_os code = release_code(version); code != 0) {
        environment.os_code.store(code);
    }
}

}  // namespace basalt::frame
