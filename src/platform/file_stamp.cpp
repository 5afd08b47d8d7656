// File stamps from stat.

#include "win32/file_stamp.h"

#include <sys/stat.h>
#include <time.h>

#include <cerrno>

#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace win32 {

namespace {

LONGLONG Nanoseconds(const timespec& t) { return static_cast<LONGLONG>(t.tv_sec) * 1000000000LL + t.tv_nsec; }

}  // namespace

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
    // File systems that keep nanoseconds take their times from the kernel's tick (milliseconds);
    // those that keep whole seconds (or two, for FAT) need a window to match.
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    const bool fine = stamp->modified % 1000000000LL != 0 || stamp->changed % 1000000000LL != 0;
    const LONGLONG step = fine ? 50000000LL : 2100000000LL;
    const LONGLONG seen = Nanoseconds(now);
    *settled = seen - stamp->modified > step && seen - stamp->changed > step ? TRUE : FALSE;
  }
  SetLastError(ERROR_SUCCESS);
  return TRUE;
}

}  // namespace win32
