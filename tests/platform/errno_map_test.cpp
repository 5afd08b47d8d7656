// errno values to Win32 error codes: the cases where a plausible guess would be wrong.

#include "win32/errno_map.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "win32/last_error.h"

namespace {

using namespace win32;

TEST(ErrnoMap, FailuresGetTheCodesWindowsReportsForThem) {
  const std::pair<int, DWORD> rows[] = {
      {0, ERROR_SUCCESS},          {ENOENT, ERROR_FILE_NOT_FOUND},
      {ENOTDIR, ERROR_PATH_NOT_FOUND}, {EISDIR, ERROR_ACCESS_DENIED},
      {EEXIST, ERROR_FILE_EXISTS}, {EFBIG, ERROR_DISK_FULL},
      {EOPNOTSUPP, ERROR_NOT_SUPPORTED}, {EOWNERDEAD, ERROR_ABANDONED_WAIT_0},
      {EIO, ERROR_INVALID_FUNCTION},  // unmapped
      {99999, ERROR_INVALID_FUNCTION},  // not an errno
  };
  for (const auto& [errnoValue, code] : rows) {
    EXPECT_EQ(ErrorFromErrno(errnoValue), code) << errnoValue;
  }
}

}  // namespace
