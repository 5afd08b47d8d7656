#pragma once
// File attributes as Windows reports them for POSIX files:
//   FILE_ATTRIBUTE_DIRECTORY  a folder (or a link to one);
//   FILE_ATTRIBUTE_READONLY   no write permission for the owner;
//   FILE_ATTRIBUTE_HIDDEN     a name that starts with '.' ("." and ".." themselves excepted);
//   FILE_ATTRIBUTE_REPARSE_POINT  a symbolic link (the entry itself is described, as Windows
//                             describes a link; its folder and read-only bits are the target's);
//   FILE_ATTRIBUTE_NORMAL     when no other bit is set.
// Attributes POSIX files do not have (ARCHIVE, OFFLINE, RECALL_ON_DATA_ACCESS, SYSTEM,
// TEMPORARY, NOT_CONTENT_INDEXED, and HIDDEN or REPARSE_POINT for any file) come from an
// override kept in the process for a path (detail::SetExtraFileAttributes, SetFileAttributesW),
// or else from the extended attribute "user.vyn.attributes" of the file, a number in decimal or
// with 0x in hexadecimal (setfattr -n user.vyn.attributes -v 0x1020 file marks a file offline
// and archived). Both are added to what the file system says.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "win32/file_types.h"

namespace win32 {

enum GET_FILEEX_INFO_LEVELS { GetFileExInfoStandard = 0, GetFileExMaxInfoLevel = 1 };

struct WIN32_FILE_ATTRIBUTE_DATA {
  DWORD dwFileAttributes;
  FILETIME ftCreationTime;  // the last status change: Linux file systems keep no creation time
  FILETIME ftLastAccessTime;
  FILETIME ftLastWriteTime;
  DWORD nFileSizeHigh;      // 0 for folders and links
  DWORD nFileSizeLow;
};

// The attributes of a file or folder, or INVALID_FILE_ATTRIBUTES with ERROR_FILE_NOT_FOUND
// (ERROR_PATH_NOT_FOUND when a folder on the way is missing or the path is null or empty).
VYN_API DWORD GetFileAttributesW(LPCWSTR lpFileName);
// Attributes, times and size (fInfoLevelId must be GetFileExInfoStandard, else
// ERROR_INVALID_PARAMETER). FALSE with the errors of GetFileAttributesW.
VYN_API BOOL GetFileAttributesExW(LPCWSTR lpFileName, GET_FILEEX_INFO_LEVELS fInfoLevelId,
                                  void* lpFileInformation);
// Sets the attributes: FILE_ATTRIBUTE_READONLY takes write permission from everyone, its absence
// gives it back to the owner; HIDDEN, SYSTEM, ARCHIVE, TEMPORARY, OFFLINE and
// NOT_CONTENT_INDEXED are kept as the path's override (replacing those bits of it);
// FILE_ATTRIBUTE_NORMAL alone clears them all. Other bits are ignored. Errors as
// GetFileAttributesW.
VYN_API BOOL SetFileAttributesW(LPCWSTR lpFileName, DWORD dwFileAttributes);
// TRUE when GetFileAttributesW finds the file or folder; else FALSE with its last error.
VYN_API BOOL PathFileExistsW(LPCWSTR pszPath);

}  // namespace win32

namespace win32::detail {

// Sets the override of a path (attributes outside the set listed above are ignored; 0 removes
// the override). The path is taken as GetFileAttributesW takes it; the override belongs to the
// path, not to the file, and stays until changed. For tests and hosts that model cloud storage.
VYN_API void SetExtraFileAttributes(LPCWSTR path, DWORD attributes);
// Removes every override.
VYN_API void ClearExtraFileAttributes();

}  // namespace win32::detail
