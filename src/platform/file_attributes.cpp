// GetFileAttributesW and its family over lstat, permissions and the attribute overrides.

#include "win32/file_attributes.h"

#include <sys/stat.h>

#include <cerrno>

#include "file_info.h"
#include "path_errors.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

// The bits SetFileAttributesW keeps as the path's override.
constexpr DWORD kSettableExtras = FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM |
                                  FILE_ATTRIBUTE_ARCHIVE | FILE_ATTRIBUTE_TEMPORARY |
                                  FILE_ATTRIBUTE_OFFLINE | FILE_ATTRIBUTE_NOT_CONTENT_INDEXED;

// The facts of a path argument, or false with the last error set.
bool FactsOf(LPCWSTR name, std::string* path, detail::FileFacts* facts) {
  if (!detail::MapPathArgument(name, path)) return false;
  const int error = detail::FactsOfPath(*path, facts);
  if (error == 0) return true;
  SetLastError(detail::PathError(error, *path));
  return false;
}

}  // namespace

DWORD GetFileAttributesW(LPCWSTR lpFileName) {
  std::string path;
  detail::FileFacts facts;
  return FactsOf(lpFileName, &path, &facts) ? facts.attributes : INVALID_FILE_ATTRIBUTES;
}

BOOL GetFileAttributesExW(LPCWSTR lpFileName, GET_FILEEX_INFO_LEVELS fInfoLevelId,
                          void* lpFileInformation) {
  if (fInfoLevelId != GetFileExInfoStandard || lpFileInformation == nullptr) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  std::string path;
  detail::FileFacts facts;
  if (!FactsOf(lpFileName, &path, &facts)) return FALSE;
  detail::CopyFacts(facts, static_cast<WIN32_FILE_ATTRIBUTE_DATA*>(lpFileInformation));
  return TRUE;
}

BOOL SetFileAttributesW(LPCWSTR lpFileName, DWORD dwFileAttributes) {
  std::string path;
  detail::FileFacts facts;
  if (!FactsOf(lpFileName, &path, &facts)) return FALSE;
  const sys::SyscallTable& calls = sys::Syscalls();
  struct stat info {};
  if (calls.stat(path.c_str(), &info) == 0) {  // a dangling link has no permissions to change
    const bool readOnly = (dwFileAttributes & FILE_ATTRIBUTE_READONLY) != 0;
    const mode_t permissions = info.st_mode & 07777;
    const mode_t wanted = readOnly ? (permissions & ~mode_t{0222}) : (permissions | S_IWUSR);
    if (wanted != permissions && calls.chmod(path.c_str(), wanted) != 0) {
      SetLastError(ErrorFromErrno(errno));
      return FALSE;
    }
  }
  const DWORD kept = detail::ExtraAttributesOf(path) & ~kSettableExtras;
  detail::SetExtraAttributesOf(path, kept | (dwFileAttributes & kSettableExtras));
  return TRUE;
}

BOOL PathFileExistsW(LPCWSTR pszPath) {
  return GetFileAttributesW(pszPath) != INVALID_FILE_ATTRIBUTES ? TRUE : FALSE;
}

}  // namespace win32
