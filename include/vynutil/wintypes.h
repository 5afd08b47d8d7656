#pragma once
// Windows-width integer types, the SDK's character type and opaque handles, as the plug-in SDK
// uses them. Integer types keep their Windows widths on Linux (DWORD is 32 bits, not long).

#include <cstddef>
#include <cstdint>

// One UTF-16 code unit: the SDK's wide character (Qt's QChar and ICU's UChar use the same unit).
using MCHAR = char16_t;

using BYTE = std::uint8_t;
using WORD = std::uint16_t;
using DWORD = std::uint32_t;
using UINT = std::uint32_t;
using ULONG = std::uint32_t;
using USHORT = std::uint16_t;
using LONG = std::int32_t;
using INT = std::int32_t;
using BOOL = std::int32_t;
using LONGLONG = std::int64_t;
using ULONGLONG = std::uint64_t;
using DWORD64 = std::uint64_t;
using INT_PTR = std::intptr_t;
using UINT_PTR = std::uintptr_t;
using LONG_PTR = std::intptr_t;
using ULONG_PTR = std::uintptr_t;
using DWORD_PTR = std::uintptr_t;
using SIZE_T = std::size_t;
using LCID = DWORD;
using LANGID = WORD;
using HRESULT = LONG;

using LPSTR = char*;
using LPCSTR = const char*;
using LPWSTR = MCHAR*;
using LPCWSTR = const MCHAR*;
// A length-prefixed system string; allocated by SysAllocString, freed by SysFreeString.
using BSTR = MCHAR*;
using OLECHAR = MCHAR;

#ifndef TRUE
#define TRUE 1
#endif
#ifndef FALSE
#define FALSE 0
#endif

// Opaque handles. Each kind is a distinct pointer type, as with Windows' STRICT handles.
#define VYN_DECLARE_HANDLE(name) \
  struct name##__;               \
  using name = name##__*
VYN_DECLARE_HANDLE(HWND);
VYN_DECLARE_HANDLE(HINSTANCE);
VYN_DECLARE_HANDLE(HKEY);
VYN_DECLARE_HANDLE(HDC);
VYN_DECLARE_HANDLE(HBITMAP);
VYN_DECLARE_HANDLE(HFONT);
VYN_DECLARE_HANDLE(HPALETTE);
VYN_DECLARE_HANDLE(HICON);
VYN_DECLARE_HANDLE(HMONITOR);
#undef VYN_DECLARE_HANDLE
using HMODULE = HINSTANCE;
using HANDLE = void*;
using HGLOBAL = HANDLE;
using HLOCAL = HANDLE;

#define INVALID_HANDLE_VALUE (reinterpret_cast<HANDLE>(static_cast<LONG_PTR>(-1)))

// Results of waiting on an object, and the timeout that never expires.
inline constexpr DWORD WAIT_OBJECT_0 = 0x00000000;
inline constexpr DWORD WAIT_ABANDONED = 0x00000080;  // the owner ended holding it; now the caller's
inline constexpr DWORD WAIT_TIMEOUT = 0x00000102;
inline constexpr DWORD WAIT_FAILED = 0xFFFFFFFF;
inline constexpr DWORD INFINITE = 0xFFFFFFFF;

// Geometry records of the window and drawing interfaces.
struct RECT {
  LONG left;
  LONG top;
  LONG right;
  LONG bottom;
};
struct POINT {
  LONG x;
  LONG y;
};
struct SIZE {
  LONG cx;
  LONG cy;
};

// A colour as 0x00BBGGRR.
using COLORREF = DWORD;

// An exported function found by name in a module; cast to its real type before calling.
using FARPROC = INT_PTR (*)();
