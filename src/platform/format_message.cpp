// FormatMessageW for system messages, and the local heap its buffers come from.

#include "win32/format_message.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "system_messages.h"
#include "win32/crt_string.h"
#include "win32/last_error.h"

namespace win32 {

DWORD FormatMessageW(DWORD dwFlags, const void* /*lpSource*/, DWORD dwMessageId,
                     DWORD /*dwLanguageId*/, MCHAR* lpBuffer, DWORD nSize,
                     va_list* /*Arguments*/) {
  if ((dwFlags & FORMAT_MESSAGE_FROM_SYSTEM) == 0 || (dwFlags & FORMAT_MESSAGE_FROM_STRING) != 0 ||
      lpBuffer == nullptr) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return 0;
  }
  const bool allocate = (dwFlags & FORMAT_MESSAGE_ALLOCATE_BUFFER) != 0;
  auto* allocated = reinterpret_cast<MCHAR**>(lpBuffer);
  if (allocate) *allocated = nullptr;

  const MCHAR* text = SystemMessageText(dwMessageId);
  if (text == nullptr) {
    SetLastError(ERROR_MR_MID_NOT_FOUND);
    return 0;
  }
  const std::size_t length = wcslen(text);
  MCHAR* out = lpBuffer;
  if (allocate) {
    const std::size_t units = std::max<std::size_t>(length + 1, nSize);
    out = static_cast<MCHAR*>(LocalAlloc(LMEM_FIXED, units * sizeof(MCHAR)));
    if (out == nullptr) {
      SetLastError(ERROR_NOT_ENOUGH_MEMORY);
      return 0;
    }
    *allocated = out;
  } else if (length + 1 > nSize) {
    SetLastError(ERROR_INSUFFICIENT_BUFFER);
    return 0;
  }
  std::memcpy(out, text, (length + 1) * sizeof(MCHAR));
  return static_cast<DWORD>(length);
}

HLOCAL LocalAlloc(UINT uFlags, SIZE_T uBytes) {
  if ((uFlags & ~LMEM_ZEROINIT) != 0) {
    // Movable blocks (handles to be locked) are not provided.
    SetLastError(ERROR_INVALID_PARAMETER);
    return nullptr;
  }
  const std::size_t bytes = std::max<std::size_t>(uBytes, 1);
  void* block = (uFlags & LMEM_ZEROINIT) != 0 ? std::calloc(1, bytes) : std::malloc(bytes);
  if (block == nullptr) SetLastError(ERROR_NOT_ENOUGH_MEMORY);
  return block;
}

HLOCAL LocalFree(HLOCAL hMem) {
  std::free(hMem);
  return nullptr;
}

}  // namespace win32
