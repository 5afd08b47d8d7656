#pragma once
// Upper- and lower-case mapping of text in the three string encodings, a character at a time.
//
// Each character is given its simple Unicode case mapping (one character to one character; a
// surrogate pair and a double-byte character count as one), the mapping the platform's towlower
// and towupper give under the user locale. A character whose mapping would take another number
// of units in its encoding is left as it is, so text mapped in place keeps its length. UTF-8
// text is mapped through UTF-16 and may change its byte length.
//
// For UTF-16 this is what the runtime's _wcslwr_s / _wcsupr_s (and the _wcslwr_s_l / _wcsupr_s_l
// forms) do. Narrow text is mapped as _mbslwr_s_l / _mbsupr_s_l map it, a double-byte character
// as a whole, also in code pages without a language locale, where _strlwr_s / _strupr_s would
// take each byte as a character and fold the ASCII trail bytes of double-byte characters.

#include <cstddef>
#include <string>

#include "strings/str_characters.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util::StrClass {

enum class CaseMapping { kLower, kUpper };

// Maps n UTF-16 units in place.
void MapCaseUtf16(MCHAR* units, std::size_t n, CaseMapping mapping) noexcept;

// Zero-terminated UTF-8 text mapped through UTF-16; malformed bytes come back as U+FFFD.
std::string MapCaseUtf8(const char* text, CaseMapping mapping);

// Writes the mapping of the narrow character of n bytes (1 or 2) at in, in chars' code page, to
// out (n bytes; in and out may be the same). A character the code page cannot hold mapped in n
// bytes is written unchanged.
void MapNarrowCharacter(const NarrowCharacters& chars, const char* in, std::size_t n, CaseMapping mapping,
                        char* out);

// Maps zero-terminated narrow text in chars' code page in place.
void MapCaseNarrow(const NarrowCharacters& chars, char* text, CaseMapping mapping);

}  // namespace VynSDK::Util::StrClass
