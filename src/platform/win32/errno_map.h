#pragma once
// The one translation of POSIX error numbers into Win32 error codes. Every platform call that
// fails with errno reports its failure through this mapping.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// The Win32 code for an errno value, as Windows reports the same failure:
//   0 → ERROR_SUCCESS
//   ENOENT → ERROR_FILE_NOT_FOUND; ENOTDIR, ELOOP → ERROR_PATH_NOT_FOUND
//   EACCES, EPERM, EISDIR → ERROR_ACCESS_DENIED (Windows refuses to open a directory as a file
//   with access denied)
//   EBADF → ERROR_INVALID_HANDLE; EMFILE, ENFILE → ERROR_TOO_MANY_OPEN_FILES
//   ENOMEM → ERROR_NOT_ENOUGH_MEMORY; EEXIST → ERROR_FILE_EXISTS
//   ENOSPC, EDQUOT, EFBIG → ERROR_DISK_FULL (a write that the file system cannot hold, whether
//   for want of space, quota or maximum file size)
//   EINVAL → ERROR_INVALID_PARAMETER; ENAMETOOLONG → ERROR_FILENAME_EXCED_RANGE
//   ENOTEMPTY → ERROR_DIR_NOT_EMPTY; EROFS → ERROR_WRITE_PROTECT; EBUSY → ERROR_BUSY
//   ETXTBSY → ERROR_SHARING_VIOLATION; EXDEV → ERROR_NOT_SAME_DEVICE
//   EPIPE → ERROR_BROKEN_PIPE
//   ENOSYS, ENOTSUP/EOPNOTSUPP → ERROR_NOT_SUPPORTED; ETIMEDOUT → ERROR_TIMEOUT
//   EILSEQ → ERROR_NO_UNICODE_TRANSLATION; EOVERFLOW → ERROR_ARITHMETIC_OVERFLOW
//   ERANGE → ERROR_INSUFFICIENT_BUFFER (a result that does not fit the caller's buffer)
//   EOWNERDEAD → ERROR_ABANDONED_WAIT_0 (a mutex whose owner died)
//   anything else → ERROR_INVALID_FUNCTION ("Incorrect function."), Windows' answer for an
//   operation the target does not carry out.
VYN_API DWORD ErrorFromErrno(int errnoValue) noexcept;

}  // namespace win32
