#pragma once
// The temporary folder and temporary file names.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "win32/file_types.h"

namespace win32 {

// The temporary folder: the environment variable TMPDIR when set and not empty, else "/tmp",
// written with backslashes and ending in one ("\tmp\"; MapPath turns it back into "/tmp/").
// Returns the length without terminator; when nBufferLength units do not hold it with the
// terminator, the size needed (terminator included), buffer untouched.
VYN_API DWORD GetTempPathW(DWORD nBufferLength, LPWSTR lpBuffer);

// Writes "<path>\<pre><hex>.tmp" into lpTempFileName (MAX_PATH units): <pre> is up to the first
// three characters of lpPrefixString, <hex> the number in upper-case hexadecimal without
// leading zeros. With uUnique nonzero its low 16 bits make the name, nothing is created and
// uUnique is returned. With 0 the numbers are tried from one taken from the clock, the first
// name that is free is created as an empty file (atomically: no two callers get the same name)
// and its number returned. 0 on failure: ERROR_BUFFER_OVERFLOW for a path longer than
// MAX_PATH - 14, ERROR_DIRECTORY when the folder does not exist, ERROR_FILE_EXISTS when all
// 65535 names are taken, ERROR_INVALID_PARAMETER for a null path or output.
VYN_API UINT GetTempFileNameW(LPCWSTR lpPathName, LPCWSTR lpPrefixString, UINT uUnique,
                              LPWSTR lpTempFileName);

}  // namespace win32
