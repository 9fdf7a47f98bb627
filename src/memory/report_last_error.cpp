#include "src/memory/report_last_error.h"

#include "basalt/platform/error.h"
#include "src/platform/error_message.h"

namespace vex_lib {
namespace {

constexpr DWORD ALLOCATE_BUFFER = 0x0100;
constexpr DWORD IGNORE_INSERTS = 0x0200;
constexpr DWORD FROM_SYSTEM = 0x1000;

}  // namespace

void ReportLastError() {
    const DWORD code = GetLastError();
    wchar_t* message = nullptr;
    FormatMessageW(ALLOCATE_BUFFER | FROM_SYSTEM | IGNORE_INSERTS, nullptr, code, 0, &message, 0, nullptr);
    OutputDebugStringW(L"ERROR:");
    OutputDebugStringW(message != nullptr ? message : L"");
    OutputDebugStringW(L"\n");
    LocalFree(message);
    // Formatting, the host's handler and freeing may each have failed at something of their own.
    SetLastError(code);
}

}  // namespace vex_lib
