#include "tests/support/system_failures.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>

#include <atomic>
#include <cerrno>
#include <cstdarg>

namespace {

thread_local int calls_left = -1;  // until one fails; negative: none will
thread_local bool failure_stays = false;
thread_local bool has_struck = false;
thread_local int chosen_number = 0;
std::atomic<long> balance{0};
std::atomic<long> refused{0};

// Whether a call has to fail; errno is set then.
bool fails_now(int number) {
    if (calls_left < 0 || (calls_left > 1 && calls_left-- > 1)) {
        return false;
    }
    calls_left = failure_stays ? 1 : -1;
    has_struck = true;
    errno = chosen_number != 0 ? chosen_number : number;
    return true;
}

}  // namespace

extern "C" {

void* __real_mmap(void*, size_t, int, int, int, off_t);
void* __real_mremap(void*, size_t, size_t, int);
int __real_munmap(void*, size_t);
int __real_madvise(void*, size_t, int);
int __real_mprotect(void*, size_t, int);
int __real_open(const char*, int, ...);
int __real_fcntl(int, int, ...);
int __real_fstat(int, struct stat*);
int __real_posix_fallocate(int, off_t, off_t);
int __real_statx(int, const char*, int, unsigned, struct statx*);
DIR* __real_opendir(const char*);
struct dirent* __real_readdir(DIR*);

void* __wrap_mmap(void* address, size_t size, int protection, int flags, int file, off_t offset) {
    void* pages =
        fails_now(ENOMEM) ? MAP_FAILED : __real_mmap(address, size, protection, flags, file, offset);
    const bool is_new = pages != MAP_FAILED && (flags & MAP_FIXED) == 0;  // not in another's place
    balance += is_new ? static_cast<long>(size) : 0;
    return pages;
}

void* __wrap_mremap(void* pages, size_t old_size, size_t new_size, int flags) {
    void* moved = fails_now(ENOMEM) ? MAP_FAILED : __real_mremap(pages, old_size, new_size, flags);
    balance += moved == MAP_FAILED ? 0 : static_cast<long>(new_size) - static_cast<long>(old_size);
    return moved;
}

int __wrap_munmap(void* pages, size_t size) {
    if (fails_now(ENOMEM)) {
        refused += static_cast<long>(size);
        return -1;
    }
    const int result = __real_munmap(pages, size);
    balance -= result == 0 ? static_cast<long>(size) : 0;
    return result;
}

int __wrap_madvise(void* pages, size_t size, int advice) {
    return fails_now(ENOMEM) ? -1 : __real_madvise(pages, size, advice);
}

int __wrap_mprotect(void* pages, size_t size, int protection) {
    return fails_now(ENOMEM) ? -1 : __real_mprotect(pages, size, protection);
}

int __wrap_open(const char* path, int flags, ...) {
    va_list rest;
    va_start(rest, flags);
    const mode_t mode = (flags & O_CREAT) != 0 ? va_arg(rest, mode_t) : 0;
    va_end(rest);
    return fails_now(EMFILE) ? -1 : __real_open(path, flags, mode);
}

int __wrap_fcntl(int file, int command, ...) {
    va_list rest;
    va_start(rest, command);
    void* const argument = va_arg(rest, void*);
    va_end(rest);
    return fails_now(ENOLCK) ? -1 : __real_fcntl(file, command, argument);
}

int __wrap_fstat(int file, struct stat* status) {
    return fails_now(EIO) ? -1 : __real_fstat(file, status);
}

int __wrap_posix_fallocate(int file, off_t offset, off_t size) {
    return fails_now(ENOSPC) ? errno : __real_posix_fallocate(file, offset, size);
}

int __wrap_statx(int folder, const char* path, int flags, unsigned mask, struct statx* status) {
    return fails_now(EIO) ? -1 : __real_statx(folder, path, flags, mask, status);
}

DIR* __wrap_opendir(const char* path) {
    return fails_now(EMFILE) ? nullptr : __real_opendir(path);
}

struct dirent* __wrap_readdir(DIR* folder) {
    return fails_now(EIO) ? nullptr : __real_readdir(folder);
}
}

namespace basalt::test {

SystemFailure::SystemFailure(int nth, Then then, int number) {
    calls_left = nth;
    failure_stays = then == Then::STAYS;
    has_struck = false;
    chosen_number = number;
}

SystemFailure::~SystemFailure() {
    calls_left = -1;
}

bool SystemFailure::struck() {
    return has_struck;
}

bool system_call_fails(int number) {
    return fails_now(number);
}

long refused_to_unmap() {
    return refused;
}

long mapped_balance() {
    return balance;
}

}  // namespace basalt::test
