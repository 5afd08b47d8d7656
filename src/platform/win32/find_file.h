#pragma once
// Listing a folder as FindFirstFileW does: the last component of the pattern is a mask, matched
// without regard to case against every entry of the folder named before it.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "win32/file_types.h"

namespace win32 {

struct WIN32_FIND_DATAW {
  DWORD dwFileAttributes;  // as GetFileAttributesW reports the entry
  FILETIME ftCreationTime;
  FILETIME ftLastAccessTime;
  FILETIME ftLastWriteTime;
  DWORD nFileSizeHigh;
  DWORD nFileSizeLow;
  DWORD dwReserved0;
  DWORD dwReserved1;
  MCHAR cFileName[MAX_PATH];
  MCHAR cAlternateFileName[14];  // always empty: there are no short names
};

// Starts a search and describes the first match in *lpFindFileData. Masks: '*' matches any run
// of characters, '?' exactly one; "*.*" matches every name, a mask ending in ".*" also matches
// the name without extension ("a.*" finds "a"), one ending in '.' only names without a dot.
// Matches come in Windows' order for NTFS: "." and ".." first (listed for every folder but a
// root), then by name without regard to case. Returns INVALID_HANDLE_VALUE with
// ERROR_FILE_NOT_FOUND when nothing matches (or the pattern ends in a separator),
// ERROR_PATH_NOT_FOUND when the folder is missing. The folder is read once, at this call.
VYN_API HANDLE FindFirstFileW(LPCWSTR lpFileName, WIN32_FIND_DATAW* lpFindFileData);
// The next match; FALSE with ERROR_NO_MORE_FILES after the last, ERROR_INVALID_HANDLE for a
// handle that is not a live search. Entries that vanished since the search began are skipped.
VYN_API BOOL FindNextFileW(HANDLE hFindFile, WIN32_FIND_DATAW* lpFindFileData);
// Ends a search; FALSE with ERROR_INVALID_HANDLE for a handle that is not a live search.
VYN_API BOOL FindClose(HANDLE hFindFile);

}  // namespace win32
