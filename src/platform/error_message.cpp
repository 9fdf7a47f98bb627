#include "src/platform/error_message.h"

#include <cstdlib>
#include <cstring>
#include <cwchar>

#include "basalt/platform/error.h"

DWORD FormatMessageW(DWORD, const void*, DWORD code, DWORD, wchar_t** buffer, DWORD, void*) {
    if (code != ERROR_NOT_ENOUGH_MEMORY && code != ERROR_INVALID_HANDLE && code != ERROR_SUCCESS) {
        *buffer = nullptr;
        return 0;
    }
    const wchar_t* text = code == ERROR_SUCCESS ? L"Success.\r\n" : L"Failure.\r\n";
    *buffer = static_cast<wchar_t*>(std::malloc((std::wcslen(text) + 1) * sizeof(wchar_t)));
    std::wcscpy(*buffer, text);
    return static_cast<DWORD>(std::wcslen(text));
}
void* LocalFree(void* memory) {
    std::free(memory);
    return nullptr;
}
