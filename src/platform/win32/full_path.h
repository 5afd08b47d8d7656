#pragma once
// The current folder and full path names. The current folder is the process's POSIX working
// folder written the Windows way, with backslashes and no drive ("\home\ann\project"): a path
// rooted at a backslash, which MapPath turns back into the same POSIX folder.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Copies the current folder into lpBuffer and returns its length without the terminator; when
// nBufferLength units do not hold it with the terminator, returns the size needed (terminator
// included) and leaves the buffer alone. 0 with the last error when the folder is unknown.
VYN_API DWORD GetCurrentDirectoryW(DWORD nBufferLength, LPWSTR lpBuffer);

// The full path of lpFileName by Windows' rules, on the text alone (nothing is looked up):
// '/' becomes '\'; a relative path is taken from the current folder; a path rooted at '\' and a
// drive-relative "X:name" keep their root (the current folder has no drive: "X:name" gives
// "X:\name"); repeated separators collapse, "." components go, ".." removes the component before
// it but never the root ("C:\..\a" gives "C:\a", "\\srv\share\..\a" gives "\\srv\share\a"); the
// last component loses trailing dots and spaces; a final separator stays. "\\?\" paths are
// returned unchanged. Returns the length without terminator and, when lpFilePart is not null,
// points *lpFilePart at the last component in lpBuffer (null when the result ends in '\').
// When nBufferLength is too small, returns the size needed with the terminator. 0 with
// ERROR_INVALID_NAME for an empty name, ERROR_INVALID_PARAMETER for a null one.
VYN_API DWORD GetFullPathNameW(LPCWSTR lpFileName, DWORD nBufferLength, LPWSTR lpBuffer,
                               LPWSTR* lpFilePart);

}  // namespace win32
