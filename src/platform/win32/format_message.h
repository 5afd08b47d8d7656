#pragma once
// FormatMessageW for system messages, and the local heap that its allocated buffers come from.

#include <cstdarg>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

inline constexpr DWORD FORMAT_MESSAGE_ALLOCATE_BUFFER = 0x00000100;
inline constexpr DWORD FORMAT_MESSAGE_IGNORE_INSERTS = 0x00000200;
inline constexpr DWORD FORMAT_MESSAGE_FROM_STRING = 0x00000400;
inline constexpr DWORD FORMAT_MESSAGE_FROM_HMODULE = 0x00000800;
inline constexpr DWORD FORMAT_MESSAGE_FROM_SYSTEM = 0x00001000;
inline constexpr DWORD FORMAT_MESSAGE_ARGUMENT_ARRAY = 0x00002000;
inline constexpr DWORD FORMAT_MESSAGE_MAX_WIDTH_MASK = 0x000000FF;

inline constexpr UINT LMEM_FIXED = 0x0000;
inline constexpr UINT LMEM_ZEROINIT = 0x0040;

// With FORMAT_MESSAGE_FROM_SYSTEM: the system text of dwMessageId (English, ending in "\r\n" as
// Windows' texts do). Returns the characters written without the terminator, or 0 with
// ERROR_MR_MID_NOT_FOUND (317) for a code that has no text. With
// FORMAT_MESSAGE_ALLOCATE_BUFFER, lpBuffer is really an MCHAR** that receives a LocalAlloc'ed
// buffer, which the caller frees with LocalFree. Inserts (%1 …) are left as they are.
VYN_API DWORD FormatMessageW(DWORD dwFlags, const void* lpSource, DWORD dwMessageId,
                             DWORD dwLanguageId, MCHAR* lpBuffer, DWORD nSize, va_list* Arguments);

VYN_API HLOCAL LocalAlloc(UINT uFlags, SIZE_T uBytes);
// Frees a block from LocalAlloc; returns null on success (null is accepted).
VYN_API HLOCAL LocalFree(HLOCAL hMem);

}  // namespace win32
