#include "src/memory/report_last_error.h"

#include "basalt/platform/error.h"
#include "src/platform/error_message.h"

namespace vex_lib {

void ReportLastError() {
    const DWORD code = GetLastError();
    wchar_t* message = nullptr;
    FormatMessageW(
        FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr,
        code, 0, &message, 0, nullptr);
    OutputDebugStringW(L"ERROR:");
    OutputDebugStringW(message != nullptr ? message : L"");
    OutputDebugStringW(L"\n");
    LocalFree(message);
    // Formatting, the host's handler and freeing may each have failed at something of their own.
    SetLastError(code);
}

}  // namespace vex_lib
