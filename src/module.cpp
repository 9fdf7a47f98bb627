#include "basalt/memory.h"
namespace vex_lib { vlWinHeapAllocator vlSharedMemoryHeap::m_heap(0); }
