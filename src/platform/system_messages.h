#pragma once
// The system's message texts, as Windows' English message table has them.

#include "vynutil/wintypes.h"

namespace win32 {

// The text of a system error code, ending in "\r\n" and zero-terminated; null for a code without
// text. Inserts such as %1 are part of the text.
const MCHAR* SystemMessageText(DWORD code) noexcept;

}  // namespace win32
