// Collects debugger output; the report of an error.
#ifndef BASALT_TESTS_SUPPORT_DEBUG_OUTPUT_H
#define BASALT_TESTS_SUPPORT_DEBUG_OUTPUT_H

#include <string>
#include <utility>
#include <vector>

#include "basalt/platform/error.h"
#include "src/platform/error_message.h"

namespace basalt::test {

using Pieces = std::vector<std::wstring>;

// Collects the pieces of debugger output while alive.
class DebugOutput {
public:
    DebugOutput() {
        s_pieces.clear();
        basalt::platform::SetDebugOutputHandler([](const wchar_t* text) {
            s_pieces.emplace_back(text);
            SetLastError(4711);  // a host's handler may call anything
        });
    }
    ~DebugOutput() { basalt::platform::SetDebugOutputHandler(nullptr); }
    DebugOutput(const DebugOutput&) = delete;
    DebugOutput& operator=(const DebugOutput&) = delete;

    // The pieces since the last call.
    static Pieces take() { return std::exchange(s_pieces, {}); }

private:
    static inline Pieces s_pieces;
};

inline Pieces report_of(DWORD code) {
    wchar_t* message = nullptr;
    FormatMessageW(0x1300, nullptr, code, 0, &message, 0, nullptr);
    Pieces pieces{L"ERROR:", message != nullptr ? message : L"", L"\n"};
    LocalFree(message);
    return pieces;
}

}  // namespace basalt::test

#endif
