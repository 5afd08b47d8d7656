// GetCurrentDirectoryW and GetFullPathNameW: the working folder in Windows form, and Windows'
// rules for making a path full, applied to text.

#include "win32/full_path.h"

#include <algorithm>
#include <cerrno>
#include <string>
#include <string_view>
#include <vector>

#include "syscalls.h"
#include "utf_strings.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

// The working folder with backslashes, or nothing with the last error set.
bool CurrentFolderText(std::u16string* folder) {
  std::string buffer(256, '\0');
  while (sys::Syscalls().getcwd(buffer.data(), buffer.size()) == nullptr) {
    if (errno != ERANGE) {
      SetLastError(ErrorFromErrno(errno));
      return false;
    }
    buffer.resize(buffer.size() * 2);
  }
  buffer.resize(buffer.find('\0'));
  *folder = detail::Utf16Of(buffer);
  std::replace(folder->begin(), folder->end(), u'/', u'\\');
  return true;
}

// Copies text into a caller's buffer by the size rules of the Win32 path queries.
DWORD CopyOut(const std::u16string& text, DWORD size, LPWSTR buffer) {
  if (buffer == nullptr || text.size() + 1 > size) return static_cast<DWORD>(text.size() + 1);
  std::copy(text.begin(), text.end(), buffer);
  buffer[text.size()] = 0;
  return static_cast<DWORD>(text.size());
}

// The root of a path with backslashes: "\\server\share" (or "\\server"), "X:\", "\"; the rest
// of the text after it goes to *rest. A drive-relative "X:name" counts as "X:\name".
std::u16string SplitRoot(std::u16string_view path, std::u16string_view* rest) {
  if (path.starts_with(u"\\\\")) {
    std::size_t end = path.find(u'\\', 2);
    if (end != std::u16string_view::npos) end = path.find(u'\\', end + 1);
    if (end == std::u16string_view::npos) end = path.size();
    *rest = path.substr(end);
    return std::u16string(path.substr(0, end));
  }
  if (path.size() >= 2 && path[1] == u':') {
    *rest = path.substr(path.size() > 2 && path[2] == u'\\' ? 3 : 2);
    return std::u16string(path.substr(0, 2)) + u'\\';
  }
  *rest = path.substr(1);
  return u"\\";
}

// rest's components with "." gone and ".." applied, never above the root.
std::vector<std::u16string_view> Fold(std::u16string_view rest) {
  std::vector<std::u16string_view> parts;
  std::size_t start = 0;
  while (start <= rest.size()) {
    std::size_t end = rest.find(u'\\', start);
    if (end == std::u16string_view::npos) end = rest.size();
    const std::u16string_view part = rest.substr(start, end - start);
    if (part == u"..") {
      if (!parts.empty()) parts.pop_back();
    } else if (!part.empty() && part != u".") {
      parts.push_back(part);
    }
    start = end + 1;
  }
  return parts;
}

std::u16string FullPath(std::u16string path, bool* failed) {
  std::replace(path.begin(), path.end(), u'/', u'\\');
  const bool rooted = path.starts_with(u"\\") || (path.size() >= 2 && path[1] == u':');
  if (!rooted) {
    std::u16string folder;
    if (!CurrentFolderText(&folder)) {
      *failed = true;
      return {};
    }
    path = folder + u'\\' + path;
  }
  std::u16string_view rest;
  std::u16string result = SplitRoot(path, &rest);
  const bool finalSeparator = !rest.empty() && rest.back() == u'\\';
  std::vector<std::u16string_view> parts = Fold(rest);
  std::u16string last;
  if (!parts.empty() && !finalSeparator) {
    // Windows drops trailing dots and spaces of the last name ("a.txt. " is "a.txt").
    std::u16string_view name = parts.back();
    while (!name.empty() && (name.back() == u'.' || name.back() == u' ')) name.remove_suffix(1);
    parts.pop_back();
    last = name;
  }
  for (std::u16string_view part : parts) {
    if (result.back() != u'\\') result += u'\\';
    result.append(part);
  }
  if (!last.empty()) {
    if (result.back() != u'\\') result += u'\\';
    result += last;
  }
  if (finalSeparator && result.back() != u'\\') result += u'\\';
  return result;
}

}  // namespace

DWORD GetCurrentDirectoryW(DWORD nBufferLength, LPWSTR lpBuffer) {
  std::u16string folder;
  if (!CurrentFolderText(&folder)) return 0;
  return CopyOut(folder, nBufferLength, lpBuffer);
}

DWORD GetFullPathNameW(LPCWSTR lpFileName, DWORD nBufferLength, LPWSTR lpBuffer,
                       LPWSTR* lpFilePart) {
  if (lpFilePart != nullptr) *lpFilePart = nullptr;
  if (lpFileName == nullptr || lpFileName[0] == 0) {
    SetLastError(lpFileName == nullptr ? ERROR_INVALID_PARAMETER : ERROR_INVALID_NAME);
    return 0;
  }
  bool failed = false;
  const std::u16string_view name = lpFileName;
  const std::u16string full = name.starts_with(u"\\\\?\\") ? std::u16string(name)
                                                           : FullPath(std::u16string(name), &failed);
  if (failed) return 0;
  const DWORD result = CopyOut(full, nBufferLength, lpBuffer);
  if (result == full.size() && lpFilePart != nullptr && full.back() != u'\\') {
    *lpFilePart = lpBuffer + full.rfind(u'\\') + 1;
  }
  return result;
}

}  // namespace win32
