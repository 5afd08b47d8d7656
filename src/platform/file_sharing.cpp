// The share-mode table of the process and the cross-process locks that mirror it.

#include "file_sharing.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <map>
#include <mutex>
#include <vector>

#include "syscalls.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

// The lock bytes: base + right for a right held, base + 8 + right for a right denied. Far beyond
// any file's data, so they never stand in the way of byte-range locks on real data.
constexpr off_t kLockBase = off_t{1} << 62;
constexpr off_t HeldByte(unsigned right) { return kLockBase + right; }
constexpr off_t DeniedByte(unsigned right) { return kLockBase + 8 + right; }
constexpr unsigned kRights[] = {kRightRead, kRightWrite, kRightDelete};

struct Entry {
  std::uint64_t id;
  unsigned rights;
  unsigned denied;
};

struct OpenFile {
  std::vector<Entry> entries;
  bool deletePending = false;
  std::string deletePath;
};

struct ShareTable {
  std::mutex lock;
  std::uint64_t nextEntry = 1;
  std::map<FileId, OpenFile> files;
};

ShareTable& Table() {
  static ShareTable* table = new ShareTable;
  return *table;
}

bool Conflicts(unsigned rights, unsigned denied, const Entry& other) {
  return (rights & other.denied) != 0 || (other.rights & denied) != 0;
}

bool SetLock(int fd, off_t byte, short type) {
  struct flock lock {};
  lock.l_type = type;
  lock.l_whence = SEEK_SET;
  lock.l_start = byte;
  lock.l_len = 1;
  return sys::Syscalls().fcntlLock(fd, F_OFD_SETLK, &lock) == 0;
}

// True when another open file description holds a lock on byte.
bool LockedElsewhere(int fd, off_t byte) {
  struct flock lock {};
  lock.l_type = F_WRLCK;
  lock.l_whence = SEEK_SET;
  lock.l_start = byte;
  lock.l_len = 1;
  if (sys::Syscalls().fcntlLock(fd, F_OFD_GETLK, &lock) != 0) return false;  // no locks here
  return lock.l_type != F_UNLCK;
}

// Takes the bytes of rights and denied on fd, then checks the other descriptions' bytes.
bool ClaimAcrossProcesses(int fd, bool lockable, unsigned rights, unsigned denied) {
  if (lockable) {
    for (unsigned right : kRights) {
      if ((rights & right) != 0) SetLock(fd, HeldByte(right), F_RDLCK);
      if ((denied & right) != 0) SetLock(fd, DeniedByte(right), F_RDLCK);
    }
  }
  for (unsigned right : kRights) {
    if (((rights & right) != 0 && LockedElsewhere(fd, DeniedByte(right))) ||
        ((denied & right) != 0 && LockedElsewhere(fd, HeldByte(right)))) {
      if (lockable) {
        for (unsigned taken : kRights) {
          SetLock(fd, HeldByte(taken), F_UNLCK);
          SetLock(fd, DeniedByte(taken), F_UNLCK);
        }
      }
      return false;
    }
  }
  return true;
}

bool SameFile(const std::string& path, FileId id) {
  struct stat info {};
  return sys::Syscalls().lstat(path.c_str(), &info) == 0 && info.st_dev == id.device &&
         info.st_ino == id.inode;
}

}  // namespace

DWORD ShareClaim::Take(int fd, bool lockable, FileId id, unsigned rights, unsigned share,
                       ShareClaim* claim) {
  rights &= kAllRights;
  if (rights == 0) return ERROR_SUCCESS;
  const unsigned denied = ~share & kAllRights;
  ShareTable& table = Table();
  std::lock_guard<std::mutex> lock(table.lock);
  auto found = table.files.find(id);
  if (found != table.files.end()) {
    for (const Entry& other : found->second.entries) {
      if (Conflicts(rights, denied, other)) return ERROR_SHARING_VIOLATION;
    }
  }
  if (!ClaimAcrossProcesses(fd, lockable, rights, denied)) return ERROR_SHARING_VIOLATION;
  const std::uint64_t entry = table.nextEntry++;
  table.files[id].entries.push_back(Entry{entry, rights, denied});
  claim->Release();
  claim->entry_ = entry;
  claim->id_ = id;
  return ERROR_SUCCESS;
}

ShareClaim::ShareClaim(ShareClaim&& other) noexcept : entry_(other.entry_), id_(other.id_) {
  other.entry_ = 0;
}

ShareClaim& ShareClaim::operator=(ShareClaim&& other) noexcept {
  if (this != &other) {
    Release();
    entry_ = other.entry_;
    id_ = other.id_;
    other.entry_ = 0;
  }
  return *this;
}

ShareClaim::~ShareClaim() { Release(); }

void ShareClaim::DeleteWhenLastCloses(const std::string& path) {
  if (entry_ == 0) return;
  ShareTable& table = Table();
  std::lock_guard<std::mutex> lock(table.lock);
  OpenFile& file = table.files[id_];
  file.deletePending = true;
  file.deletePath = path;
}

void ShareClaim::Release() noexcept {
  if (entry_ == 0) return;
  ShareTable& table = Table();
  std::lock_guard<std::mutex> lock(table.lock);
  const std::uint64_t released = entry_;
  entry_ = 0;
  auto found = table.files.find(id_);
  if (found == table.files.end()) return;
  std::vector<Entry>& entries = found->second.entries;
  std::erase_if(entries, [released](const Entry& e) { return e.id == released; });
  if (!entries.empty()) return;
  if (found->second.deletePending && SameFile(found->second.deletePath, id_)) {
    sys::Syscalls().unlink(found->second.deletePath.c_str());
  }
  table.files.erase(found);
}

}  // namespace win32::detail
