#pragma once
// GUIDs and their registry text form "{xxxxxxxx-xxxx-xxxx-xxxx-xxxxxxxxxxxx}".

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

struct GUID {
  DWORD Data1;
  WORD Data2;
  WORD Data3;
  BYTE Data4[8];
};
using CLSID = GUID;
using LPCOLESTR = const OLECHAR*;

inline constexpr HRESULT NOERROR = 0;
inline constexpr HRESULT E_INVALIDARG = static_cast<HRESULT>(0x80070057);
inline constexpr HRESULT CO_E_CLASSSTRING = static_cast<HRESULT>(0x800401F3);

// Reads a class identifier from exactly "{" 8 "-" 4 "-" 4 "-" 4 "-" 12 "}" hexadecimal digits
// (either case) and a terminator, into *pclsid: Data1, Data2 and Data3 are the first three
// groups as numbers, Data4 the eight bytes of the last two groups in order. NOERROR, or
// CO_E_CLASSSTRING for any other text (*pclsid is then all zeros). A null text gives NOERROR and
// the null GUID; a null pclsid gives E_INVALIDARG. Program identifiers are not looked up.
VYN_API HRESULT CLSIDFromString(LPCOLESTR lpsz, CLSID* pclsid);

}  // namespace win32
