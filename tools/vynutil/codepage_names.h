#pragma once
// Code pages as the tool's options name them: a decimal number or a name. This is the tool's one
// table of code-page names.

#include <optional>
#include <span>
#include <string_view>

#include "vynutil/wintypes.h"

namespace vyntool {

struct CodePageName {
  std::string_view name;
  UINT codepage;
};

// The names the tool knows, in the order its help lists them.
std::span<const CodePageName> CodePageNames();

// The code page that text names: a decimal number, a name of CodePageNames(), or "cpN",
// "windows-N", "ibmN" for code page N. Names ignore case and take '_' for '-'. The pseudo code
// pages (0 active, 1 OEM, 2 Macintosh, 3 thread) are resolved to the process's real ones.
// std::nullopt when text names nothing, or a code page this platform cannot convert; UTF-16
// (65012) and UTF-32 (65014) are accepted as raw little-endian units.
std::optional<UINT> ParseCodePage(std::string_view text);

}  // namespace vyntool
