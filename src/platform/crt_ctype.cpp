// Wide-character classification and case mapping with the Windows runtime's answers, from the
// Unicode character database that ICU carries.

#include "win32/crt_ctype.h"

#include <unicode/uchar.h>

namespace win32 {

namespace {

constexpr std::uint32_t kLastCodePoint = 0x10FFFF;

std::uint32_t CategoryMask(std::uint32_t c) {
  if (c > kLastCodePoint) return 0;
  return U_MASK(u_charType(static_cast<UChar32>(c)));
}

// The ASCII and Latin-1 symbols that Windows types as punctuation as well.
bool IsLatin1PunctuationSymbol(std::uint32_t c) {
  switch (c) {
    case 0x24: case 0x2B: case 0x3C: case 0x3D: case 0x3E: case 0x5E: case 0x60: case 0x7C:
    case 0x7E: case 0xD7: case 0xF7:
      return true;
    default:
      return c >= 0xA2 && c <= 0xBE;
  }
}

// Superscript one, two and three: digits to Windows, "other numbers" to Unicode.
bool IsLatin1SuperscriptDigit(std::uint32_t c) { return c == 0xB2 || c == 0xB3 || c == 0xB9; }

}  // namespace

int iswalpha(std::uint32_t c) noexcept { return (CategoryMask(c) & (U_GC_L_MASK | U_GC_NL_MASK)) != 0; }

int iswdigit(std::uint32_t c) noexcept {
  return (CategoryMask(c) & U_GC_ND_MASK) != 0 || IsLatin1SuperscriptDigit(c);
}

int iswalnum(std::uint32_t c) noexcept { return iswalpha(c) || iswdigit(c); }

int iswpunct(std::uint32_t c) noexcept {
  return (CategoryMask(c) & U_GC_P_MASK) != 0 || IsLatin1PunctuationSymbol(c);
}

int iswspace(std::uint32_t c) noexcept {
  return (CategoryMask(c) & U_GC_Z_MASK) != 0 || (c >= 0x09 && c <= 0x0D) || c == 0x85;
}

std::uint32_t towupper(std::uint32_t c) noexcept {
  if (c > kLastCodePoint) return c;
  return static_cast<std::uint32_t>(u_toupper(static_cast<UChar32>(c)));
}

std::uint32_t towlower(std::uint32_t c) noexcept {
  if (c > kLastCodePoint) return c;
  return static_cast<std::uint32_t>(u_tolower(static_cast<UChar32>(c)));
}

}  // namespace win32
