#include "basalt/platform/error.h"

#include <cstdio>
namespace { thread_local DWORD last_error = 0; basalt::platform::DebugOutputHandler handler = nullptr; }
DWORD GetLastError() { return last_error; }
void SetLastError(DWORD code) { last_error = code; }
void OutputDebugStringW(const wchar_t* text) { if (handler) handler(text); else std::fprintf(stderr, "%ls", text); }
namespace basalt::platform { DebugOutputHandler SetDebugOutputHandler(DebugOutputHandler h) { auto o = handler; handler = h; return o; } }
