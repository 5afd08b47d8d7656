// SearchPathW over GetFileAttributesW and GetFullPathNameW.

#include "win32/search_path.h"

#include <algorithm>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "utf_strings.h"
#include "win32/environment.h"
#include "win32/file_attributes.h"
#include "win32/full_path.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

bool IsSeparator(MCHAR unit) { return unit == u'\\' || unit == u'/'; }

// A name that says where it is: rooted, on a drive, or relative to "." or "..".
bool IsPlaced(std::u16string_view name) {
  if (IsSeparator(name[0]) || (name.size() >= 2 && name[1] == u':')) return true;
  for (std::u16string_view dots : {u".", u".."}) {
    if (name.size() > dots.size() && name.starts_with(dots) && IsSeparator(name[dots.size()])) return true;
  }
  return false;
}

bool HasExtension(std::u16string_view name) {
  std::size_t start = 0;
  for (std::size_t i = 0; i < name.size(); ++i) {
    if (IsSeparator(name[i])) start = i + 1;
  }
  return name.find(u'.', start) != std::u16string_view::npos;
}

// Non-empty entries of a list.
std::vector<std::u16string> Split(std::u16string_view list, MCHAR separator) {
  std::vector<std::u16string> entries;
  std::size_t start = 0;
  while (start <= list.size()) {
    const std::size_t end = std::min(list.find(separator, start), list.size());
    if (end > start) entries.emplace_back(list.substr(start, end - start));
    start = end + 1;
  }
  return entries;
}

// The folders searched for a name that does not say where it is; "" is the current folder.
std::vector<std::u16string> FoldersToSearch(LPCWSTR path) {
  if (path != nullptr) return Split(path, u';');
  std::vector<std::u16string> folders{u""};
  if (const std::optional<std::string> posixPath = detail::EnvironmentValue("PATH")) {
    for (std::u16string& folder : Split(detail::Utf16Of(*posixPath), u':')) folders.push_back(std::move(folder));
  }
  return folders;
}

std::u16string Join(const std::u16string& folder, std::u16string_view name) {
  if (folder.empty()) return std::u16string(name);
  return IsSeparator(folder.back()) ? folder + std::u16string(name) : folder + u'\\' + std::u16string(name);
}

}  // namespace

DWORD SearchPathW(LPCWSTR lpPath, LPCWSTR lpFileName, LPCWSTR lpExtension, DWORD nBufferLength,
                  LPWSTR lpBuffer, LPWSTR* lpFilePart) {
  if (lpFilePart != nullptr) *lpFilePart = nullptr;
  if (lpFileName == nullptr || lpFileName[0] == 0) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return 0;
  }
  std::u16string name = lpFileName;
  if (lpExtension != nullptr && !HasExtension(name)) name += lpExtension;
  const std::vector<std::u16string> folders =
      IsPlaced(name) ? std::vector<std::u16string>{u""} : FoldersToSearch(lpPath);
  for (const std::u16string& folder : folders) {
    const std::u16string candidate = Join(folder, name);
    if (GetFileAttributesW(candidate.c_str()) != INVALID_FILE_ATTRIBUTES) {
      return GetFullPathNameW(candidate.c_str(), nBufferLength, lpBuffer, lpFilePart);
    }
  }
  SetLastError(ERROR_FILE_NOT_FOUND);
  return 0;
}

}  // namespace win32
