// CreateDirectoryW, RemoveDirectoryW and SHCreateDirectoryExW over mkdir and rmdir.

#include "win32/folders.h"

#include <sys/stat.h>

#include <cerrno>
#include <string>
#include <string_view>
#include <vector>

#include "path_errors.h"
#include "syscalls.h"
#include "utf_strings.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"
#include "win32/path_map.h"
#include "win32/shell_path.h"

namespace win32 {

namespace {

constexpr mode_t kFolderPermissions = 0777;  // less the umask
constexpr std::size_t kLongestCreatablePath = 247;  // 248 units with the terminator

bool IsSeparator(MCHAR c) { return c == u'\\' || c == u'/'; }

bool IsFolder(const std::string& path) {
  struct stat info {};
  return sys::Syscalls().stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode);
}

// The length of the root of a Windows-form path: "X:\" or "X:", "\\server\share", "\" or "/".
std::size_t RootLength(std::u16string_view path) {
  if (path.size() >= 2 && path[1] == u':') return path.size() > 2 && IsSeparator(path[2]) ? 3 : 2;
  if (path.size() >= 2 && IsSeparator(path[0]) && IsSeparator(path[1])) {
    std::size_t end = path.find_first_of(u"\\/", 2);                      // after the server
    if (end != std::u16string_view::npos) end = path.find_first_of(u"\\/", end + 1);  // share
    return end == std::u16string_view::npos ? path.size() : end;
  }
  return IsSeparator(path[0]) ? 1 : 0;
}

std::vector<std::u16string> Components(std::u16string_view path) {
  std::vector<std::u16string> parts;
  std::size_t start = 0;
  while (start < path.size()) {
    std::size_t end = path.find_first_of(u"\\/", start);
    if (end == std::u16string_view::npos) end = path.size();
    if (end > start) parts.emplace_back(path.substr(start, end - start));
    start = end + 1;
  }
  return parts;
}

std::string Join(std::string folder, const std::string& name) {
  if (folder.empty() || folder.back() != '/') folder.push_back('/');
  return folder + name;
}

int Result(DWORD code) {
  SetLastError(code);
  return static_cast<int>(code);
}

// Makes one folder of SHCreateDirectoryExW's chain; ERROR_SUCCESS when it is there afterwards.
DWORD MakeFolder(const std::string& path, bool last) {
  if (sys::Syscalls().mkdir(path.c_str(), kFolderPermissions) == 0) return ERROR_SUCCESS;
  if (errno == EEXIST) {
    if (IsFolder(path)) return last ? ERROR_ALREADY_EXISTS : ERROR_SUCCESS;
    return last ? ERROR_FILE_EXISTS : ERROR_PATH_NOT_FOUND;
  }
  return errno == ENOENT || errno == ENOTDIR ? ERROR_PATH_NOT_FOUND : ErrorFromErrno(errno);
}

}  // namespace

BOOL CreateDirectoryW(LPCWSTR lpPathName, LPSECURITY_ATTRIBUTES) {
  std::string path;
  if (!detail::MapPathArgument(lpPathName, &path)) return FALSE;
  if (sys::Syscalls().mkdir(path.c_str(), kFolderPermissions) == 0) return TRUE;
  SetLastError(errno == EEXIST ? ERROR_ALREADY_EXISTS
               : errno == ENOENT || errno == ENOTDIR ? ERROR_PATH_NOT_FOUND
                                                    : ErrorFromErrno(errno));
  return FALSE;
}

BOOL RemoveDirectoryW(LPCWSTR lpPathName) {
  std::string path;
  if (!detail::MapPathArgument(lpPathName, &path)) return FALSE;
  const sys::SyscallTable& calls = sys::Syscalls();
  if (calls.rmdir(path.c_str()) == 0) return TRUE;
  const int error = errno;
  struct stat info {};
  if (error == ENOTDIR && calls.lstat(path.c_str(), &info) == 0) {
    SetLastError(ERROR_DIRECTORY);  // the name is a file
  } else if (error == ENOTEMPTY || error == EEXIST) {
    SetLastError(ERROR_DIR_NOT_EMPTY);
  } else {
    SetLastError(detail::PathError(error, path));
  }
  return FALSE;
}

int SHCreateDirectoryExW(HWND, LPCWSTR pszPath, const SECURITY_ATTRIBUTES*) {
  if (pszPath == nullptr || (PathIsRelativeW(pszPath) && pszPath[0] != u'/')) {
    return Result(ERROR_BAD_PATHNAME);
  }
  const std::u16string_view text = pszPath;
  if (text.size() > kLongestCreatablePath) return Result(ERROR_FILENAME_EXCED_RANGE);
  const std::size_t rootLength = RootLength(text);
  const std::string root = MapPath(std::u16string(text.substr(0, rootLength)).c_str());
  if (!IsFolder(root)) return Result(ERROR_PATH_NOT_FOUND);
  const std::vector<std::u16string> parts = Components(text.substr(rootLength));
  if (parts.empty()) return Result(ERROR_ALREADY_EXISTS);
  std::string folder = root;
  for (std::size_t i = 0; i < parts.size(); ++i) {
    folder = Join(folder, detail::Utf8Of(parts[i]));
    const bool last = i + 1 == parts.size();
    if (!last && IsFolder(folder)) continue;
    const DWORD made = MakeFolder(folder, last);
    if (made != ERROR_SUCCESS) return Result(made);
  }
  return Result(ERROR_SUCCESS);
}

}  // namespace win32
