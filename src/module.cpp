// The roof over the families: every process-wide object with a constructor or destructor, in the one order
// in which they come up when the library is loaded. At unload they go in the reverse order, after whatever
// was created on first use.
//
// All other process-wide state is constant-initialised where it belongs.

#include "basalt/memory.h"
#include "src/frame/codec_guard.h"
#include "src/platform/codec.h"

namespace {

// Ahead of everything without a priority: in a static link the host's own statics may use the shared heap
// from their constructors, and until their destructors have run.
constexpr int MODULE_PRIORITY = 101;

constexpr basalt::frame::CodecCalls CODEC = {
    .start = []() -> std::uintptr_t {
        const GdiplusStartupInput input = {1, nullptr, 0, 0};
        std::uintptr_t token = 0;
        return GdiplusStartup(&token, &input, nullptr) == Gdiplus::Ok ? token : 0;
    },
    .shut_down = GdiplusShutdown,
};

}  // namespace

// 1. Module state of the host's application framework: there is no framework here, so nothing is kept.

// 2. The image codec's start-up guard.
[[gnu::init_priority(MODULE_PRIORITY)]] basalt::frame::CodecGuard basalt::frame::codec_guard(CODEC);

// 3. The standard library's error categories: they come up with that library.

// 4. The shared heap, growable. Its end releases every block still taken from it.
[[gnu::init_priority(MODULE_PRIORITY)]] vex_lib::vlWinHeapAllocator vex_lib::vlSharedMemoryHeap::m_heap(0);

// 5. Attaching to the framework: nothing to do.
