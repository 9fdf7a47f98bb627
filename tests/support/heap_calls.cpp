#include "tests/support/heap_calls.h"

#include <algorithm>
#include <cstring>

namespace {

thread_local int calls_left = 0;  // until one fails; 0: none will
thread_local bool has_struck = false;
thread_local std::size_t last_request = 0;
thread_local long live_blocks = 0;

bool fails_now(std::size_t size) {
    last_request = size;
    const bool fails = calls_left > 0 && --calls_left == 0;
    has_struck = has_struck || fails;
    return fails;
}

}  // namespace

extern "C" {

void* __real_malloc(std::size_t);
void* __real_realloc(void*, std::size_t);
void __real_free(void*);

void* __wrap_malloc(std::size_t size) {
    void* const block = fails_now(size) ? nullptr : __real_malloc(size);
    if (block != nullptr) {
        ++live_blocks;
        std::memset(block, basalt::test::FRESH_BYTE, std::min(size, std::size_t{4096}));
    }
    return block;
}

void* __wrap_realloc(void* block, std::size_t size) {
    void* const moved = fails_now(size) ? nullptr : __real_realloc(block, size);
    live_blocks += moved != nullptr && block == nullptr ? 1 : 0;
    return moved;
}

void __wrap_free(void* block) {
    live_blocks -= block != nullptr ? 1 : 0;
    __real_free(block);
}
}

namespace basalt::test {

HeapFailure::HeapFailure(int nth) {
    calls_left = nth;
    has_struck = false;
}

HeapFailure::~HeapFailure() {
    calls_left = 0;
}

bool HeapFailure::struck() {
    return has_struck;
}

std::size_t last_heap_request() {
    return last_request;
}

long live_heap_blocks() {
    return live_blocks;
}

}  // namespace basalt::test
