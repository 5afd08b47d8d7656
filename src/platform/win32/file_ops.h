#pragma once
// Deleting, copying and moving files (Windows-form paths, see path_map.h). Share modes of open
// handles are respected, as on Windows.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

inline constexpr DWORD MOVEFILE_REPLACE_EXISTING = 0x1;
inline constexpr DWORD MOVEFILE_COPY_ALLOWED = 0x2;
inline constexpr DWORD MOVEFILE_WRITE_THROUGH = 0x8;

// Deletes a file (a symbolic link itself, not its target). FALSE with ERROR_FILE_NOT_FOUND /
// ERROR_PATH_NOT_FOUND when missing, ERROR_ACCESS_DENIED for a folder or a read-only file,
// ERROR_SHARING_VIOLATION while a handle to it is open without FILE_SHARE_DELETE.
VYN_API BOOL DeleteFileW(LPCWSTR lpFileName);

// Copies a file with its data, permissions (so its read-only attribute) and last write time.
// FALSE with ERROR_FILE_EXISTS when bFailIfExists and the target exists; ERROR_ACCESS_DENIED when
// the source or the target is a folder or the target is read-only; ERROR_SHARING_VIOLATION when
// an open handle denies the reading or the writing (or source and target are the same file);
// ERROR_DISK_FULL when the target's device fills. A copy that fails after the target was created
// or cut removes the target.
VYN_API BOOL CopyFileW(LPCWSTR lpExistingFileName, LPCWSTR lpNewFileName, BOOL bFailIfExists);

// Renames or moves a file or folder. An existing target is replaced only with
// MOVEFILE_REPLACE_EXISTING (else ERROR_ALREADY_EXISTS) and never when it is a folder or
// read-only (ERROR_ACCESS_DENIED). Across file systems, with MOVEFILE_COPY_ALLOWED a file is
// copied to a temporary name beside the target, flushed, renamed over the target and then the
// source is deleted, so a failure part-way leaves both source and target as they were; without
// it, and for folders, ERROR_NOT_SAME_DEVICE. MOVEFILE_WRITE_THROUGH flushes the target's folder
// before returning. ERROR_SHARING_VIOLATION when a handle to the source (or a replaced target)
// is open without FILE_SHARE_DELETE; ERROR_INVALID_PARAMETER for other flags or a null target.
VYN_API BOOL MoveFileExW(LPCWSTR lpExistingFileName, LPCWSTR lpNewFileName, DWORD dwFlags);

}  // namespace win32
