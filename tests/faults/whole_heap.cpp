// The program's own malloc in front of the C library's, so that other libraries' use of the heap fails too.
// It replaces tests/support/failing_new.cpp.
#include <cerrno>
#include <cstddef>

#include "tests/support/failing_new.h"

namespace {

constinit thread_local long calls_left = 0;  // until one fails; 0: none will
constinit thread_local bool failure_stays = false, has_fired = false;
constinit thread_local long live_blocks = 0;

template <class Take>
void* taken(const void* before, Take take) {
    if (basalt::test::failures_are_paused ? false
        : has_fired                       ? failure_stays
                                          : calls_left > 0 && --calls_left == 0) {
        has_fired = true;
        errno = ENOMEM;
        return nullptr;
    }
    void* const block = take();
    live_blocks += block != nullptr && before == nullptr ? 1 : 0;
    return block;
}

}  // namespace

extern "C" {

void* __libc_malloc(std::size_t);
void* __libc_calloc(std::size_t, std::size_t);
void* __libc_realloc(void*, std::size_t);
void* __libc_memalign(std::size_t, std::size_t);
void __libc_free(void*);

void* malloc(std::size_t size) {
    return taken(nullptr, [=] { return __libc_malloc(size); });
}
void* calloc(std::size_t count, std::size_t size) {
    return taken(nullptr, [=] { return __libc_calloc(count, size); });
}
void* realloc(void* block, std::size_t size) {
    return taken(block, [=] { return __libc_realloc(block, size); });
}
void* aligned_alloc(std::size_t alignment, std::size_t size) {
    return taken(nullptr, [=] { return __libc_memalign(alignment, size); });
}
int posix_memalign(void** block, std::size_t alignment, std::size_t size) {
    *block = taken(nullptr, [=] { return __libc_memalign(alignment, size); });
    return *block != nullptr ? 0 : ENOMEM;
}
void free(void* block) {
    live_blocks -= block != nullptr ? 1 : 0;
    __libc_free(block);
}
}

FailAllocation::FailAllocation(long nth, bool forever) {
    calls_left = nth;
    failure_stays = forever;
    has_fired = false;
}

FailAllocation::~FailAllocation() {
    calls_left = 0;
    has_fired = false;
}

bool FailAllocation::fired() const {
    return has_fired;
}

long live_allocations() {
    return live_blocks;
}
