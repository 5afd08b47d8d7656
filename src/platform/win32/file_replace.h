#pragma once
// Replacing the whole content of a file at once: a crash at any moment leaves the old or the new
// content, never a mix (the same replacement the INI writes use).

#include <cstddef>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Makes the size bytes at data the content of the file at path (a Windows-form path, see
// path_map.h), creating it when missing. A symbolic link stays a link (its target is written);
// the file keeps its permissions, owner and attributes. FALSE with the last error on failure,
// the file unchanged: ERROR_ACCESS_DENIED (folder not writable, or path names a folder),
// ERROR_PATH_NOT_FOUND (no such folder), ERROR_DISK_FULL, or the error of the failed call.
VYN_API BOOL ReplaceFileContentW(LPCWSTR path, const void* data, std::size_t size);

}  // namespace win32
