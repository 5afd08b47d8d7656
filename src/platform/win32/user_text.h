#pragma once
// Text helpers of the Win32 user interface library that work on UTF-16 in place.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Lower-cases exactly cchLength units of lpsz in place, zero units included (a buffer of fixed
// size is processed whole), by the simple Unicode lower-case mapping of each character: a
// surrogate pair is mapped as the one character it encodes, a lone surrogate stays. Returns
// cchLength; 0 for a null lpsz.
VYN_API DWORD CharLowerBuffW(LPWSTR lpsz, DWORD cchLength);

}  // namespace win32
