// Every process-wide object with a constructor or destructor, in the order of their construction at load.
// They are destroyed in reverse order at unload, after the objects created at first use.
//
// All other process-wide state is constant-initialised in its own file.

#include "basalt/memory.h"
#include "src/frame/codec_guard.h"

namespace {

// Before all objects without a priority: in a static link the host's own static objects may use the shared
// heap in their constructors and destructors.
constexpr int MODULE_PRIORITY = 101;

}  // namespace

// 1. Module state of the application framework: none here.

// 2. The image codec's start-up guard.
[[gnu::init_priority(MODULE_PRIORITY)]] basalt::frame::CodecGuard basalt::frame::codec_guard;

// 3. The standard library's error categories: constructed with that library.

// 4. The shared heap, growable. Its destruction releases every block.
[[gnu::init_priority(MODULE_PRIORITY)]] vex_lib::vlWinHeapAllocator vex_lib::vlSharedMemoryHeap::m_heap(0);

// 5. Registration with the framework: none here.
