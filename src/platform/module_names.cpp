// Module name rules.

#include "module_names.h"

#include "win32/crt_string.h"

namespace win32::detail {

namespace {

bool IsSeparator(MCHAR c) { return c == u'\\' || c == u'/'; }

std::size_t LastComponentStart(std::u16string_view name) {
  for (std::size_t i = name.size(); i > 0; --i) {
    if (IsSeparator(name[i - 1]) || (i == 2 && name[1] == u':')) return i;
  }
  return 0;
}

}  // namespace

std::u16string WithDefaultExtension(std::u16string_view name) {
  std::u16string result(name);
  const std::u16string_view last = name.substr(LastComponentStart(name));
  if (last.empty()) return result;
  if (last.back() == u'.') {
    result.pop_back();
  } else if (last.find(u'.') == std::u16string_view::npos) {
    result += u".dll";
  }
  return result;
}

bool HasFolderPart(std::u16string_view name) { return LastComponentStart(name) != 0; }

bool SameModuleName(std::u16string_view a, std::u16string_view b) {
  return a.size() == b.size() && _wcsnicmp(a.data(), b.data(), a.size()) == 0;
}

std::string_view BaseName(std::string_view path) {
  const std::size_t slash = path.rfind('/');
  return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

}  // namespace win32::detail
