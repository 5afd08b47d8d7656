#pragma once
// The code pages this platform layer converts, and what each one is made of: the ICU converter
// its tables come from, how it converts (table, UTF-8 or a stateful ICU converter), its lead
// bytes, and the bytes where Windows' tables differ from ICU's.

#include <cstddef>
#include <cstdint>
#include <span>

#include "vynutil/wintypes.h"

namespace win32::detail {

enum class CodePageKind : std::uint8_t {
  kSingleByte,  // one byte per character: 256-entry tables built from ICU
  kDoubleByte,  // lead and trail bytes (932, 936, 949, 950): tables built from ICU
  kUtf8,        // the library's own UTF-8 core
  kStateful,    // escape or shift sequences (ISO-2022, UTF-7): ICU converters, flags must be 0
};

// One byte whose Windows meaning differs from (or is missing in) ICU's table.
struct ByteOverride {
  std::uint8_t byte;
  char16_t unit;
};

struct CodePageEntry {
  UINT codePage;
  CodePageKind kind;
  const char* icuName;
  std::uint8_t maxCharSize;    // GetCPInfo's MaxCharSize
  bool oemGlyphs;              // MB_USEGLYPHCHARS maps the control bytes to the DOS glyphs
  char16_t unicodeDefault;     // what an undefined double-byte character converts to
  std::uint8_t leadRanges[6];  // inclusive lead-byte ranges as pairs, ended by a zero pair
  std::span<const ByteOverride> overrides;
  std::uint8_t slot;  // index of this entry, for the per-code-page caches
};

// The entry of a real code page number (no pseudo code pages), or null when the platform does
// not convert it.
const CodePageEntry* FindCodePage(UINT codePage) noexcept;

// Resolves CP_ACP, CP_OEMCP, CP_MACCP and CP_THREAD_ACP to the code page they stand for; other
// values come back unchanged.
UINT ResolvePseudoCodePage(UINT codePage) noexcept;

// FindCodePage(ResolvePseudoCodePage(codePage)).
const CodePageEntry* LookUpCodePage(UINT codePage) noexcept;

// True when the entry's lead-byte ranges contain b.
bool IsLeadByte(const CodePageEntry& entry, std::uint8_t b) noexcept;

}  // namespace win32::detail
