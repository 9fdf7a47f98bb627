#include "tests/support/failing_new.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <new>

namespace {

using std::align_val_t;
using std::nothrow_t;
using std::size_t;
constexpr align_val_t PLAIN{alignof(std::max_align_t)};

void* take(size_t size, align_val_t alignment = PLAIN) noexcept {
    if (basalt::test::allocations.fails()) {
        return nullptr;
    }
    void* block = nullptr;
    const auto bytes = std::max(static_cast<size_t>(alignment), sizeof(void*));
    const bool taken = posix_memalign(&block, bytes, std::max(size, size_t{1})) == 0;
    basalt::test::live_blocks += taken ? 1 : 0;
    return taken ? block : nullptr;
}

void* take_or_throw(size_t size, align_val_t alignment = PLAIN) {
    void* const block = take(size, alignment);
    return block != nullptr ? block : throw std::bad_alloc();
}

void give(void* block) noexcept {
    basalt::test::live_blocks -= block != nullptr ? 1 : 0;
    std::free(block);
}

}  // namespace

// Every form in use: the standard library's own would call a sanitizer's.
// clang-format off
void* operator new(size_t n) { return take_or_throw(n); }
void* operator new[](size_t n) { return take_or_throw(n); }
void* operator new(size_t n, align_val_t a) { return take_or_throw(n, a); }
void* operator new[](size_t n, align_val_t a) { return take_or_throw(n, a); }
void* operator new(size_t n, const nothrow_t&) noexcept { return take(n); }
void* operator new[](size_t n, const nothrow_t&) noexcept { return take(n); }
void operator delete(void* p) noexcept { give(p); }
void operator delete[](void* p) noexcept { give(p); }
void operator delete(void* p, size_t) noexcept { give(p); }
void operator delete[](void* p, size_t) noexcept { give(p); }
void operator delete(void* p, align_val_t) noexcept { give(p); }
void operator delete[](void* p, align_val_t) noexcept { give(p); }
void operator delete(void* p, size_t, align_val_t) noexcept { give(p); }
void operator delete[](void* p, size_t, align_val_t) noexcept { give(p); }
void operator delete(void* p, const nothrow_t&) noexcept { give(p); }
void operator delete[](void* p, const nothrow_t&) noexcept { give(p); }
// clang-format on
