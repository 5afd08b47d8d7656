// errno values to Win32 error codes.

#include "win32/errno_map.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "win32/last_error.h"

namespace {

using namespace win32;

TEST(ErrnoMap, FailuresGetTheCodesWindowsReportsForThem) {
  struct Row {
    const char* name;
    int errnoValue;
    DWORD code;
  };
  const Row rows[] = {
      {"no error", 0, ERROR_SUCCESS},
      {"ENOENT", ENOENT, ERROR_FILE_NOT_FOUND},
      {"ENOTDIR", ENOTDIR, ERROR_PATH_NOT_FOUND},
      {"EACCES", EACCES, ERROR_ACCESS_DENIED},
      {"EPERM", EPERM, ERROR_ACCESS_DENIED},
      {"EISDIR", EISDIR, ERROR_ACCESS_DENIED},
      {"EBADF", EBADF, ERROR_INVALID_HANDLE},
      {"ENOMEM", ENOMEM, ERROR_NOT_ENOUGH_MEMORY},
      {"EEXIST", EEXIST, ERROR_FILE_EXISTS},
      {"ENOSPC", ENOSPC, ERROR_DISK_FULL},
      {"EFBIG", EFBIG, ERROR_DISK_FULL},
      {"EINVAL", EINVAL, ERROR_INVALID_PARAMETER},
      {"ENAMETOOLONG", ENAMETOOLONG, ERROR_FILENAME_EXCED_RANGE},
      {"ENOTEMPTY", ENOTEMPTY, ERROR_DIR_NOT_EMPTY},
      {"EROFS", EROFS, ERROR_WRITE_PROTECT},
      {"EBUSY", EBUSY, ERROR_BUSY},
      {"EMFILE", EMFILE, ERROR_TOO_MANY_OPEN_FILES},
      {"ENFILE", ENFILE, ERROR_TOO_MANY_OPEN_FILES},
      {"EXDEV", EXDEV, ERROR_NOT_SAME_DEVICE},
      {"EOPNOTSUPP", EOPNOTSUPP, ERROR_NOT_SUPPORTED},
      {"EOWNERDEAD", EOWNERDEAD, ERROR_ABANDONED_WAIT_0},
      {"unmapped (EIO)", EIO, ERROR_INVALID_FUNCTION},
      {"not an errno", 99999, ERROR_INVALID_FUNCTION},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(ErrorFromErrno(row.errnoValue), row.code);
  }
}

}  // namespace
