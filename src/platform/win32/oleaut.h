#pragma once
// System strings (BSTR): a 32-bit byte length, then the UTF-16 text and a terminator.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// A new system string holding a copy of psz up to its terminator; null for a null psz.
VYN_API BSTR SysAllocString(const OLECHAR* psz);
// A new system string of len units copied from strIn (left uninitialised when strIn is null).
VYN_API BSTR SysAllocStringLen(const OLECHAR* strIn, UINT len);
VYN_API void SysFreeString(BSTR bstrString);
// The units of the string (its stored length, not the position of the first zero); 0 for null.
VYN_API UINT SysStringLen(BSTR bstr);
VYN_API UINT SysStringByteLen(BSTR bstr);

}  // namespace win32
