// The shlwapi path tests: PathIsUNCW, PathIsUNCServerShareW, PathIsRootW, PathIsRelativeW and
// PathRelativePathToW, on text alone.

#include "win32/shell_path.h"

#include <algorithm>
#include <string>
#include <string_view>

#include "win32/crt_ctype.h"

namespace win32 {

namespace {

bool StartsWithTwoBackslashes(std::u16string_view text) {
  return text.size() >= 2 && text[0] == u'\\' && text[1] == u'\\';
}

bool SameLetter(char16_t a, char16_t b) { return a == b || towlower(a) == towlower(b); }

bool StartsWithNoCase(std::u16string_view text, std::u16string_view prefix) {
  return text.size() >= prefix.size() &&
         std::equal(prefix.begin(), prefix.end(), text.begin(), SameLetter);
}

bool IsUnc(std::u16string_view text) {
  if (!StartsWithTwoBackslashes(text)) return false;
  return text.size() < 3 || text[2] != u'?' || StartsWithNoCase(text, u"\\\\?\\UNC\\");
}

bool IsBoundary(std::u16string_view text, std::size_t i) { return i == text.size() || text[i] == u'\\'; }

// The folder of a file path: the text before its last backslash, a root keeping its backslash.
std::u16string FolderOf(std::u16string_view path) {
  const std::size_t last = path.rfind(u'\\');
  if (last == std::u16string_view::npos) {
    return std::u16string(path.size() >= 2 && path[1] == u':' ? path.substr(0, 2) : u"");
  }
  if (last == 0 || (last == 1 && StartsWithTwoBackslashes(path))) {
    return std::u16string(path.substr(0, last + 1));
  }
  if (last == 2 && path[1] == u':') return std::u16string(path.substr(0, 3));
  return std::u16string(path.substr(0, last));
}

// The length of the common start of two paths that ends at a component boundary in both; 0
// when they share no root. UNC paths share a root only with UNC paths. A common "X:" counts as
// "X:\", as the shell counts it.
std::size_t CommonPrefixLength(std::u16string_view a, std::u16string_view b) {
  const bool unc = IsUnc(a);
  if (unc != IsUnc(b)) return 0;
  std::size_t common = 0;
  for (std::size_t i = unc ? 2 : 0;; ++i) {
    if (IsBoundary(a, i) && IsBoundary(b, i)) common = i;
    if (i == a.size() || i == b.size() || !SameLetter(a[i], b[i])) break;
  }
  return common == 2 ? 3 : common;
}

}  // namespace

BOOL PathIsUNCW(LPCWSTR pszPath) { return pszPath != nullptr && IsUnc(pszPath) ? TRUE : FALSE; }

BOOL PathIsUNCServerShareW(LPCWSTR pszPath) {
  if (pszPath == nullptr || !StartsWithTwoBackslashes(pszPath)) return FALSE;
  const std::u16string_view text = pszPath;
  return std::count(text.begin(), text.end(), u'\\') == 3 ? TRUE : FALSE;
}

BOOL PathIsRootW(LPCWSTR pszPath) {
  if (pszPath == nullptr || pszPath[0] == 0) return FALSE;
  const std::u16string_view text = pszPath;
  if (text.size() == 3 && text[1] == u':' && text[2] == u'\\') return TRUE;
  if (text == u"\\") return TRUE;
  if (!StartsWithTwoBackslashes(text)) return FALSE;
  // "\\server" or "\\server\share": at most one more backslash, and not at the end.
  int separators = 0;
  for (std::size_t i = 2; i < text.size(); ++i) {
    if (text[i] == u'\\' && (++separators > 1 || i + 1 == text.size())) return FALSE;
  }
  return TRUE;
}

BOOL PathIsRelativeW(LPCWSTR pszPath) {
  if (pszPath == nullptr || pszPath[0] == 0) return TRUE;
  if (pszPath[0] == u'\\' || pszPath[1] == u':') return FALSE;
  return TRUE;
}

BOOL PathRelativePathToW(LPWSTR pszPath, LPCWSTR pszFrom, DWORD dwAttrFrom, LPCWSTR pszTo,
                         DWORD dwAttrTo) {
  if (pszPath == nullptr) return FALSE;
  pszPath[0] = 0;
  if (pszFrom == nullptr || pszTo == nullptr) return FALSE;
  const std::u16string_view fromText = pszFrom, toText = pszTo;
  // Longer texts would be cut by the shell's fixed buffers and give a wrong answer.
  if (fromText.size() >= MAX_PATH || toText.size() >= MAX_PATH) return FALSE;
  const std::u16string from = (dwAttrFrom & FILE_ATTRIBUTE_DIRECTORY) != 0
                                  ? std::u16string(fromText) : FolderOf(fromText);
  const std::u16string to = (dwAttrTo & FILE_ATTRIBUTE_DIRECTORY) != 0
                                ? std::u16string(toText) : FolderOf(toText);
  const std::size_t common = CommonPrefixLength(from, to);
  if (common == 0) return FALSE;

  std::u16string result;
  std::u16string_view rest = std::u16string_view(from).substr(std::min(common, from.size()));
  if (rest.empty()) result.assign(1, u'.');
  if (!rest.empty() && rest.front() == u'\\') rest.remove_prefix(1);
  while (!rest.empty()) {
    const std::size_t separator = rest.find(u'\\');
    rest.remove_prefix(separator == std::u16string_view::npos ? rest.size() : separator + 1);
    result += rest.empty() ? u".." : u"..\\";
  }
  // The goal's own text (a file name included) continues from the common part.
  if (common < toText.size()) {
    result += toText.substr(toText[common] == u'\\' ? common : common - 1);
  }
  if (result.size() >= MAX_PATH) return FALSE;
  std::copy(result.begin(), result.end(), pszPath);
  pszPath[result.size()] = 0;
  return TRUE;
}

}  // namespace win32
