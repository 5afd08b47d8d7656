#pragma once
// The process environment as Win32 presents it: UTF-16 names and values (stored as UTF-8 in the
// POSIX environment), names matched without regard to case (an exact match wins), one lock
// around the library's own reads and writes.

#include <optional>
#include <string>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Copies the value of variable name into buffer. Returns the value's length without terminator
// when it fits in size units (terminator included); otherwise the size needed including the
// terminator, buffer untouched (a null buffer counts as size 0). 0 with ERROR_ENVVAR_NOT_FOUND
// when unset (also for a null or empty name, or one containing '='), and 0 with the last error
// cleared when the value is empty (the buffer then holds the empty text).
VYN_API DWORD GetEnvironmentVariableW(LPCWSTR name, LPWSTR buffer, DWORD size);
// Sets name to value; a null value removes the variable. A variable that exists under another
// case is replaced and takes the new spelling. FALSE with ERROR_INVALID_PARAMETER for a null or
// empty name or one containing '='; FALSE with ERROR_ENVVAR_NOT_FOUND when removing a variable
// that is not set; FALSE with the error of the failed system call otherwise.
VYN_API BOOL SetEnvironmentVariableW(LPCWSTR name, LPCWSTR value);
// Copies src into dst with every %NAME% of a set variable replaced by its value (names matched as
// GetEnvironmentVariableW matches them). A reference to an unset variable stays as written, and
// scanning goes on after its closing '%'; a '%' without a closing one is copied. Returns the size
// of the whole result in units, terminator included. When that exceeds size, dst receives the
// first size - 1 units of the result (never half a surrogate pair) and a terminator, and the last
// error is ERROR_INSUFFICIENT_BUFFER; a null dst or size 0 only measures. A null src is empty.
VYN_API DWORD ExpandEnvironmentStringsW(LPCWSTR src, LPWSTR dst, DWORD size);

}  // namespace win32

namespace win32::detail {

// The value of a variable given by its exact UTF-8 name, read under the environment lock; the
// layer's own settings (TAVLO_PLATFORM_...) and PATH are read through it.
std::optional<std::string> EnvironmentValue(const char* name);

}  // namespace win32::detail
