// The program's own malloc in front of the C library's, so that other libraries' use of the heap fails too.
// It replaces tests/support/failing_new.cpp.
#include <cerrno>
#include <cstddef>

#include "tests/support/failing_new.h"

namespace {

template <class Take>
void* taken(const void* before, Take take) {
    if (basalt::test::allocations.fails()) {
        errno = ENOMEM;
        return nullptr;
    }
    void* const block = take();
    basalt::test::live_blocks += block != nullptr && before == nullptr ? 1 : 0;
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
    basalt::test::live_blocks -= block != nullptr ? 1 : 0;
    __libc_free(block);
}
}
