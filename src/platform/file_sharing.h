#pragma once
// Win32 share modes between open files. Every open of a file with read, write or delete access
// records which of those rights it holds and which it denies to others (the share bits it left
// out). An open whose rights another open denies, or that denies a right another open holds,
// fails with ERROR_SHARING_VIOLATION, as on Windows.
//
// Inside the process a table of open files decides. Between processes the same facts are kept as
// open-file-description locks on single bytes far beyond any data (one byte per right held, one
// per right denied): an open takes its bytes, then looks for another description's lock on the
// bytes it conflicts with, and gives its bytes back when it finds one. Two conflicting opens at
// the same moment may therefore both fail, but two conflicting opens never both succeed. The
// locks go with the descriptor, so a process that dies leaves nothing behind. A descriptor opened
// without read access (a file its caller may write but not read) cannot take locks: its rights
// are then checked against other processes but not shown to them; one that only refers to the
// path (no read permission at all, no data rights asked) is checked inside the process only.

#include <sys/types.h>

#include <compare>
#include <cstdint>
#include <string>

#include "vynutil/wintypes.h"

namespace win32::detail {

// The rights of an open, in the bit layout of FILE_SHARE_READ / _WRITE / _DELETE.
inline constexpr unsigned kRightRead = 0x1;
inline constexpr unsigned kRightWrite = 0x2;
inline constexpr unsigned kRightDelete = 0x4;
inline constexpr unsigned kAllRights = 0x7;

// A file's identity on this machine.
struct FileId {
  dev_t device = 0;
  ino_t inode = 0;
  auto operator<=>(const FileId&) const = default;
};

// One open's place in the share table; released on destruction (or when moved from, never).
class ShareClaim {
 public:
  ShareClaim() = default;
  ShareClaim(ShareClaim&& other) noexcept;
  ShareClaim& operator=(ShareClaim&& other) noexcept;
  ShareClaim(const ShareClaim&) = delete;
  ShareClaim& operator=(const ShareClaim&) = delete;
  ~ShareClaim();

  // Claims rights on the file open as fd (identity id), sharing the rights in share with others.
  // ERROR_SUCCESS with *claim filled, or ERROR_SHARING_VIOLATION. An open without rights claims
  // nothing and always succeeds, as on Windows. lockable says whether fd may take read locks.
  static DWORD Take(int fd, bool lockable, FileId id, unsigned rights, unsigned share,
                    ShareClaim* claim);

  // Marks the file for deletion when the last claim on it in this process goes: it is then
  // unlinked at path (an absolute POSIX path), provided path still names the same file.
  void DeleteWhenLastCloses(const std::string& path);

 private:
  void Release() noexcept;

  std::uint64_t entry_ = 0;  // 0: no claim
  FileId id_;
};

}  // namespace win32::detail
