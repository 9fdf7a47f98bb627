#include "src/platform/errors/error_from_errno.h"

#include <unistd.h>

#include <cerrno>
#include <string>

#include "basalt/platform/error.h"

namespace basalt::platform {

DWORD error_from_errno(int number) {
    switch (number) {
        case 0:
            return ERROR_SUCCESS;
        case ENOENT:
            return ERROR_FILE_NOT_FOUND;
        case ENOTDIR:
            return ERROR_PATH_NOT_FOUND;
        case EMFILE:
        case ENFILE:
            return ERROR_TOO_MANY_OPEN_FILES;
        case EACCES:
        case EPERM:
        case EISDIR:
            return ERROR_ACCESS_DENIED;
        case EBADF:
            return ERROR_INVALID_HANDLE;
        case ENOMEM:
            return ERROR_NOT_ENOUGH_MEMORY;
        case EROFS:
            return ERROR_WRITE_PROTECT;
        case ETXTBSY:
            return ERROR_SHARING_VIOLATION;
        case ENOSYS:
        case EOPNOTSUPP:
            return ERROR_NOT_SUPPORTED;
        case ENODEV:
        case ENXIO:
            return ERROR_DEV_NOT_EXIST;
        case EEXIST:
            return ERROR_FILE_EXISTS;
        case EINVAL:
            return ERROR_INVALID_PARAMETER;
        case ENOSPC:
        case EDQUOT:
            return ERROR_DISK_FULL;
        case EBUSY:
            return ERROR_BUSY;
        case ENAMETOOLONG:
            return ERROR_FILENAME_EXCED_RANGE;
        case EFBIG:
            return ERROR_FILE_TOO_LARGE;
        case EOVERFLOW:
            return ERROR_ARITHMETIC_OVERFLOW;
        case EINTR:
            return ERROR_OPERATION_ABORTED;
        case EFAULT:
            return ERROR_NOACCESS;
        case EILSEQ:
            return ERROR_NO_UNICODE_TRANSLATION;
        case EIO:
            return ERROR_IO_DEVICE;
        case EAGAIN:
            return ERROR_NO_SYSTEM_RESOURCES;
        case ETIMEDOUT:
            return ERROR_TIMEOUT;
        case ELOOP:
            return ERROR_CANT_RESOLVE_FILENAME;
        default:
            return ERROR_GEN_FAILURE;
    }
}

void set_last_error_from_errno() {
    SetLastError(error_from_errno(errno));
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
