#include "tests/support/system_failures.h"

#include <dirent.h>
#include <ifaddrs.h>
#include <locale.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

using namespace basalt::test;

namespace {

// Whether a call has to fail; errno is set then.
bool fails(int number) {
    const bool fails = system_calls.fails();
    errno = !fails ? errno : system_error != 0 ? system_error : number;
    return fails;
}

}  // namespace

// A call that fails with an errno value and a result.
#define FAILING(type, name, parameters, arguments, number, result) \
    type __real_##name parameters;                                 \
    type __wrap_##name parameters {                                \
        return fails(number) ? (result) : __real_##name arguments; \
    }

extern "C" {

FAILING(int, fstat, (int file, struct stat* status), (file, status), EIO, -1)
FAILING(int, madvise, (void* pages, size_t size, int advice), (pages, size, advice), ENOMEM, -1)
FAILING(int, mprotect, (void* pages, size_t size, int access), (pages, size, access), ENOMEM, -1)
FAILING(int, posix_fallocate, (int file, off_t offset, off_t size), (file, offset, size), ENOSPC, errno)
FAILING(dirent*, readdir, (DIR * folder), (folder), EIO, nullptr)
FAILING(int, statx, (int at, const char* path, int flags, unsigned mask, struct statx* to),
        (at, path, flags, mask, to), ENOMEM, -1)

FAILING(int, access, (const char* path, int mode), (path, mode), EACCES, -1)
FAILING(int, close, (int file), (file), EIO,
        (__real_close(file), -1))  // closes all the same, as the system does
FAILING(int, fstatat, (int at, const char* path, struct stat* to, int flags), (at, path, to, flags), ENOMEM,
        -1)
FAILING(int, ftruncate, (int file, off_t size), (file, size), EIO, -1)
FAILING(int, getifaddrs, (ifaddrs * *list), (list), ENOMEM, -1)
FAILING(int, lstat, (const char* path, struct stat* status), (path, status), EIO, -1)
FAILING(locale_t, newlocale, (int mask, const char* name, locale_t base), (mask, name, base), ENOMEM, nullptr)
FAILING(ssize_t, pread, (int file, void* to, size_t size, off_t at), (file, to, size, at), EIO, -1)
FAILING(ssize_t, readlink, (const char* path, char* to, size_t size), (path, to, size), EACCES, -1)
FAILING(int, stat, (const char* path, struct stat* status), (path, status), EIO, (++files_kept, -1))
FAILING(int, unlink, (const char* path), (path), EROFS, (++files_kept, -1))
FAILING(ssize_t, write, (int file, const void* from, size_t size), (file, from, size), ENOSPC, -1)
// The optional last argument is passed on, given or not.
FAILING(int, open, (const char* path, int flags, mode_t mode), (path, flags, mode), EMFILE, -1)
FAILING(int, fcntl, (int file, int command, void* argument), (file, command, argument), ENOLCK, -1)

void* __real_mmap(void*, size_t, int, int, int, off_t);
void* __wrap_mmap(void* address, size_t size, int access, int flags, int file, off_t offset) {
    void* const pages = fails(ENOMEM) ? MAP_FAILED : __real_mmap(address, size, access, flags, file, offset);
    const bool is_new = pages != MAP_FAILED && (flags & MAP_FIXED) == 0;  // not in another's place
    bytes_mapped += is_new ? static_cast<long>(size) : 0;
    return pages;
}

void* __real_mremap(void*, size_t, size_t, int);
void* __wrap_mremap(void* pages, size_t old_size, size_t new_size, int flags) {
    void* const moved = fails(ENOMEM) ? MAP_FAILED : __real_mremap(pages, old_size, new_size, flags);
    bytes_mapped += moved == MAP_FAILED ? 0 : static_cast<long>(new_size) - static_cast<long>(old_size);
    return moved;
}

int __real_munmap(void*, size_t);
int __wrap_munmap(void* pages, size_t size) {
    if (fails(ENOMEM)) {
        return bytes_kept += static_cast<long>(size), -1;
    }
    const int result = __real_munmap(pages, size);
    bytes_mapped -= result == 0 ? static_cast<long>(size) : 0;
    return result;
}
}
