// CStr, WStr and UTF8Str: language characters, the whole characters of the text as a reader
// sees them (a surrogate pair, a double-byte character of the narrow code page, a UTF-8
// sequence): counting them, cutting a run of them out, and finding their byte positions.

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

template <class Text>
int CharacterCount(const typename Text::Unit* buf) {
  if (!buf) return 0;
  const std::size_t count = CountCharacters(Text::Characters(), buf);
  return static_cast<int>(std::min<std::size_t>(count, INT_MAX));
}

// count characters from character firstChar in a new block (a counted reference); null when
// firstChar is negative or not below the character count, or count is below 1.
template <class Text>
typename Text::Unit* CharacterRun(const typename Text::Unit* buf, int firstChar, int count) {
  if (!buf || firstChar < 0 || count < 1) return nullptr;
  const auto chars = Text::Characters();
  const std::size_t begin = SkipCharacters(chars, buf, static_cast<std::size_t>(firstChar));
  if (buf[begin] == 0) return nullptr;
  const std::size_t end = begin + SkipCharacters(chars, buf + begin, static_cast<std::size_t>(count));
  return StrCore<Text>::NewText(buf + begin, end - begin);
}

template <class Text>
int FirstByteIndex(const typename Text::Unit* buf, int charIndex) {
  if (!buf) return -1;
  if (charIndex < 1) return 0;
  return StrCore<Text>::IntIndex(SkipCharacters(Text::Characters(), buf, static_cast<std::size_t>(charIndex)));
}

// The last byte of the character: never beyond the text, so a character cut short by the end
// of the text ends at its last byte present.
template <class Text>
int LastByteIndex(const typename Text::Unit* buf, int charIndex) {
  if (!buf) return -1;
  const auto chars = Text::Characters();
  const std::size_t first = charIndex < 1 ? 0 : SkipCharacters(chars, buf, static_cast<std::size_t>(charIndex));
  const std::size_t length = chars.Length(buf + first);
  return StrCore<Text>::IntIndex(length == 0 ? first : first + length - 1);
}

}  // namespace

// ---- WStr -----------------------------------------------------------------------------------

int WStr::LanguageCharacterCount() const { return CharacterCount<WideText>(buf); }
WStr WStr::MultiByteCharacterSubString(int firstChar, int count) const {
  WStr result;
  result.buf = CharacterRun<WideText>(buf, firstChar, count);
  return result;
}

// ---- CStr -----------------------------------------------------------------------------------

int CStr::LanguageCharacterCount() const { return CharacterCount<NarrowText>(buf); }
CStr CStr::MultiByteCharacterSubString(int firstChar, int count) const {
  CStr result;
  result.buf = CharacterRun<NarrowText>(buf, firstChar, count);
  return result;
}
int CStr::FindMultiByteCharacterFirstByteIndex(int charIndex) const { return FirstByteIndex<NarrowText>(buf, charIndex); }
int CStr::FindMultiByteCharacterLastByteIndex(int charIndex) const { return LastByteIndex<NarrowText>(buf, charIndex); }

// ---- UTF8Str --------------------------------------------------------------------------------

// Counts decoded characters up to the terminator byte (a character that decodes to 0, such as
// the overlong C0 80, is counted like any other).
int UTF8Str::LanguageCharacterCount() const {
  if (!buf) return 0;
  int count = 0;
  for (int index = 0; buf[index] != 0 && count < INT_MAX; ++count) utf8_nextchar(&index);
  return count;
}
UTF8Str UTF8Str::MultiByteCharacterSubString(int firstChar, int count) const {
  UTF8Str result;
  result.buf = CharacterRun<Utf8Text>(buf, firstChar, count);
  return result;
}
int UTF8Str::FindMultiByteCharacterFirstByteIndex(int charIndex) const {
  return FirstByteIndex<Utf8Text>(buf, charIndex);
}
int UTF8Str::FindMultiByteCharacterLastByteIndex(int charIndex) const {
  return LastByteIndex<Utf8Text>(buf, charIndex);
}

unsigned int UTF8Str::utf8_nextchar(int* byteIndex) const {
  if (!buf || !byteIndex || *byteIndex < 0) return 0;
  const char* p = buf + *byteIndex;
  const std::size_t n = Utf8Characters().Length(p);
  if (n == 0) return 0;
  *byteIndex += static_cast<int>(n);
  return Utf8Characters::Decode(p, n);
}
