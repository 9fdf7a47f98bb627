#include "basalt/platform/error.h"

#include <array>
#include <atomic>
#include <cerrno>
#include <cstddef>

#include "src/platform/system/output.h"
#include "src/platform/text/utf8.h"

using basalt::platform::DebugOutputHandler;

namespace {

// No destructor, which would prevent unloading, and the initial-exec model: otherwise a thread's first use
// allocates, and being out of memory then ends the process.
[[gnu::tls_model("initial-exec")]] constinit thread_local DWORD last_error = ERROR_SUCCESS;

constinit std::atomic<DebugOutputHandler> debug_output_handler = nullptr;

// Uses no heap, since the report may be that memory ran out, and not the host's stdio streams.
void write_as_utf8(const wchar_t* text) {
    std::array<char, 1024> buffer;
    std::size_t used = 0;
    for (; *text != L'\0'; ++text) {
        if (buffer.size() - used < basalt::platform::MAX_UTF8_BYTES) {
            basalt::platform::write_report(buffer.data(), used);
            used = 0;
        }
        used += basalt::platform::encode_utf8(*text, buffer.data() + used);
    }
    basalt::platform::write_report(buffer.data(), used);
}

}  // namespace

DWORD GetLastError() {
    return last_error;
}

void SetLastError(DWORD code) {
    last_error = code;
}

void OutputDebugStringW(const wchar_t* text) {
    if (text == nullptr) {
        return;
    }
    const int errno_before = errno;
    const DWORD error_before = last_error;
    if (const DebugOutputHandler handler = debug_output_handler.load(std::memory_order_acquire)) {
        handler(text);
    } else {
        write_as_utf8(text);
    }
    last_error = error_before;
    errno = errno_before;
}

namespace basalt::platform {

DebugOutputHandler SetDebugOutputHandler(DebugOutputHandler handler) {
    return debug_output_handler.exchange(handler, std::memory_order_acq_rel);
}

}  // namespace basalt::platform
