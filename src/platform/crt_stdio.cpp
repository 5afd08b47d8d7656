// _wfopen: runtime mode letters and Windows-form paths over fopen.

#include "win32/crt_stdio.h"

#include <sys/stat.h>

#include <cerrno>
#include <optional>
#include <string>

#include "syscalls.h"
#include "win32/path_map.h"

namespace win32 {

namespace {

bool IsBlank(MCHAR c) { return c == u' ' || c == u'\t'; }

// The ", ccs=ENCODING" tail after the mode letters: blanks, a comma, blanks, "ccs=" and a name.
bool IsEncodingTail(const MCHAR* tail) {
  while (IsBlank(*tail)) ++tail;
  if (*tail++ != u',') return false;
  while (IsBlank(*tail)) ++tail;
  for (char c : {'c', 'c', 's', '='}) {
    if (*tail++ != static_cast<MCHAR>(c)) return false;
  }
  return *tail != 0;
}

// The fopen mode for a runtime mode, or nullopt when the runtime would refuse it.
std::optional<std::string> PosixMode(const MCHAR* mode) {
  std::string posix;
  switch (*mode) {
    case u'r': posix = "r"; break;
    case u'w': posix = "w"; break;
    case u'a': posix = "a"; break;
    default: return std::nullopt;
  }
  bool plus = false, binary = false, text = false;
  for (++mode; *mode != 0 && *mode != u',' && !IsBlank(*mode); ++mode) {
    bool* seen = *mode == u'+' ? &plus : *mode == u'b' ? &binary : *mode == u't' ? &text : nullptr;
    if (seen == nullptr || *seen) return std::nullopt;
    *seen = true;
  }
  if (binary && text) return std::nullopt;
  if (*mode != 0 && !IsEncodingTail(mode)) return std::nullopt;
  if (plus) posix.push_back('+');
  return posix;
}

}  // namespace

FILE* _wfopen(const MCHAR* path, const MCHAR* mode) {
  const std::optional<std::string> posixMode =
      path != nullptr && mode != nullptr ? PosixMode(mode) : std::nullopt;
  if (!posixMode || path[0] == 0) {
    errno = EINVAL;
    return nullptr;
  }
  const sys::SyscallTable& calls = sys::Syscalls();
  FILE* stream = calls.fopen(MapPath(path).c_str(), posixMode->c_str());
  if (stream == nullptr) {
    if (errno == EISDIR) errno = EACCES;  // writing to a folder
    return nullptr;
  }
  struct stat info {};
  if (calls.fstat(fileno(stream), &info) == 0 && S_ISDIR(info.st_mode)) {
    calls.fclose(stream);
    errno = EACCES;
    return nullptr;
  }
  return stream;
}

}  // namespace win32
