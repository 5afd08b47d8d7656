#pragma once
// Byte-to-byte conversion between two code pages through VynString.

#include <string>
#include <string_view>

#include "vynutil/wintypes.h"

namespace vyntool {

// Converts bytes of text in code page from to code page to (both real code pages, as
// ParseCodePage gives them; CP_UTF16 and CP_UTF32 stand for raw little-endian units).
// A VynString's text ends at its first zero unit, so the input is converted piece by piece
// between its zero units (0x00 bytes; 2-byte zeros for UTF-16, 4-byte zeros for UTF-32), and each
// zero unit is written as the zero unit of to: NUL characters pass through in place. Bytes left
// over after the last whole UTF-16 or UTF-32 unit become U+FFFD.
std::string Transcode(UINT from, UINT to, std::string_view bytes);

}  // namespace vyntool
