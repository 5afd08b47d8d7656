// The UNC form of a path on a mapped network drive.

#include <cstdint>
#include <vector>

#include "vynutil/file_exists.h"
#include "win32/crt_ctype.h"
#include "win32/handles.h"
#include "win32/last_error.h"
#include "win32/network_drives.h"

namespace {

constexpr DWORD kFirstBufferBytes = 2400;

// The remote name of the connected drive whose local name starts with letter, or null; strings
// point into buffer.
const MCHAR* RemoteNameOfDrive(MCHAR letter, std::vector<std::uint64_t>& buffer) {
  HANDLE enumeration = nullptr;
  if (win32::WNetOpenEnumW(win32::RESOURCE_CONNECTED, win32::RESOURCETYPE_DISK, 0, nullptr,
                           &enumeration) != win32::NO_ERROR) {
    return nullptr;
  }
  // Entries come in batches of what fits; a batch that cannot hold even one entry asks for a
  // larger buffer. The listing is read until the drive is found or the list ends.
  DWORD bytes = kFirstBufferBytes;
  const MCHAR* remote = nullptr;
  while (!remote) {
    buffer.assign((bytes + sizeof(std::uint64_t) - 1) / sizeof(std::uint64_t), 0);
    DWORD count = 0xFFFFFFFF;
    const DWORD result = win32::WNetEnumResourceW(enumeration, &count, buffer.data(), &bytes);
    if (result == win32::ERROR_MORE_DATA) continue;
    if (result != win32::NO_ERROR) break;
    const auto* resources = reinterpret_cast<const win32::NETRESOURCEW*>(buffer.data());
    for (DWORD i = 0; i < count && !remote; ++i) {
      const MCHAR* local = resources[i].lpLocalName;
      if (local && local[0] && win32::towlower(local[0]) == win32::towlower(letter)) {
        remote = resources[i].lpRemoteName;
      }
    }
  }
  win32::WNetCloseEnum(enumeration);
  return remote;
}

}  // namespace

int UtilGetUniversalFilename(WStr& out, const MCHAR* path) {
  out = WStr(u"");
  if (!path || !win32::iswalpha(path[0]) || path[1] != u':' || path[2] != u'\\') return 0;
  const MCHAR root[] = {path[0], u':', u'\\', 0};
  if (win32::GetDriveTypeW(root) != win32::DRIVE_REMOTE) return 0;
  std::vector<std::uint64_t> buffer;
  const MCHAR* remote = RemoteNameOfDrive(path[0], buffer);
  if (!remote) return 0;
  out.printf(u"%s%s", remote, path + 2);
  return 1;
}
