#pragma once
// SearchPathW: finding a file in a list of folders (Windows-form paths, see path_map.h).

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Looks for lpFileName, with lpExtension appended when the name's last component has no '.'
// (lpExtension may be null), in each folder of lpPath in order (folders separated by ';', empty
// entries skipped). A null lpPath searches the current folder, then the folders of PATH. A name
// with a root ("\x", "/x", "C:x", "\\server\share\x") or starting with ".\" or "..\" (either
// separator) is checked as it is, whatever lpPath says. Files and folders both count.
// Found: the full path as GetFullPathNameW writes it (backslashes), its length without the
// terminator as the result, and *lpFilePart (when not null) pointing at the last component in
// lpBuffer; when nBufferLength units do not hold it with the terminator, the size needed with the
// terminator, the buffer untouched and *lpFilePart null. Not found: 0 with ERROR_FILE_NOT_FOUND.
// A null or empty lpFileName: 0 with ERROR_INVALID_PARAMETER.
VYN_API DWORD SearchPathW(LPCWSTR lpPath, LPCWSTR lpFileName, LPCWSTR lpExtension,
                          DWORD nBufferLength, LPWSTR lpBuffer, LPWSTR* lpFilePart);

}  // namespace win32
