#include "tests/support/system_failures.h"

#include <sys/mman.h>

#include <atomic>
#include <cerrno>

namespace {

thread_local int calls_left = -1;  // until one fails; negative: none will
thread_local bool failure_stays = false;
thread_local bool has_struck = false;
std::atomic<long> balance{0};

bool fails_now() {
    if (calls_left < 0 || (calls_left > 1 && calls_left-- > 1)) {
        return false;
    }
    calls_left = failure_stays ? 1 : -1;
    has_struck = true;
    errno = ENOMEM;
    return true;
}

}  // namespace

extern "C" {

void* __real_mmap(void*, size_t, int, int, int, off_t);
void* __real_mremap(void*, size_t, size_t, int);
int __real_munmap(void*, size_t);
int __real_madvise(void*, size_t, int);

void* __wrap_mmap(void* address, size_t size, int protection, int flags, int file, off_t offset) {
    void* pages = fails_now() ? MAP_FAILED : __real_mmap(address, size, protection, flags, file, offset);
    balance += pages == MAP_FAILED ? 0 : static_cast<long>(size);
    return pages;
}

void* __wrap_mremap(void* pages, size_t old_size, size_t new_size, int flags) {
    void* moved = fails_now() ? MAP_FAILED : __real_mremap(pages, old_size, new_size, flags);
    balance += moved == MAP_FAILED ? 0 : static_cast<long>(new_size) - static_cast<long>(old_size);
    return moved;
}

int __wrap_munmap(void* pages, size_t size) {
    const int result = fails_now() ? -1 : __real_munmap(pages, size);
    balance -= result == 0 ? static_cast<long>(size) : 0;
    return result;
}

int __wrap_madvise(void* pages, size_t size, int advice) {
    return fails_now() ? -1 : __real_madvise(pages, size, advice);
}
}

namespace basalt::test {

SystemFailure::SystemFailure(int nth, Then then) {
    calls_left = nth;
    failure_stays = then == Then::STAYS;
    has_struck = false;
}

SystemFailure::~SystemFailure() {
    calls_left = -1;
}

bool SystemFailure::struck() {
    return has_struck;
}

long mapped_balance() {
    return balance;
}

}  // namespace basalt::test
