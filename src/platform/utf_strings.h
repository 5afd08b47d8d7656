#pragma once
// UTF-8 and UTF-16 strings converted whole, for the layer's own calls into the system: POSIX
// names, paths and environment values are UTF-8, the Win32 side is UTF-16. Invalid input follows
// the Windows replacement rules of win32::text (U+FFFD).

#include <string>
#include <string_view>

#include "vynutil/wintypes.h"

namespace win32::detail {

std::string Utf8Of(std::u16string_view text);
std::u16string Utf16Of(std::string_view text);

}  // namespace win32::detail
