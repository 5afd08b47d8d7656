// ReplaceFileContentW over the INI layer's atomic replacement.

#include "win32/file_replace.h"

#include <string>
#include <string_view>

#include "profile_file_replace.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace win32 {

BOOL ReplaceFileContentW(LPCWSTR path, const void* data, std::size_t size) {
  if (path == nullptr || path[0] == 0 || (data == nullptr && size != 0)) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  detail::ReplaceTarget target;
  DWORD error = detail::ResolveReplaceTarget(MapPath(path), &target);
  if (error == ERROR_SUCCESS) {
    detail::FileId written{};
    error = detail::ReplaceFileContent(target, std::string_view(static_cast<const char*>(data), size), &written);
  }
  SetLastError(error);
  return error == ERROR_SUCCESS ? TRUE : FALSE;
}

}  // namespace win32
