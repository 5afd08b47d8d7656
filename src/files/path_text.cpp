#include "files/path_text.h"

#include "vynutil/symbol_manager.h"
#include "win32/crt_ctype.h"

namespace vyn::path_text {
namespace {

constexpr char16_t kBackslash = u'\\';

}  // namespace

bool HasDrivePrefix(const std::u16string& text) {
  return text.size() >= 2 && win32::iswalpha(text[0]) && text[1] == u':';
}

bool IsRootedAtBackslash(const std::u16string& text) {
  return !text.empty() && text[0] == kBackslash && (text.size() == 1 || text[1] != kBackslash);
}

std::size_t RootLength(const std::u16string& text) {
  if (text.size() >= 2 && text[0] == kBackslash && text[1] == kBackslash) {
    const std::size_t separator = text.find(kBackslash, 2);
    return separator == std::u16string::npos ? text.size() : separator;
  }
  if (HasDrivePrefix(text) && text.size() >= 3 && text[2] == kBackslash) return 3;
  if (IsRootedAtBackslash(text)) return 1;
  return 0;
}

void ForwardSlashesToBackslashes(std::u16string& text) {
  for (char16_t& c : text) {
    if (c == u'/') c = kBackslash;
  }
}

void CollapseBackslashes(std::u16string& text) {
  if (text.size() < 3) return;
  // Compacts in place; text[in - 1] still holds the original character when it is read.
  std::size_t out = 3;
  for (std::size_t in = 3; in < text.size(); ++in) {
    if (text[in] == kBackslash && text[in - 1] == kBackslash) continue;
    text[out++] = text[in];
  }
  text.resize(out);
}

void RemoveDotComponents(std::u16string& text) {
  if (text == u".") {
    text.clear();
    return;
  }
  std::size_t i = 0;
  while (i < text.size()) {
    if (text[i] != u'.') {
      ++i;
      continue;
    }
    const bool afterBackslash = i > 0 && text[i - 1] == kBackslash;
    const bool last = i + 1 == text.size();
    if (i == 0 && !last && text[1] == kBackslash) {
      text.erase(0, 2);  // ".\a" → "a"
    } else if (last && afterBackslash) {
      text.erase(i - 1, 2);  // "a\." → "a"
    } else if (afterBackslash && !last && text[i + 1] == kBackslash) {
      text.erase(i, 2);  // "a\.\b" → "a\b"
    } else {
      while (i < text.size() && text[i] == u'.') ++i;  // a name with dots, "..", "..."
    }
  }
}

void FoldDotDotComponents(std::u16string& text) {
  const std::size_t root = RootLength(text);
  std::size_t position = 0;
  for (;;) {
    const std::size_t p = text.find(u"\\..", position);
    if (p == std::u16string::npos) return;
    const std::size_t end = p + 3;
    const bool wholeComponent = end == text.size() || text[end] == kBackslash;
    const std::u16string_view before = std::u16string_view(text).substr(0, p);
    const bool leadingUp = before == u"." || before == u"..";
    const bool afterUp = p >= 3 && std::u16string_view(text).substr(p - 3, 3) == u"\\..";
    if (!wholeComponent || leadingUp || afterUp) {
      position = end;
      continue;
    }
    // The parent component starts after the last separator before it, never inside the root.
    std::size_t start = root;
    const std::size_t separator = p == 0 ? std::u16string::npos : text.rfind(kBackslash, p - 1);
    if (separator != std::u16string::npos && separator + 1 > start) start = separator + 1;
    // No parent between the root and ".." (as in "\\srv\..\a"): only ".." and its separator go.
    if (start == p) start = p + 1;
    const std::size_t spanEnd = end < text.size() ? end + 1 : end;  // with the following separator
    if (start > end || HoldsSymbol(text.substr(start, spanEnd - start))) {
      position = end;
      continue;
    }
    text.erase(start, spanEnd - start);
    position = start > 0 ? start - 1 : 0;
  }
}

bool HoldsSymbol(const std::u16string& text) { return TSymbolString(text).HasSymbols(); }

}  // namespace vyn::path_text
