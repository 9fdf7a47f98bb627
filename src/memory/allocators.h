// The allocator over malloc and the report of failed system calls.
#ifndef BASALT_SRC_MEMORY_ALLOCATORS_H
#define BASALT_SRC_MEMORY_ALLOCATORS_H

#include <cstdint>

#include "basalt/memory/allocators.h"

namespace vex_lib {

// malloc and free behind the allocator interface; failures are null and not reported.
// Threads: thread-safe.
class vlHeapAllocator : public vlAllocator {
public:
    ~vlHeapAllocator() override;
    void* Alloc(std::uint64_t size) override;
    void Free(void* block) override;
};

// Writes "ERROR:", the system's message text for the calling thread's last error and "\n" to the debugger
// output, in three pieces; the text is empty when the system has none. Keeps the last error. Called directly
// after the failing call.
void ReportLastError();

}  // namespace vex_lib

#endif
