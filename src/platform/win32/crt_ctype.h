#pragma once
// The C runtime's wide-character classification and case mapping, with the answers the Windows
// runtime gives.
//
// Windows classifies a wide character by the CT_CTYPE1 types of GetStringTypeW (its own table for
// U+0000-U+00FF holds the same types), which follow the Unicode general category:
// - alphabetic: letters of every script (categories Lu, Ll, Lt, Lm, Lo) and letter numbers (Nl);
//   combining marks are not;
// - digit: decimal digits of every script (Nd), and the Latin-1 superscripts U+00B2, U+00B3 and
//   U+00B9;
// - punctuation: punctuation (P*) and the ASCII and Latin-1 symbols $ + < = > ^ ` | ~,
//   U+00A2-U+00BE, U+00D7 and U+00F7; symbols beyond Latin-1 (Sm, Sc, Sk, So) are not;
// - space: separators (Zs, Zl, Zp), U+0009-U+000D and U+0085;
// - alphanumeric: alphabetic or digit.
// Case mapping is the simple Unicode mapping of one character to one character, as under the user
// locale that the library establishes when it is loaded.
//
// Windows' wint_t is 16 bits wide. These functions take a whole code point, so characters beyond
// U+FFFF are classified and mapped as themselves. Values that stand for no character (surrogate
// code points, values beyond U+10FFFF) are in no class and map to themselves.

#include <cstdint>

#include "vynutil/export.h"

namespace win32 {

// Nonzero when c is in the class, 0 otherwise.
VYN_API int iswalpha(std::uint32_t c) noexcept;
VYN_API int iswalnum(std::uint32_t c) noexcept;
VYN_API int iswdigit(std::uint32_t c) noexcept;
VYN_API int iswpunct(std::uint32_t c) noexcept;
VYN_API int iswspace(std::uint32_t c) noexcept;

// The simple upper- / lower-case mapping of c; c itself when it has none.
VYN_API std::uint32_t towupper(std::uint32_t c) noexcept;
VYN_API std::uint32_t towlower(std::uint32_t c) noexcept;

}  // namespace win32
