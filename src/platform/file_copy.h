#pragma once
// Copying a file's bytes and metadata between open descriptors, for CopyFileW and for moves
// across file systems.

#include <sys/stat.h>

#include "vynutil/wintypes.h"

namespace win32::detail {

// Copies everything from the position of source to the position of target. ERROR_SUCCESS, or the
// Win32 code of the first failure (ERROR_DISK_FULL when the target cannot grow, never SIGXFSZ).
DWORD CopyBytes(int source, int target);

// Gives target the permissions and the access and write times in sourceInfo. ERROR_SUCCESS or
// the code of the failure.
DWORD CopyMetadata(const struct stat& sourceInfo, int target);

}  // namespace win32::detail
