#pragma once
// The small text rules of profile files shared by the parser, the lookups and the writers: which
// characters are blanks, how names compare without regard to case, how values lose their quotes.
// Everything works on views; nothing here allocates.

#include <cstdint>
#include <string_view>

#include "vynutil/wintypes.h"

namespace win32::detail::profile {

using Text = std::u16string_view;

// Blanks around names and values: space, tab and vertical tab. Line breaks never reach here.
constexpr bool IsBlank(char16_t c) { return c == u' ' || c == u'\t' || c == u'\v'; }

Text TrimBlanks(Text text);
Text TrimTrailingSpaces(Text text);  // the default value loses trailing spaces only

// The unit names are compared by: the simple upper-case mapping of one UTF-16 unit (surrogates
// and units whose upper case lies beyond U+FFFF stay as they are).
char16_t FoldUnit(char16_t unit);

// A hash of the folded units: names that compare equal hash equally.
std::uint32_t FoldedHash(Text name);
bool EqualFolded(Text a, Text b);

// The value without one pair of matching surrounding quotes: "x" and 'x' give x, "x' stays.
Text StripQuotes(Text value);

// A null-terminated argument as a view (empty for null).
Text ArgumentText(const MCHAR* text);

}  // namespace win32::detail::profile
