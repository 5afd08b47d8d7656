// Sorting "not found" into file and path errors.

#include "path_errors.h"

#include <sys/stat.h>

#include <cerrno>

#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace win32::detail {

std::string ParentFolder(const std::string& posixPath) {
  std::string::size_type end = posixPath.size();
  while (end > 1 && posixPath[end - 1] == '/') --end;  // "a/b/" names b
  const std::string::size_type slash = posixPath.rfind('/', end - 1);
  if (slash == std::string::npos || end == 0) return ".";
  std::string::size_type parentEnd = slash;
  while (parentEnd > 0 && posixPath[parentEnd - 1] == '/') --parentEnd;
  return parentEnd == 0 ? "/" : posixPath.substr(0, parentEnd);
}

DWORD MissingPathError(const std::string& posixPath) {
  struct stat info {};
  const std::string parent = ParentFolder(posixPath);
  if (sys::Syscalls().stat(parent.c_str(), &info) == 0 && S_ISDIR(info.st_mode)) {
    return ERROR_FILE_NOT_FOUND;
  }
  return ERROR_PATH_NOT_FOUND;
}

DWORD PathError(int errnoValue, const std::string& posixPath) {
  if (errnoValue == ENOENT) return MissingPathError(posixPath);
  if (errnoValue == ENOTDIR) return ERROR_PATH_NOT_FOUND;
  return ErrorFromErrno(errnoValue);
}

bool MapPathArgument(const MCHAR* path, std::string* posixPath) {
  if (path == nullptr || path[0] == 0) {
    SetLastError(ERROR_PATH_NOT_FOUND);
    return false;
  }
  *posixPath = MapPath(path);
  return true;
}

}  // namespace win32::detail
