#pragma once
// The records and constants that the file functions of this layer share: path buffer size,
// 64-bit integers and times as Win32 passes them, and the file attribute bits.

#include "vynutil/wintypes.h"

namespace win32 {

// The size, in MCHARs with the terminator, of the fixed path buffers of the Win32 interface.
inline constexpr DWORD MAX_PATH = 260;

// A signed 64-bit value that Win32 also offers as two 32-bit halves.
union LARGE_INTEGER {
  struct {
    DWORD LowPart;
    LONG HighPart;
  } u;
  LONGLONG QuadPart;
};
using PLARGE_INTEGER = LARGE_INTEGER*;

// A point in time as 100-nanosecond intervals since 1 January 1601 (UTC), in two halves.
struct FILETIME {
  DWORD dwLowDateTime;
  DWORD dwHighDateTime;
};

// File attribute bits, as GetFileAttributesW reports them.
inline constexpr DWORD FILE_ATTRIBUTE_READONLY = 0x1;
inline constexpr DWORD FILE_ATTRIBUTE_HIDDEN = 0x2;
inline constexpr DWORD FILE_ATTRIBUTE_SYSTEM = 0x4;
inline constexpr DWORD FILE_ATTRIBUTE_DIRECTORY = 0x10;
inline constexpr DWORD FILE_ATTRIBUTE_ARCHIVE = 0x20;
inline constexpr DWORD FILE_ATTRIBUTE_NORMAL = 0x80;
inline constexpr DWORD FILE_ATTRIBUTE_TEMPORARY = 0x100;
inline constexpr DWORD FILE_ATTRIBUTE_REPARSE_POINT = 0x400;
inline constexpr DWORD FILE_ATTRIBUTE_OFFLINE = 0x1000;
inline constexpr DWORD FILE_ATTRIBUTE_NOT_CONTENT_INDEXED = 0x2000;
inline constexpr DWORD FILE_ATTRIBUTE_RECALL_ON_DATA_ACCESS = 0x400000;
// The failure result of GetFileAttributesW.
inline constexpr DWORD INVALID_FILE_ATTRIBUTES = 0xFFFFFFFF;

// Security descriptors are not modelled: parameters of this type are accepted and ignored.
struct SECURITY_ATTRIBUTES;
using LPSECURITY_ATTRIBUTES = SECURITY_ATTRIBUTES*;

}  // namespace win32
