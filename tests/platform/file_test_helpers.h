#pragma once
// Small helpers of the file tests: handles closed at the end of a scope, file contents, read-only
// files.

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

#include "win32/file_handle.h"

namespace vyn::test {

// Closes a file handle at the end of the scope (unless released first).
class ScopedHandle {
 public:
  explicit ScopedHandle(HANDLE handle) : handle_(handle) {}
  ~ScopedHandle() {
    if (valid()) win32::CloseHandle(handle_);
  }
  ScopedHandle(const ScopedHandle&) = delete;
  ScopedHandle& operator=(const ScopedHandle&) = delete;

  HANDLE get() const { return handle_; }
  bool valid() const { return handle_ != INVALID_HANDLE_VALUE && handle_ != nullptr; }
  // Closes now; the result of CloseHandle.
  BOOL Close() {
    const BOOL closed = win32::CloseHandle(handle_);
    handle_ = INVALID_HANDLE_VALUE;
    return closed;
  }

 private:
  HANDLE handle_;
};

inline std::string Contents(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream out;
  out << in.rdbuf();
  return out.str();
}

// Takes every write permission away, as the read-only attribute does.
inline void MakeReadOnly(const std::filesystem::path& path) {
  std::filesystem::permissions(path, std::filesystem::perms::owner_write | std::filesystem::perms::group_write |
                                         std::filesystem::perms::others_write,
                               std::filesystem::perm_options::remove);
}

inline HANDLE OpenFile(const std::u16string& path, DWORD access, DWORD share, DWORD disposition,
                       DWORD flags = win32::FILE_ATTRIBUTE_NORMAL) {
  return win32::CreateFileW(path.c_str(), access, share, nullptr, disposition, flags, nullptr);
}

}  // namespace vyn::test
