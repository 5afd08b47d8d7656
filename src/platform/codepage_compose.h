#pragma once
// The composition flags of the Win32 conversions: MB_COMPOSITE (decomposed output) and
// WC_COMPOSITECHECK (a base character and a nonspacing mark written as one precomposed character
// where the code page has it).

#include <cstddef>
#include <string>

#include "codepage_codec.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

// The canonical decomposition of s[0, n) into out; capacity 0 measures.
ConvResult Decompose(const char16_t* s, std::size_t n, char16_t* out, std::size_t capacity);

// s[0, n) prepared for WC_COMPOSITECHECK: each base character followed by a nonspacing mark is
// replaced by the precomposed character when the codec converts it; otherwise WC_DISCARDNS drops
// the mark, WC_DEFAULTCHAR replaces the pair by U+FFFF (which becomes the default character),
// and WC_SEPCHARS (the default) keeps both.
std::u16string ComposeForCodePage(const char16_t* s, std::size_t n, const Codec& codec, DWORD flags,
                                  bool noBestFit);

}  // namespace win32::detail
