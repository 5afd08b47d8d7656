#pragma once
// A file's stamp: what tells whether it changed since it was last looked at (identity, size and
// time stamps in nanoseconds), for callers that keep something they derived from a file.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

struct FileStamp {
  ULONGLONG device = 0;
  ULONGLONG inode = 0;
  ULONGLONG size = 0;
  LONGLONG modified = 0;  // nanoseconds since 1970
  LONGLONG changed = 0;   // status change, nanoseconds since 1970
  bool operator==(const FileStamp&) const = default;
};

// The stamp of the file at path (a Windows-form path, see path_map.h; links followed). settled
// (optional) tells whether the stamp can be trusted: the file's last change lies more than one
// step of the file system's clock in the past, so any later change will show in the stamp.
// FALSE with the last error when the file cannot be looked at.
VYN_API BOOL GetFileStampW(LPCWSTR path, FileStamp* stamp, BOOL* settled);

}  // namespace win32
