// Atomic replacement of a file's content: temporary file, flush, rename.

#include "profile_file_replace.h"

#include <fcntl.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <ctime>

#include "path_errors.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

constexpr int kMaxLinks = 40;  // as the kernel's own limit on symbolic links in a path
constexpr int kNameAttempts = 16;
constexpr mode_t kNewFilePermissions = 0666;  // less the umask
constexpr char kAttributesName[] = "user.vyn.attributes";

std::string BaseName(const std::string& path) {
  const std::string::size_type slash = path.rfind('/');
  return slash == std::string::npos ? path : path.substr(slash + 1);
}

// A name no other writer picks: process, a counter and the clock.
std::string TemporaryName(const std::string& folder, const std::string& name) {
  static std::atomic<unsigned> counter{0};
  timespec now{};
  clock_gettime(CLOCK_MONOTONIC, &now);
  return folder + "/." + name + "." + std::to_string(getpid()) + "-" +
         std::to_string(counter.fetch_add(1) ^ static_cast<unsigned>(now.tv_nsec)) + ".tmp";
}

DWORD WriteAll(int fd, std::string_view bytes) {
  const sys::SyscallTable& calls = sys::Syscalls();
  while (!bytes.empty()) {
    const ssize_t done = calls.write(fd, bytes.data(), bytes.size());
    if (done < 0) {
      if (errno == EINTR) continue;
      return ErrorFromErrno(errno);
    }
    if (done == 0) return ERROR_DISK_FULL;
    bytes.remove_prefix(static_cast<std::size_t>(done));
  }
  return ERROR_SUCCESS;
}

// The old file's permissions, owner and Windows attributes on the new one. Owner and attributes
// are kept where the system lets this process set them; the permission bits always.
DWORD CarryOver(int fd, const ReplaceTarget& target) {
  if (!target.exists) return ERROR_SUCCESS;
  const sys::SyscallTable& calls = sys::Syscalls();
  const struct stat& old = target.info;
  struct stat now {};
  if (calls.fstat(fd, &now) == 0 && (now.st_uid != old.st_uid || now.st_gid != old.st_gid)) {
    if (fchown(fd, old.st_uid, old.st_gid) != 0 &&
        fchown(fd, static_cast<uid_t>(-1), old.st_gid) != 0) {
      // Neither may be set by this process: the new file keeps its own owner and group.
    }
  }
  char attributes[64];
  const ssize_t size =
      calls.lgetxattr(target.path.c_str(), kAttributesName, attributes, sizeof(attributes));
  if (size > 0) fsetxattr(fd, kAttributesName, attributes, static_cast<std::size_t>(size), 0);
  // After fchown, which may clear set-user-id bits.
  if (calls.fchmod(fd, old.st_mode & 07777) != 0) return ErrorFromErrno(errno);
  return ERROR_SUCCESS;
}

void FlushFolder(const std::string& folder) {
  const sys::SyscallTable& calls = sys::Syscalls();
  const int fd = calls.open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC, 0);
  if (fd < 0) return;
  calls.fsync(fd);
  calls.close(fd);
}

}  // namespace

DWORD ResolveReplaceTarget(const std::string& posixPath, ReplaceTarget* target) {
  const sys::SyscallTable& calls = sys::Syscalls();
  std::string path = posixPath;
  for (int hop = 0; hop <= kMaxLinks; ++hop) {
    struct stat info {};
    if (calls.lstat(path.c_str(), &info) != 0) {
      if (errno != ENOENT) return PathError(errno, path);
      target->path = path;
      target->exists = false;
      return ERROR_SUCCESS;
    }
    if (!S_ISLNK(info.st_mode)) {
      if (!S_ISREG(info.st_mode)) return ERROR_ACCESS_DENIED;
      target->path = path;
      target->exists = true;
      target->info = info;
      return ERROR_SUCCESS;
    }
    std::string link(static_cast<std::size_t>(info.st_size > 0 ? info.st_size : 255) + 1, '\0');
    for (;;) {
      const ssize_t length = calls.readlink(path.c_str(), link.data(), link.size());
      if (length < 0) return PathError(errno, path);
      if (static_cast<std::size_t>(length) < link.size()) {
        link.resize(static_cast<std::size_t>(length));
        break;
      }
      link.resize(link.size() * 2);
    }
    path = !link.empty() && link.front() == '/' ? link : ParentFolder(path) + "/" + link;
  }
  return ERROR_PATH_NOT_FOUND;  // a loop of links, as ELOOP reports
}

DWORD ReplaceFileContent(const ReplaceTarget& target, std::string_view bytes, FileId* written) {
  const sys::SyscallTable& calls = sys::Syscalls();
  const std::string folder = ParentFolder(target.path);
  const std::string name = BaseName(target.path);
  // An existing file's copy starts private and gets the old permissions once complete.
  const mode_t permissions = target.exists ? 0600 : kNewFilePermissions;
  std::string temporary;
  int fd = -1;
  for (int attempt = 0; attempt < kNameAttempts && fd < 0; ++attempt) {
    temporary = TemporaryName(folder, name);
    fd = calls.open(temporary.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, permissions);
    if (fd < 0 && errno != EEXIST) return PathError(errno, temporary);
  }
  if (fd < 0) return ERROR_FILE_EXISTS;

  DWORD error = WriteAll(fd, bytes);
  if (error == ERROR_SUCCESS && calls.fsync(fd) != 0) error = ErrorFromErrno(errno);
  if (error == ERROR_SUCCESS) error = CarryOver(fd, target);
  struct stat info {};
  if (error == ERROR_SUCCESS && calls.fstat(fd, &info) != 0) error = ErrorFromErrno(errno);
  if (calls.close(fd) != 0 && error == ERROR_SUCCESS) error = ErrorFromErrno(errno);
  if (error == ERROR_SUCCESS && calls.rename(temporary.c_str(), target.path.c_str()) != 0) {
    error = PathError(errno, target.path);
  }
  if (error != ERROR_SUCCESS) {
    calls.unlink(temporary.c_str());
    return error;
  }
  FlushFolder(folder);
  *written = FileId{info.st_dev, info.st_ino};
  return ERROR_SUCCESS;
}

}  // namespace win32::detail
