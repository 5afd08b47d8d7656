#pragma once
// Creating and removing folders (Windows-form paths, see path_map.h).

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "win32/file_types.h"

namespace win32 {

// Creates one folder. FALSE with ERROR_ALREADY_EXISTS when the name is taken (by a folder or a
// file), ERROR_PATH_NOT_FOUND when the folder to hold it is missing. Security attributes are
// ignored.
VYN_API BOOL CreateDirectoryW(LPCWSTR lpPathName, LPSECURITY_ATTRIBUTES lpSecurityAttributes);
// Removes an empty folder. FALSE with ERROR_DIR_NOT_EMPTY, ERROR_DIRECTORY for a file,
// ERROR_FILE_NOT_FOUND / ERROR_PATH_NOT_FOUND when missing.
VYN_API BOOL RemoveDirectoryW(LPCWSTR lpPathName);
// Creates a folder and every missing folder above it, and returns (and sets as last error):
//   ERROR_SUCCESS;
//   ERROR_ALREADY_EXISTS when the folder exists already;
//   ERROR_FILE_EXISTS when a file has its name;
//   ERROR_PATH_NOT_FOUND when a file stands where a folder above it should be, or the root
//     (the drive's or share's folder) is missing: roots are never created;
//   ERROR_BAD_PATHNAME for a relative path (PathIsRelativeW; a POSIX absolute path such as
//     "/tmp/x" is accepted) or null;
//   ERROR_FILENAME_EXCED_RANGE for a path of 248 units or more;
//   the error of the failed creation otherwise.
// The window and the security attributes are ignored (no dialog is ever shown).
VYN_API int SHCreateDirectoryExW(HWND hwnd, LPCWSTR pszPath, const SECURITY_ATTRIBUTES* psa);

}  // namespace win32
