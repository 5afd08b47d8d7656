// GetDriveTypeW and the enumeration of connected network drives (WNetOpenEnumW and family).

#include "win32/network_drives.h"

#include <sys/stat.h>

#include <cstring>
#include <string>
#include <utility>
#include <vector>

#include "handle_table.h"
#include "network_drive_config.h"
#include "syscalls.h"
#include "win32/last_error.h"
#include "win32/path_map.h"
#include "win32/shell_path.h"

namespace win32 {

namespace {

constexpr DWORD kAllEntries = 0xFFFFFFFF;

class NetEnumeration : public detail::HandleObject {
 public:
  explicit NetEnumeration(std::vector<std::pair<std::u16string, std::u16string>> drives)
      : drives(std::move(drives)) {}
  std::vector<std::pair<std::u16string, std::u16string>> drives;  // (local, remote)
  std::size_t next = 0;
};

bool IsLetter(MCHAR c) { return (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z'); }

DWORD Result(DWORD code) {
  SetLastError(code);
  return code;
}

// The bytes an entry's strings take, terminators included.
std::size_t StringBytes(const std::pair<std::u16string, std::u16string>& drive) {
  return (drive.first.size() + 1 + drive.second.size() + 1) * sizeof(MCHAR);
}

MCHAR* PutString(const std::u16string& text, unsigned char* at) {
  std::memcpy(at, text.c_str(), (text.size() + 1) * sizeof(MCHAR));
  return reinterpret_cast<MCHAR*>(at);
}

}  // namespace

UINT GetDriveTypeW(LPCWSTR lpRootPathName) {
  if (lpRootPathName == nullptr) return DRIVE_FIXED;
  const std::u16string root = lpRootPathName;
  const bool driveRoot = root.size() >= 2 && root.size() <= 3 && IsLetter(root[0]) &&
                         root[1] == u':' && (root.size() == 2 || root[2] == u'\\' || root[2] == u'/');
  if (driveRoot) {
    if (detail::MappedNetworkDrive(root[0])) return DRIVE_REMOTE;
    struct stat info {};
    const std::string folder = MapPath(root.substr(0, 2).c_str());
    return sys::Syscalls().stat(folder.c_str(), &info) == 0 && S_ISDIR(info.st_mode)
               ? DRIVE_FIXED : DRIVE_NO_ROOT_DIR;
  }
  if (root == u"\\" || root == u"/") return DRIVE_FIXED;
  std::u16string share = root;
  if (!share.empty() && share.back() == u'\\') share.pop_back();
  return PathIsUNCServerShareW(share.c_str()) ? DRIVE_REMOTE : DRIVE_NO_ROOT_DIR;
}

DWORD WNetOpenEnumW(DWORD dwScope, DWORD dwType, DWORD, NETRESOURCEW*, HANDLE* lphEnum) {
  if (lphEnum == nullptr) return Result(ERROR_INVALID_PARAMETER);
  if (dwScope != RESOURCE_CONNECTED) return Result(ERROR_NOT_SUPPORTED);
  if (dwType != RESOURCETYPE_ANY && dwType != RESOURCETYPE_DISK && dwType != RESOURCETYPE_PRINT) {
    return Result(ERROR_INVALID_PARAMETER);
  }
  auto drives = dwType == RESOURCETYPE_PRINT
                    ? std::vector<std::pair<std::u16string, std::u16string>>()
                    : detail::ConnectedNetworkDrives();
  *lphEnum = detail::RegisterHandle(std::make_shared<NetEnumeration>(std::move(drives)));
  return Result(NO_ERROR);
}

DWORD WNetEnumResourceW(HANDLE hEnum, DWORD* lpcCount, void* lpBuffer, DWORD* lpBufferSize) {
  std::shared_ptr<NetEnumeration> listing = detail::FindHandleOf<NetEnumeration>(hEnum);
  if (listing == nullptr) return Result(ERROR_INVALID_HANDLE);
  if (lpcCount == nullptr || lpBufferSize == nullptr || *lpcCount == 0 ||
      (lpBuffer == nullptr && *lpBufferSize != 0)) {
    return Result(ERROR_INVALID_PARAMETER);
  }
  const auto& drives = listing->drives;
  if (listing->next >= drives.size()) {
    *lpcCount = 0;
    return Result(ERROR_NO_MORE_ITEMS);
  }
  // How many of the next entries fit: their records first, then all their strings.
  const std::size_t wanted = *lpcCount == kAllEntries ? drives.size() : *lpcCount;
  std::size_t count = 0, stringBytes = 0;
  while (listing->next + count < drives.size() && count < wanted) {
    const std::size_t more = StringBytes(drives[listing->next + count]);
    if ((count + 1) * sizeof(NETRESOURCEW) + stringBytes + more > *lpBufferSize) break;
    stringBytes += more;
    ++count;
  }
  if (count == 0) {
    *lpBufferSize =
        static_cast<DWORD>(sizeof(NETRESOURCEW) + StringBytes(drives[listing->next]));
    return Result(ERROR_MORE_DATA);
  }
  auto* bytes = static_cast<unsigned char*>(lpBuffer);
  unsigned char* strings = bytes + count * sizeof(NETRESOURCEW);
  for (std::size_t i = 0; i < count; ++i) {
    const auto& drive = drives[listing->next + i];
    NETRESOURCEW record{};
    record.dwScope = RESOURCE_CONNECTED;
    record.dwType = RESOURCETYPE_DISK;
    record.dwDisplayType = RESOURCEDISPLAYTYPE_SHARE;
    record.lpLocalName = PutString(drive.first, strings);
    strings += (drive.first.size() + 1) * sizeof(MCHAR);
    record.lpRemoteName = PutString(drive.second, strings);
    strings += (drive.second.size() + 1) * sizeof(MCHAR);
    std::memcpy(bytes + i * sizeof(NETRESOURCEW), &record, sizeof record);
  }
  listing->next += count;
  *lpcCount = static_cast<DWORD>(count);
  return Result(NO_ERROR);
}

DWORD WNetCloseEnum(HANDLE hEnum) {
  if (detail::TakeHandleOf<NetEnumeration>(hEnum) == nullptr) return Result(ERROR_INVALID_HANDLE);
  return Result(NO_ERROR);
}

}  // namespace win32
