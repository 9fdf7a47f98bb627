// Calls that fail as those of tests/support/system_failures.h do (linked with --wrap).
#include <fcntl.h>
#include <ifaddrs.h>
#include <locale.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "tests/faults/more_system_calls.h"
#include "tests/support/system_failures.h"

namespace {

using basalt::test::system_call_fails;

long files_kept = 0;

}  // namespace

extern "C" {

int __real_access(const char*, int);
int __real_close(int);
int __real_fstatat(int, const char*, struct stat*, int);
int __real_ftruncate(int, off_t);
int __real_getifaddrs(struct ifaddrs**);
int __real_lstat(const char*, struct stat*);
locale_t __real_newlocale(int, const char*, locale_t);
ssize_t __real_pread(int, void*, size_t, off_t);
ssize_t __real_readlink(const char*, char*, size_t);
char* __real_realpath(const char*, char*);
int __real_stat(const char*, struct stat*);
int __real_unlink(const char*);
ssize_t __real_write(int, const void*, size_t);

int __wrap_access(const char* path, int mode) {
    return system_call_fails(EACCES) ? -1 : __real_access(path, mode);
}
// The file is closed all the same, as the system does it.
int __wrap_close(int file) {
    const int result = __real_close(file);
    return system_call_fails(EIO) ? -1 : result;
}
int __wrap_fstatat(int folder, const char* path, struct stat* status, int flags) {
    return system_call_fails(EIO) ? -1 : __real_fstatat(folder, path, status, flags);
}
int __wrap_ftruncate(int file, off_t size) {
    return system_call_fails(EIO) ? -1 : __real_ftruncate(file, size);
}
int __wrap_getifaddrs(struct ifaddrs** list) {
    return system_call_fails(ENOMEM) ? -1 : __real_getifaddrs(list);
}
int __wrap_lstat(const char* path, struct stat* status) {
    return system_call_fails(EIO) ? -1 : __real_lstat(path, status);
}
char* __wrap_realpath(const char* path, char* resolved) {
    return system_call_fails(EIO) ? nullptr : __real_realpath(path, resolved);
}
locale_t __wrap_newlocale(int mask, const char* name, locale_t base) {
    return system_call_fails(ENOMEM) ? nullptr : __real_newlocale(mask, name, base);
}
ssize_t __wrap_pread(int file, void* bytes, size_t size, off_t offset) {
    return system_call_fails(EIO) ? -1 : __real_pread(file, bytes, size, offset);
}
ssize_t __wrap_readlink(const char* path, char* target, size_t size) {
    return system_call_fails(EACCES) ? -1 : __real_readlink(path, target, size);
}
// Asked before a file is deleted, which might be somebody else's by now.
int __wrap_stat(const char* path, struct stat* status) {
    const bool fails = system_call_fails(EIO);
    files_kept += fails ? 1 : 0;
    return fails ? -1 : __real_stat(path, status);
}
int __wrap_unlink(const char* path) {
    const bool fails = system_call_fails(EROFS);
    files_kept += fails ? 1 : 0;
    return fails ? -1 : __real_unlink(path);
}
ssize_t __wrap_write(int file, const void* bytes, size_t size) {
    return system_call_fails(ENOSPC) ? -1 : __real_write(file, bytes, size);
}
}

long basalt::faults::files_made_to_stay() {
    return files_kept;
}
