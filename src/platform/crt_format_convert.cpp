// Code-page conversion of %s/%S/%c/%C arguments whose kind differs from the format's, through
// the platform's MultiByteToWideChar and WideCharToMultiByte.

#include "crt_format_convert.h"

#include <climits>

#include "vynutil/codepages.h"
#include "win32/codepage.h"

namespace win32::detail {

namespace {

bool IsContinuationByte(char c) { return (static_cast<unsigned char>(c) & 0xC0) == 0x80; }
bool IsHighSurrogate(MCHAR c) { return c >= 0xD800 && c <= 0xDBFF; }

// Flags and used-default report for encoding: UTF-8 takes neither and refuses lone surrogates;
// the "C" character type takes no best fit.
DWORD EncodeFlags(const FormatLocale& locale, UINT codePage) {
  if (codePage == CP_UTF8) return WC_ERR_INVALID_CHARS;
  return locale.StrictEncoding() ? WC_NO_BEST_FIT_CHARS : 0;
}

int Encode(const FormatLocale& locale, const MCHAR* s, int n, char* out, int capacity, bool* ok) {
  const UINT codePage = locale.CodePage();
  BOOL usedDefault = FALSE;
  const int bytes = WideCharToMultiByte(codePage, EncodeFlags(locale, codePage), s, n, out, capacity,
                                        nullptr, codePage == CP_UTF8 ? nullptr : &usedDefault);
  *ok = bytes > 0 && !usedDefault;
  return bytes;
}

}  // namespace

std::size_t WholeCharacterBytes(const FormatLocale& locale, const char* s, std::size_t n) noexcept {
  const UINT codePage = locale.CodePage();
  if (codePage == CP_UTF8) {
    if (!IsContinuationByte(s[n])) return n;
    while (n > 0 && IsContinuationByte(s[n])) --n;
    return n;  // now the start of the character the cut split
  }
  std::size_t i = 0;
  while (i < n) i += IsDBCSLeadByteEx(codePage, static_cast<BYTE>(s[i])) ? 2 : 1;
  return i > n ? i - 2 : n;
}

std::size_t WholeCharacterUnits(const MCHAR* s, std::size_t n) noexcept {
  return n > 0 && IsHighSurrogate(s[n - 1]) ? n - 1 : n;
}

long long WideLengthOfNarrow(const FormatLocale& locale, const char* s, std::size_t n) noexcept {
  if (n == 0) return 0;
  if (n > INT_MAX) return -1;
  const int units =
      MultiByteToWideChar(locale.CodePage(), MB_ERR_INVALID_CHARS, s, static_cast<int>(n), nullptr, 0);
  return units > 0 ? units : -1;
}

void NarrowToWide(const FormatLocale& locale, const char* s, std::size_t n, MCHAR* out,
                  std::size_t units) noexcept {
  if (n == 0) return;
  MultiByteToWideChar(locale.CodePage(), MB_ERR_INVALID_CHARS, s, static_cast<int>(n), out,
                      static_cast<int>(units));
}

long long NarrowLengthOfWide(const FormatLocale& locale, const MCHAR* s, std::size_t n) noexcept {
  if (n == 0) return 0;
  if (n > INT_MAX) return -1;
  bool ok = false;
  const int bytes = Encode(locale, s, static_cast<int>(n), nullptr, 0, &ok);
  return ok ? bytes : -1;
}

void WideToNarrow(const FormatLocale& locale, const MCHAR* s, std::size_t n, char* out,
                  std::size_t bytes) noexcept {
  if (n == 0) return;
  bool ok = false;
  Encode(locale, s, static_cast<int>(n), out, static_cast<int>(bytes), &ok);
}

bool NarrowCharToWide(const FormatLocale& locale, char c, MCHAR* out) noexcept {
  return MultiByteToWideChar(locale.CodePage(), MB_ERR_INVALID_CHARS, &c, 1, out, 1) == 1;
}

int WideCharToNarrow(const FormatLocale& locale, MCHAR c, char* out) noexcept {
  bool ok = false;
  const int bytes = Encode(locale, &c, 1, out, 4, &ok);
  return ok ? bytes : 0;
}

}  // namespace win32::detail
