#include "src/platform/temporary_folder.h"

#include <cstdlib>
#include <cwchar>
#include <exception>
#include <string>

#include "basalt/platform/error.h"
#include "src/platform/text/file_name.h"

DWORD GetTempPathW(DWORD length, wchar_t* buffer) {
    try {
        const char* const configured = std::getenv("TMPDIR");
        const bool is_set = configured != nullptr && *configured != '\0';
        std::wstring folder = basalt::platform::wide_from_file_name(is_set ? configured : "/tmp");
        if (folder.back() != L'/' && folder.back() != L'\\') {
            folder += L'/';
        }
        const auto needed = static_cast<DWORD>(folder.size());
        if (needed >= length) {
            return needed + 1;
        }
        std::wmemcpy(buffer, folder.c_str(), folder.size() + 1);
        return needed;
    } catch (const std::exception&) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return 0;
    }
}
