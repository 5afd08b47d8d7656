#pragma once
// Narrow argument text in wide output and wide argument text in narrow output, converted with
// the formatting locale's code page as the runtime's mbtowc and wctomb do: multi-byte text that
// is not valid in the code page, and wide text the code page cannot hold (best fit allowed,
// except in the "C" character type), do not convert.

#include <cstddef>

#include "crt_format_locale.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

// The first bytes of s[0..n) that end on a character boundary, for a precision that cuts text
// (a character split by the cut is left out). s[n] must be readable.
std::size_t WholeCharacterBytes(const FormatLocale& locale, const char* s, std::size_t n) noexcept;
// The same for UTF-16 units: a high surrogate whose pair the cut separated is left out.
std::size_t WholeCharacterUnits(const MCHAR* s, std::size_t n) noexcept;

// UTF-16 units that n bytes of narrow text become; -1 when they do not convert.
long long WideLengthOfNarrow(const FormatLocale& locale, const char* s, std::size_t n) noexcept;
// Converts n bytes into exactly `units` units (the length above).
void NarrowToWide(const FormatLocale& locale, const char* s, std::size_t n, MCHAR* out,
                  std::size_t units) noexcept;

// Bytes that n units of wide text become; -1 when they do not convert.
long long NarrowLengthOfWide(const FormatLocale& locale, const MCHAR* s, std::size_t n) noexcept;
// Converts n units into exactly `bytes` bytes (the length above).
void WideToNarrow(const FormatLocale& locale, const MCHAR* s, std::size_t n, char* out,
                  std::size_t bytes) noexcept;

// One narrow character (%C in a wide format); false when it is not a whole character.
bool NarrowCharToWide(const FormatLocale& locale, char c, MCHAR* out) noexcept;
// One wide character (%C in a narrow format) into out (room for 4 bytes); the bytes written,
// 0 when the code page cannot hold it.
int WideCharToNarrow(const FormatLocale& locale, MCHAR c, char* out) noexcept;

}  // namespace win32::detail
