#include "src/platform/system_info.h"

#include <limits.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <string>

#include "basalt/platform/error.h"
#include "src/platform/errors/error_from_errno.h"
#include "src/platform/system/failure.h"
#include "src/platform/text/file_name.h"

using namespace basalt::platform;

BOOL GetVersionExW(OSVERSIONINFOW* information) {
    *information = {.dwOSVersionInfoSize = sizeof(OSVERSIONINFOW),
                    .dwMajorVersion = 6,
                    .dwMinorVersion = 2,
                    .dwBuildNumber = 9200,
                    .dwPlatformId = VER_PLATFORM_WIN32_NT,
                    .szCSDVersion = {}};
    return 1;
}

DWORD GetModuleFileNameW(HINSTANCE /*module*/, wchar_t* name, DWORD size) {
    char link[PATH_MAX];
    const ssize_t length = ::readlink("/proc/self/exe", link, sizeof link);
    if (length < 0) {
        return fail_with(error_from_errno(errno), DWORD{0});
    }
    return or_out_of_memory(DWORD{0}, [&] {
        std::wstring wide;
        wide_from_system_name({link, static_cast<std::size_t>(length)}, wide);
        const std::size_t copied = std::min<std::size_t>(wide.size(), size - 1);
        std::copy_n(wide.data(), copied, name);
        name[copied] = L'\0';
        return copied < wide.size() ? fail_with(ERROR_INSUFFICIENT_BUFFER, size) : static_cast<DWORD>(copied);
    });
}
