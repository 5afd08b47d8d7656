// errno values to Win32 error codes.

#include "win32/errno_map.h"

#include <cerrno>

#include "win32/last_error.h"

namespace win32 {

DWORD ErrorFromErrno(int errnoValue) noexcept {
  switch (errnoValue) {
    case 0: return ERROR_SUCCESS;
    case ENOENT: return ERROR_FILE_NOT_FOUND;
    case ENOTDIR:
    case ELOOP: return ERROR_PATH_NOT_FOUND;
    case EACCES:
    case EPERM:
    case EISDIR: return ERROR_ACCESS_DENIED;
    case EBADF: return ERROR_INVALID_HANDLE;
    case EMFILE:
    case ENFILE: return ERROR_TOO_MANY_OPEN_FILES;
    case ENOMEM: return ERROR_NOT_ENOUGH_MEMORY;
    case EEXIST: return ERROR_FILE_EXISTS;
    case ENOSPC:
    case EDQUOT:
    case EFBIG: return ERROR_DISK_FULL;
    case EINVAL: return ERROR_INVALID_PARAMETER;
    case ENAMETOOLONG: return ERROR_FILENAME_EXCED_RANGE;
    case ENOTEMPTY: return ERROR_DIR_NOT_EMPTY;
    case EROFS: return ERROR_WRITE_PROTECT;
    case EBUSY: return ERROR_BUSY;
    case ETXTBSY: return ERROR_SHARING_VIOLATION;
    case EXDEV: return ERROR_NOT_SAME_DEVICE;
    case EPIPE: return ERROR_BROKEN_PIPE;
    case ENOSYS:
    case ENOTSUP: return ERROR_NOT_SUPPORTED;
#if EOPNOTSUPP != ENOTSUP
    case EOPNOTSUPP: return ERROR_NOT_SUPPORTED;
#endif
    case ETIMEDOUT: return ERROR_TIMEOUT;
    case EILSEQ: return ERROR_NO_UNICODE_TRANSLATION;
    case EOVERFLOW: return ERROR_ARITHMETIC_OVERFLOW;
    case ERANGE: return ERROR_INSUFFICIENT_BUFFER;
    case EOWNERDEAD: return ERROR_ABANDONED_WAIT_0;
    default: return ERROR_INVALID_FUNCTION;
  }
}

}  // namespace win32
