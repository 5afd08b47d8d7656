// Directory entries described the Windows way.

#include "file_info.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdint>
#include <string_view>

#include "syscalls.h"

namespace win32::detail {

namespace {

// Seconds from 1 January 1601 to 1 January 1970.
constexpr std::int64_t kEpochDifference = 11644473600;

bool IsHiddenName(const std::string& posixPath) {
  std::string_view path = posixPath;
  while (path.size() > 1 && path.back() == '/') path.remove_suffix(1);
  const std::string_view::size_type slash = path.rfind('/');
  const std::string_view name = slash == std::string_view::npos ? path : path.substr(slash + 1);
  return name.size() > 1 && name.front() == '.' && name != "..";
}

}  // namespace

FILETIME FileTimeOf(const timespec& time) {
  const std::int64_t seconds = static_cast<std::int64_t>(time.tv_sec) + kEpochDifference;
  if (seconds < 0) return FILETIME{0, 0};
  const auto ticks = static_cast<std::uint64_t>(seconds) * 10000000u +
                     static_cast<std::uint64_t>(time.tv_nsec) / 100u;
  return FILETIME{static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32)};
}

int FactsOfPath(const std::string& posixPath, FileFacts* facts) {
  const sys::SyscallTable& calls = sys::Syscalls();
  struct stat entry {};
  if (calls.lstat(posixPath.c_str(), &entry) != 0) return errno;
  DWORD attributes = 0;
  mode_t mode = entry.st_mode;
  ULONGLONG size = S_ISREG(entry.st_mode) ? static_cast<ULONGLONG>(entry.st_size) : 0;
  if (S_ISLNK(entry.st_mode)) {
    attributes |= FILE_ATTRIBUTE_REPARSE_POINT;
    struct stat target {};
    if (calls.stat(posixPath.c_str(), &target) == 0) mode = target.st_mode;
    size = 0;
  }
  if (S_ISDIR(mode)) attributes |= FILE_ATTRIBUTE_DIRECTORY;
  if ((mode & S_IWUSR) == 0) attributes |= FILE_ATTRIBUTE_READONLY;
  if (IsHiddenName(posixPath)) attributes |= FILE_ATTRIBUTE_HIDDEN;
  attributes |= ExtraAttributesOf(posixPath);
  facts->attributes = attributes != 0 ? attributes : FILE_ATTRIBUTE_NORMAL;
  facts->creation = FileTimeOf(entry.st_ctim);
  facts->lastAccess = FileTimeOf(entry.st_atim);
  facts->lastWrite = FileTimeOf(entry.st_mtim);
  facts->size = size;
  return 0;
}

}  // namespace win32::detail
