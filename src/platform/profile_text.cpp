// Blanks, case folding and quotes of profile names and values.

#include "profile_text.h"

#include "win32/crt_ctype.h"
#include "win32/crt_string.h"

namespace win32::detail::profile {

Text TrimBlanks(Text text) {
  std::size_t begin = 0;
  std::size_t end = text.size();
  while (begin < end && IsBlank(text[begin])) ++begin;
  while (end > begin && IsBlank(text[end - 1])) --end;
  return text.substr(begin, end - begin);
}

Text TrimTrailingSpaces(Text text) {
  std::size_t end = text.size();
  while (end > 0 && text[end - 1] == u' ') --end;
  return text.substr(0, end);
}

char16_t FoldUnit(char16_t unit) {
  if (unit < 0x80) return unit >= u'a' && unit <= u'z' ? static_cast<char16_t>(unit - 0x20) : unit;
  if (unit >= 0xD800 && unit <= 0xDFFF) return unit;
  const std::uint32_t upper = towupper(unit);
  return upper <= 0xFFFF ? static_cast<char16_t>(upper) : unit;
}

std::uint32_t FoldedHash(Text name) {
  // FNV-1a over the folded units, then a final mix so that the low bits (the table slot) depend
  // on every unit.
  std::uint32_t hash = 2166136261u;
  for (char16_t unit : name) {
    hash ^= FoldUnit(unit);
    hash *= 16777619u;
  }
  hash ^= hash >> 15;
  hash *= 0x2C1B3C6Du;
  hash ^= hash >> 12;
  return hash;
}

bool EqualFolded(Text a, Text b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (a[i] != b[i] && FoldUnit(a[i]) != FoldUnit(b[i])) return false;
  }
  return true;
}

Text StripQuotes(Text value) {
  if (value.size() >= 2 && (value.front() == u'"' || value.front() == u'\'') &&
      value.back() == value.front()) {
    return value.substr(1, value.size() - 2);
  }
  return value;
}

Text ArgumentText(const MCHAR* text) {
  return text != nullptr ? Text(text, wcslen(text)) : Text();
}

}  // namespace win32::detail::profile
