// The per-process cache of parsed profile files, and reading a file into it.

#include "profile_cache.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>
#include <deque>
#include <mutex>
#include <new>
#include <shared_mutex>
#include <unordered_map>
#include <utility>

#include "file_stamp_settle.h"
#include "path_errors.h"
#include "syscalls.h"
#include "win32/codepage.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

// How many files, and how much memory for them, the cache keeps before it drops the oldest.
constexpr std::size_t kMaxEntries = 64;
constexpr std::size_t kMaxCachedBytes = std::size_t{512} << 20;
// Tries when the file changes while it is being read.
constexpr int kReadAttempts = 4;

using Nanoseconds = long long;

Nanoseconds ToNanoseconds(const timespec& t) {
  return static_cast<Nanoseconds>(t.tv_sec) * 1000000000LL + t.tv_nsec;
}

Nanoseconds Now() {
  timespec now{};
  clock_gettime(CLOCK_REALTIME, &now);
  return ToNanoseconds(now);
}

struct FileStamp {
  FileId id;
  off_t size = 0;
  Nanoseconds modified = 0;
  Nanoseconds changed = 0;
  bool operator==(const FileStamp&) const = default;
};

FileStamp StampOf(const struct stat& info) {
  FileStamp stamp;
  stamp.id = FileId{info.st_dev, info.st_ino};
  stamp.size = info.st_size;
  stamp.modified = ToNanoseconds(info.st_mtim);
  stamp.changed = ToNanoseconds(info.st_ctim);
  return stamp;
}

// A copy read at time seen can be trusted for as long as the stamps stay when the file's last
// change lies more than one clock step before seen: any later change then gets a later time.
bool Settled(const FileStamp& stamp, Nanoseconds seen) {
  return StampSettled(stamp.modified, stamp.changed, seen);
}

struct FileIdHash {
  std::size_t operator()(const FileId& id) const {
    return std::hash<unsigned long long>()(static_cast<unsigned long long>(id.inode) * 31 +
                                           static_cast<unsigned long long>(id.device));
  }
};

struct Entry {
  FileStamp stamp;
  std::shared_ptr<const ProfileDocument> document;
  bool settled = false;
};

class ProfileCache {
 public:
  // The cached copy for stamp, if any: settled tells whether it may be used without a look at
  // the file's bytes.
  std::shared_ptr<const ProfileDocument> Find(const FileStamp& stamp, UINT codePage,
                                              bool* settled) {
    std::shared_lock<std::shared_mutex> lock(mutex_);
    const auto found = entries_.find(stamp.id);
    if (found == entries_.end() || !(found->second.stamp == stamp)) return nullptr;
    const ProfileDocument& document = *found->second.document;
    if (document.encoding() == ProfileEncoding::kAnsi && document.codePage() != codePage) {
      return nullptr;  // decoded for another process code page
    }
    *settled = found->second.settled;
    return found->second.document;
  }

  void Store(const FileStamp& stamp, std::shared_ptr<const ProfileDocument> document,
             bool settled) {
    std::unique_lock<std::shared_mutex> lock(mutex_);
    auto position = entries_.find(stamp.id);
    if (position == entries_.end()) {
      order_.push_back(stamp.id);
      try {
        position = entries_.emplace(stamp.id, Entry{stamp, document, settled}).first;
      } catch (...) {
        order_.pop_back();
        throw;
      }
    } else {
      bytes_ -= position->second.document->Footprint();
      position->second = Entry{stamp, document, settled};
    }
    bytes_ += document->Footprint();
    while (order_.size() > 1 && (order_.size() > kMaxEntries || bytes_ > kMaxCachedBytes)) {
      const auto oldest = entries_.find(order_.front());
      bytes_ -= oldest->second.document->Footprint();
      entries_.erase(oldest);
      order_.pop_front();
    }
  }

  void Clear() {
    std::unique_lock<std::shared_mutex> lock(mutex_);
    entries_.clear();
    order_.clear();
    bytes_ = 0;
  }

 private:
  std::shared_mutex mutex_;
  std::unordered_map<FileId, Entry, FileIdHash> entries_;
  std::deque<FileId> order_;  // first stored first
  std::size_t bytes_ = 0;  // the documents' footprint
};

ProfileCache& Cache() {
  static ProfileCache cache;
  return cache;
}

DWORD StatError(int error, const std::string& path) {
  return error == EISDIR ? ERROR_ACCESS_DENIED : PathError(error, path);
}

// Only regular files are profiles: a folder, a device or a pipe is refused as Windows refuses a
// folder, and is never read (a pipe would block, a device might never end).
DWORD CheckRegular(const struct stat& info) {
  return S_ISREG(info.st_mode) ? ERROR_SUCCESS : ERROR_ACCESS_DENIED;
}

struct Loaded {
  std::string bytes;
  FileStamp stamp;
  Nanoseconds seen = 0;  // when the reading began
  DWORD error = ERROR_SUCCESS;
  bool torn = false;     // the file changed while it was read
};

DWORD ReadAll(int fd, std::size_t expected, std::string* bytes) {
  const sys::SyscallTable& calls = sys::Syscalls();
  bytes->clear();
  bytes->resize(expected + 1);  // one more, to see a file that grew
  std::size_t total = 0;
  for (;;) {
    if (total == bytes->size()) {
      if (bytes->size() > ProfileDocument::kMaxBytes) return ERROR_FILE_TOO_LARGE;
      bytes->resize(bytes->size() * 2);
    }
    const ssize_t got = calls.read(fd, bytes->data() + total, bytes->size() - total);
    if (got == 0) break;
    if (got < 0) {
      if (errno == EINTR) continue;
      return ErrorFromErrno(errno);
    }
    total += static_cast<std::size_t>(got);
  }
  bytes->resize(total);
  return total > ProfileDocument::kMaxBytes ? ERROR_FILE_TOO_LARGE : ERROR_SUCCESS;
}

Loaded LoadOnce(const std::string& path) {
  const sys::SyscallTable& calls = sys::Syscalls();
  Loaded loaded;
  loaded.seen = Now();
  const int fd = calls.open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK, 0);
  if (fd < 0) {
    loaded.error = StatError(errno, path);
    return loaded;
  }
  struct stat before {};
  struct stat after {};
  if (calls.fstat(fd, &before) != 0) {
    loaded.error = ErrorFromErrno(errno);
  } else if ((loaded.error = CheckRegular(before)) == ERROR_SUCCESS) {
    if (static_cast<std::size_t>(before.st_size) > ProfileDocument::kMaxBytes) {
      loaded.error = ERROR_FILE_TOO_LARGE;
    } else {
      loaded.error = ReadAll(fd, static_cast<std::size_t>(before.st_size), &loaded.bytes);
    }
    if (loaded.error == ERROR_SUCCESS && calls.fstat(fd, &after) != 0) {
      loaded.error = ErrorFromErrno(errno);
    }
    loaded.stamp = StampOf(before);
    // Written to while being read: the bytes may be a mix; the caller reads again.
    loaded.torn = loaded.error == ERROR_SUCCESS &&
                  (!(StampOf(after) == loaded.stamp) ||
                   loaded.bytes.size() != static_cast<std::size_t>(before.st_size));
  }
  calls.close(fd);
  return loaded;
}

// A file that keeps changing is taken as the last reading found it; its stamp no longer matches
// then, so the next lookup reads it again.
Loaded Load(const std::string& path) {
  Loaded loaded = LoadOnce(path);
  for (int attempt = 1; attempt < kReadAttempts && loaded.torn; ++attempt) loaded = LoadOnce(path);
  return loaded;
}

}  // namespace

ProfileRead ReadProfile(const std::string& posixPath) {
  ProfileRead result;
  try {
    struct stat info {};
    if (sys::Syscalls().stat(posixPath.c_str(), &info) != 0) {
      result.error = StatError(errno, posixPath);
      return result;
    }
    if ((result.error = CheckRegular(info)) != ERROR_SUCCESS) return result;
    const UINT codePage = GetACP();
    bool settled = false;
    std::shared_ptr<const ProfileDocument> cached = Cache().Find(StampOf(info), codePage, &settled);
    if (cached && settled) {
      result.document = std::move(cached);
      return result;
    }
    Loaded loaded = Load(posixPath);
    if (loaded.error != ERROR_SUCCESS) {
      result.error = loaded.error;
      return result;
    }
    if (cached && cached->bytes() == loaded.bytes) {
      result.document = std::move(cached);  // unchanged after all
    } else {
      result.document = ProfileDocument::Parse(std::move(loaded.bytes), codePage);
      if (!result.document) {
        result.error = ERROR_FILE_TOO_LARGE;
        return result;
      }
    }
    const bool trusted = !loaded.torn && Settled(loaded.stamp, loaded.seen);
    Cache().Store(loaded.stamp, result.document, trusted);
  } catch (const std::bad_alloc&) {
    result.document.reset();
    result.error = ERROR_NOT_ENOUGH_MEMORY;
  }
  return result;
}

void RememberProfile(const std::string& posixPath, const FileId& written,
                     std::shared_ptr<const ProfileDocument> document) {
  struct stat info {};
  const Nanoseconds seen = Now();
  if (!document || sys::Syscalls().stat(posixPath.c_str(), &info) != 0) return;
  const FileStamp stamp = StampOf(info);
  if (!(stamp.id == written) ||
      static_cast<std::size_t>(info.st_size) != document->bytes().size()) {
    return;
  }
  try {
    Cache().Store(stamp, std::move(document), Settled(stamp, seen));
  } catch (const std::bad_alloc&) {
  }
}

void ForgetProfiles() { Cache().Clear(); }

}  // namespace win32::detail
