#include "src/platform/errors/error_from_errno.h"

#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <iterator>
#include <string>

#include "basalt/platform/error.h"

namespace basalt::platform {

namespace {

struct Row {
    int number;
    DWORD code;
};

constexpr Row ROWS[] = {
    {0, ERROR_SUCCESS},
    {ENOENT, ERROR_FILE_NOT_FOUND},
    {ENOTDIR, ERROR_PATH_NOT_FOUND},
    {EMFILE, ERROR_TOO_MANY_OPEN_FILES},
    {ENFILE, ERROR_TOO_MANY_OPEN_FILES},
    {EACCES, ERROR_ACCESS_DENIED},
    {EPERM, ERROR_ACCESS_DENIED},
    {EISDIR, ERROR_ACCESS_DENIED},
    {EBADF, ERROR_INVALID_HANDLE},
    {ENOMEM, ERROR_NOT_ENOUGH_MEMORY},
    {EROFS, ERROR_WRITE_PROTECT},
    {ETXTBSY, ERROR_SHARING_VIOLATION},
    {ENOSYS, ERROR_NOT_SUPPORTED},
    {EOPNOTSUPP, ERROR_NOT_SUPPORTED},
    {ENODEV, ERROR_DEV_NOT_EXIST},
    {ENXIO, ERROR_DEV_NOT_EXIST},
    {EEXIST, ERROR_FILE_EXISTS},
    {EINVAL, ERROR_INVALID_PARAMETER},
    {ENOSPC, ERROR_DISK_FULL},
    {EDQUOT, ERROR_DISK_FULL},
    {EBUSY, ERROR_BUSY},
    {ENAMETOOLONG, ERROR_FILENAME_EXCED_RANGE},
    {EFBIG, ERROR_FILE_TOO_LARGE},
    {EOVERFLOW, ERROR_ARITHMETIC_OVERFLOW},
    {EINTR, ERROR_OPERATION_ABORTED},
    {EFAULT, ERROR_NOACCESS},
    {EILSEQ, ERROR_NO_UNICODE_TRANSLATION},
    {EIO, ERROR_IO_DEVICE},
    {EAGAIN, ERROR_NO_SYSTEM_RESOURCES},
    {ETIMEDOUT, ERROR_TIMEOUT},
    {ELOOP, ERROR_CANT_RESOLVE_FILENAME},
};

}  // namespace

DWORD error_from_errno(int number) {
    const auto* const row = std::find_if(std::begin(ROWS), std::end(ROWS), [number](const Row& candidate) {
        return candidate.number == number;
    });
    return row != std::end(ROWS) ? row->code : ERROR_GEN_FAILURE;
}

DWORD error_of_path(std::string_view path, int number) {
    if (number != ENOENT) {
        return error_from_errno(number);
    }
    const std::size_t separator = path.find_last_of('/');
    const std::string folder(separator == std::string_view::npos ? "." : path.substr(0, separator + 1));
    return path.empty() || access(folder.c_str(), F_OK) != 0 ? ERROR_PATH_NOT_FOUND : ERROR_FILE_NOT_FOUND;
}

}  // namespace basalt::platform
