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
// buffer of at least nSize units, which the caller frees with LocalFree (*lpBuffer is null on
// failure). Without it, nSize is the room at lpBuffer in units; text and terminator must fit, else
// 0 with ERROR_INSUFFICIENT_BUFFER. Inserts (%1 …) are left as they are. The texts exist in
// English only, for every dwLanguageId; the line-width bits are ignored. Flags without
// FORMAT_MESSAGE_FROM_SYSTEM, or with FORMAT_MESSAGE_FROM_STRING, and a null lpBuffer fail with
// ERROR_INVALID_PARAMETER.
VYN_API DWORD FormatMessageW(DWORD dwFlags, const void* lpSource, DWORD dwMessageId,
                             DWORD dwLanguageId, MCHAR* lpBuffer, DWORD nSize, va_list* Arguments);

// A fixed block of uBytes (zeroed with LMEM_ZEROINIT); null with ERROR_NOT_ENOUGH_MEMORY when
// memory is short, or ERROR_INVALID_PARAMETER for other flags (movable blocks are not provided).
VYN_API HLOCAL LocalAlloc(UINT uFlags, SIZE_T uBytes);
// Frees a block from LocalAlloc; returns null on success (null is accepted).
VYN_API HLOCAL LocalFree(HLOCAL hMem);

}  // namespace win32
