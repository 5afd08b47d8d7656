#pragma once
// Global memory blocks as Win32 hands them out: fixed blocks (the handle is the address) and
// movable blocks (the handle is locked to get the address, with a lock count). A handle that was
// never handed out or is already freed is refused with ERROR_INVALID_HANDLE, never dereferenced.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

inline constexpr UINT GMEM_FIXED = 0x0000;
inline constexpr UINT GMEM_MOVEABLE = 0x0002;
inline constexpr UINT GMEM_ZEROINIT = 0x0040;
inline constexpr UINT GHND = GMEM_MOVEABLE | GMEM_ZEROINIT;
inline constexpr UINT GPTR = GMEM_FIXED | GMEM_ZEROINIT;

// A new block of bytes (zeroed with GMEM_ZEROINIT), or null with ERROR_NOT_ENOUGH_MEMORY.
// A movable block of 0 bytes is allowed (it is "discarded": it cannot be locked until resized).
VYN_API HGLOBAL GlobalAlloc(UINT flags, SIZE_T bytes);
// Resizes a block, keeping its contents (new bytes zeroed with GMEM_ZEROINIT); the handle of
// the resized block, or null with the old block unchanged (ERROR_NOT_ENOUGH_MEMORY). As on
// Windows, a fixed block or a locked movable block only changes in place unless flags has
// GMEM_MOVEABLE (a fixed block that moves gets a new handle, its new address); an unlocked
// movable block may always move, and resized to 0 bytes it is discarded.
VYN_API HGLOBAL GlobalReAlloc(HGLOBAL block, SIZE_T bytes, UINT flags);
// The address of the block's first byte; a movable block's lock count goes up. Null with
// ERROR_INVALID_HANDLE for a null or unknown handle, with ERROR_DISCARDED for a movable block of
// 0 bytes.
VYN_API void* GlobalLock(HGLOBAL block);
// Lowers a movable block's lock count; nonzero while it is still locked. 0 with the last error
// cleared when the count reaches 0, and 0 with ERROR_NOT_LOCKED for a block that was not locked.
// A fixed block has no lock count: TRUE.
VYN_API BOOL GlobalUnlock(HGLOBAL block);
// Frees a block, locked or not: null on success (also for a null handle), the handle again
// with ERROR_INVALID_HANDLE for an unknown one.
VYN_API HGLOBAL GlobalFree(HGLOBAL block);
// The block's size in bytes as last asked for, 0 for a null handle or a discarded block.
VYN_API SIZE_T GlobalSize(HGLOBAL block);

}  // namespace win32
