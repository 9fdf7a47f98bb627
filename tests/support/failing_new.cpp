#include "tests/support/failing_new.h"

#include <cstddef>
#include <cstdlib>
#include <new>

namespace {

struct Countdown {
    long remaining = 0;  // calls until the failure; 0 when no guard lives
    bool forever = false;
    bool fired = false;
    long live = 0;
};

thread_local Countdown t_countdown;

bool must_fail() {
    Countdown& c = t_countdown;
    if (c.fired)
        return c.forever;
    if (c.remaining == 0 || --c.remaining > 0)
        return false;
    c.fired = true;
    return true;
}

void* allocate(std::size_t size, std::size_t alignment) {
    if (must_fail())
        return nullptr;
    if (size == 0)
        size = 1;
    void* block;
    if (alignment <= alignof(std::max_align_t))
        block = std::malloc(size);
    else if (size > static_cast<std::size_t>(-1) - alignment)
        block = nullptr;
    else
        block = std::aligned_alloc(alignment, (size + alignment - 1) / alignment * alignment);
    if (block)
        ++t_countdown.live;
    return block;
}

void* allocate_or_throw(std::size_t size, std::size_t alignment) {
    void* block = allocate(size, alignment);
    if (!block)
        throw std::bad_alloc();
    return block;
}

void release(void* block) {
    if (block)
        --t_countdown.live;
    std::free(block);
}

constexpr std::size_t PLAIN = alignof(std::max_align_t);

std::size_t bytes(std::align_val_t alignment) {
    return static_cast<std::size_t>(alignment);
}

}  // namespace

FailAllocation::FailAllocation(long nth, bool forever) {
    t_countdown.fired = false;
    t_countdown.forever = forever;
    t_countdown.remaining = nth;
}

FailAllocation::~FailAllocation() {
    t_countdown.remaining = 0;
    t_countdown.fired = false;
}

bool FailAllocation::fired() const {
    return t_countdown.fired;
}

long live_allocations() {
    return t_countdown.live;
}

void* operator new(std::size_t n) {
    return allocate_or_throw(n, PLAIN);
}
void* operator new[](std::size_t n) {
    return allocate_or_throw(n, PLAIN);
}
void* operator new(std::size_t n, std::align_val_t a) {
    return allocate_or_throw(n, bytes(a));
}
void* operator new[](std::size_t n, std::align_val_t a) {
    return allocate_or_throw(n, bytes(a));
}
void* operator new(std::size_t n, const std::nothrow_t&) noexcept {
    return allocate(n, PLAIN);
}
void* operator new[](std::size_t n, const std::nothrow_t&) noexcept {
    return allocate(n, PLAIN);
}
void* operator new(std::size_t n, std::align_val_t a, const std::nothrow_t&) noexcept {
    return allocate(n, bytes(a));
}
void* operator new[](std::size_t n, std::align_val_t a, const std::nothrow_t&) noexcept {
    return allocate(n, bytes(a));
}

void operator delete(void* p) noexcept {
    release(p);
}
void operator delete[](void* p) noexcept {
    release(p);
}
void operator delete(void* p, std::size_t) noexcept {
    release(p);
}
void operator delete[](void* p, std::size_t) noexcept {
    release(p);
}
void operator delete(void* p, std::align_val_t) noexcept {
    release(p);
}
void operator delete[](void* p, std::align_val_t) noexcept {
    release(p);
}
void operator delete(void* p, std::size_t, std::align_val_t) noexcept {
    release(p);
}
void operator delete[](void* p, std::size_t, std::align_val_t) noexcept {
    release(p);
}
void operator delete(void* p, const std::nothrow_t&) noexcept {
    release(p);
}
void operator delete[](void* p, const std::nothrow_t&) noexcept {
    release(p);
}
void operator delete(void* p, std::align_val_t, const std::nothrow_t&) noexcept {
    release(p);
}
void operator delete[](void* p, std::align_val_t, const std::nothrow_t&) noexcept {
    release(p);
}
