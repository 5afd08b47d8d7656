// File-name masks: '*' and '?' without regard to case, and the DOS habits of ".*" and "*.".

#include "file_name_mask.h"

#include "win32/crt_ctype.h"

namespace win32::detail {

namespace {

bool SameLetter(char16_t a, char16_t b) { return a == b || towupper(a) == towupper(b); }

// '*' and '?' alone: one pass that goes back only to the last star.
bool MatchesWildcards(std::u16string_view name, std::u16string_view mask) {
  std::size_t n = 0, m = 0;
  std::size_t starMask = std::u16string_view::npos, starName = 0;
  while (n < name.size()) {
    if (m < mask.size() && (mask[m] == u'?' || (mask[m] != u'*' && SameLetter(mask[m], name[n])))) {
      ++n;
      ++m;
    } else if (m < mask.size() && mask[m] == u'*') {
      starMask = m++;
      starName = n;
    } else if (starMask != std::u16string_view::npos) {
      m = starMask + 1;
      n = ++starName;
    } else {
      return false;
    }
  }
  while (m < mask.size() && mask[m] == u'*') ++m;
  return m == mask.size();
}

}  // namespace

bool MatchesFileMask(std::u16string_view name, std::u16string_view mask) {
  if (mask == u"*.*" || mask == u"*") return true;
  if (MatchesWildcards(name, mask)) return true;
  if (mask.size() > 2 && mask.ends_with(u".*")) {
    // "a.*" also finds "a": the extension may be absent altogether.
    return name.find(u'.') == std::u16string_view::npos &&
           MatchesWildcards(name, mask.substr(0, mask.size() - 2));
  }
  if (mask.size() > 1 && mask.back() == u'.' && mask != u"..") {
    return name.find(u'.') == std::u16string_view::npos &&
           MatchesWildcards(name, mask.substr(0, mask.size() - 1));
  }
  return false;
}

}  // namespace win32::detail
