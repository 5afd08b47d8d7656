// File stamps from stat.

#include "win32/file_stamp.h"

#include <sys/stat.h>
#include <time.h>

#include <cerrno>

#include "file_stamp_settle.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace win32 {

namespace {

LONGLONG Nanoseconds(const timespec& t) { return static_cast<LONGLONG>(t.tv_sec) * 1000000000LL + t.tv_nsec; }

}  // namespace

namespace detail {

bool StampSettled(long long modified, long long changed, long long seen) {
  const bool fine = modified % 1000000000LL != 0 || changed % 1000000000LL != 0;
  const long long step = fine ? 50000000LL : 2100000000LL;
  return seen - modified > step && seen - changed > step;
}

}  // namespace detail

BOOL GetFileStampW(LPCWSTR path, FileStamp* stamp, BOOL* settled) {
  if (path == nullptr || stamp == nullptr) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  struct stat info {};
  if (sys::Syscalls().stat(MapPath(path).c_str(), &info) != 0) {
    SetLastError(ErrorFromErrno(errno));
    return FALSE;
  }
  stamp->device = static_cast<ULONGLONG>(info.st_dev);
  stamp->inode = static_cast<ULONGLONG>(info.st_ino);
  stamp->size = static_cast<ULONGLONG>(info.st_size);
  stamp->modified = Nanoseconds(info.st_mtim);
  stamp->changed = Nanoseconds(info.st_ctim);
  if (settled != nullptr) {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    *settled = detail::StampSettled(stamp->modified, stamp->changed, Nanoseconds(now)) ? TRUE : FALSE;
  }
  SetLastError(ERROR_SUCCESS);
  return TRUE;
}

}  // namespace win32
