// CStr, WStr and UTF8Str: StartsWith, EndsWith and CaseInsensitiveEqual.
//
// A part of the text matches when it holds the same units (exactly, or under the simple
// lower-case mapping when not case-sensitive) and starts and ends on character boundaries of the
// text, so that narrow text never matches half of a double-byte character. UTF-16 text compares
// as wcsncmp / _wcsnicmp do; narrow text is compared a character at a time rather than byte by
// byte as strncmp / _strnicmp would, which fold and match the ASCII trail bytes of double-byte
// characters.

#include <cstring>
#include <string>

#include "strings/case_mapping.h"
#include "strings/str_core.h"
#include "vynutil/strclass.h"
#include "win32/crt_string.h"

using namespace VynSDK::Util::StrClass;

namespace {

// How n units of two texts are found to be the same text, and the characters that bound a match.
template <class Text>
struct Matcher;

template <>
struct Matcher<WideText> {
  Utf16Characters chars;
  bool Same(const MCHAR* a, const MCHAR* b, std::size_t n, bool caseSensitive) const {
    return caseSensitive ? std::char_traits<MCHAR>::compare(a, b, n) == 0 : win32::_wcsnicmp(a, b, n) == 0;
  }
};

// Character by character: both texts must have their characters in the same places within the
// n bytes; a character matches another of its own bytes or, when not case-sensitive, one that
// maps to the same lower-case bytes.
template <>
struct Matcher<NarrowText> {
  NarrowCharacters chars = NarrowText::Characters();
  bool Same(const char* a, const char* b, std::size_t n, bool caseSensitive) const {
    for (std::size_t i = 0; i < n;) {
      const std::size_t len = chars.Length(a + i);
      if (len == 0 || len != chars.Length(b + i) || i + len > n) return false;
      if (std::memcmp(a + i, b + i, len) != 0) {
        if (caseSensitive) return false;
        char lowerA[2];
        char lowerB[2];
        MapNarrowCharacter(chars, a + i, len, CaseMapping::kLower, lowerA);
        MapNarrowCharacter(chars, b + i, len, CaseMapping::kLower, lowerB);
        if (std::memcmp(lowerA, lowerB, len) != 0) return false;
      }
      i += len;
    }
    return true;
  }
};

// UTF-8 text is compared byte by byte; UTF8Str upper-cases both texts for a case-insensitive
// comparison before it gets here.
template <>
struct Matcher<Utf8Text> {
  Utf8Characters chars;
  bool Same(const char* a, const char* b, std::size_t n, bool) const { return std::memcmp(a, b, n) == 0; }
};

template <class Text>
bool StartsWith(const typename Text::Unit* buf, const typename Text::Unit* s, bool caseSensitive) {
  using Core = StrCore<Text>;
  const auto* text = Core::Data(buf);
  const auto* prefix = Core::Data(s);
  if (*text == 0) return *prefix == 0;
  const std::size_t n = Core::Length(prefix);
  return Core::Length(text) >= n && Matcher<Text>().Same(text, prefix, n, caseSensitive);
}

template <class Text>
bool EndsWith(const typename Text::Unit* buf, const typename Text::Unit* s, bool caseSensitive) {
  using Core = StrCore<Text>;
  const auto* text = Core::Data(buf);
  const auto* suffix = Core::Data(s);
  if (*text == 0) return *suffix == 0;
  if (*suffix == 0) return false;
  const std::size_t length = Core::Length(text);
  const std::size_t n = Core::Length(suffix);
  if (length < n) return false;
  const Matcher<Text> matcher;
  return CharacterStarts(matcher.chars, text).IsStart(length - n) &&
         matcher.Same(text + (length - n), suffix, n, caseSensitive);
}

// The one-unit text c; an empty text starts and ends only with the zero unit, which no other
// text starts or ends with.
template <class Text, bool (*Affix)(const typename Text::Unit*, const typename Text::Unit*, bool)>
bool HasUnitAffix(const typename Text::Unit* buf, typename Text::Unit c, bool caseSensitive) {
  if (c == 0) return StrCore<Text>::IsEmpty(buf);
  const typename Text::Unit unit[2] = {c, 0};
  return Affix(buf, unit, caseSensitive);
}

template <class Text>
bool CaseInsensitiveEqual(const typename Text::Unit* buf, const typename Text::Unit* other) {
  using Core = StrCore<Text>;
  const std::size_t n = Core::Length(buf);
  return Core::Length(other) == n && Matcher<Text>().Same(Core::Data(buf), Core::Data(other), n, false);
}

// UTF8Str compares without case by upper-casing both texts through UTF-16; the byte lengths
// compared are those of the upper-cased texts.
template <bool (*Affix)(const char*, const char*, bool)>
bool Utf8Affix(const char* buf, const char* s, bool caseSensitive) {
  if (caseSensitive) return Affix(buf, s, true);
  const std::string text = MapCaseUtf8(Utf8Core::Data(buf), CaseMapping::kUpper);
  const std::string affix = MapCaseUtf8(Utf8Core::Data(s), CaseMapping::kUpper);
  return Affix(text.c_str(), affix.c_str(), true);
}

}  // namespace

// ---- WStr -----------------------------------------------------------------------------------

bool WStr::StartsWith(const WStr& s, bool caseSensitive) const {
  return ::StartsWith<WideText>(buf, s.buf, caseSensitive);
}
bool WStr::EndsWith(const WStr& s, bool caseSensitive) const {
  return ::EndsWith<WideText>(buf, s.buf, caseSensitive);
}
bool WStr::StartsWith(MCHAR c, bool caseSensitive) const {
  return HasUnitAffix<WideText, ::StartsWith<WideText>>(buf, c, caseSensitive);
}
bool WStr::EndsWith(MCHAR c, bool caseSensitive) const {
  return HasUnitAffix<WideText, ::EndsWith<WideText>>(buf, c, caseSensitive);
}
bool WStr::CaseInsensitiveEqual(const WStr& other) const { return ::CaseInsensitiveEqual<WideText>(buf, other.buf); }
bool WStr::CaseInsensitiveEqual(const MCHAR* other) const { return ::CaseInsensitiveEqual<WideText>(buf, other); }

// ---- CStr -----------------------------------------------------------------------------------

bool CStr::StartsWith(const CStr& s, bool caseSensitive) const {
  return ::StartsWith<NarrowText>(buf, s.buf, caseSensitive);
}
bool CStr::EndsWith(const CStr& s, bool caseSensitive) const {
  return ::EndsWith<NarrowText>(buf, s.buf, caseSensitive);
}
bool CStr::StartsWith(char c, bool caseSensitive) const {
  return HasUnitAffix<NarrowText, ::StartsWith<NarrowText>>(buf, c, caseSensitive);
}
bool CStr::EndsWith(char c, bool caseSensitive) const {
  return HasUnitAffix<NarrowText, ::EndsWith<NarrowText>>(buf, c, caseSensitive);
}
bool CStr::CaseInsensitiveEqual(const CStr& other) const { return ::CaseInsensitiveEqual<NarrowText>(buf, other.buf); }
bool CStr::CaseInsensitiveEqual(const char* other) const { return ::CaseInsensitiveEqual<NarrowText>(buf, other); }

// ---- UTF8Str --------------------------------------------------------------------------------

bool UTF8Str::StartsWith(const UTF8Str& s, bool caseSensitive) const {
  return Utf8Affix<::StartsWith<Utf8Text>>(buf, s.buf, caseSensitive);
}
bool UTF8Str::EndsWith(const UTF8Str& s, bool caseSensitive) const {
  return Utf8Affix<::EndsWith<Utf8Text>>(buf, s.buf, caseSensitive);
}
