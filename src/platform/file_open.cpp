// Opening files by the rules of CreateFileW: dispositions, the read-only and folder checks,
// share modes before truncation, delete-on-close.

#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>

#include "file_object.h"
#include "file_size_signal.h"
#include "module_search.h"
#include "path_errors.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/file_handle.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

constexpr mode_t kNewFilePermissions = 0666;  // less the umask, as for any new file
constexpr int kAttempts = 4;  // tries when the file comes and goes between two calls

bool Creates(unsigned disposition) {
  return disposition == CREATE_NEW || disposition == CREATE_ALWAYS || disposition == OPEN_ALWAYS;
}

bool Truncates(unsigned disposition) {
  return disposition == CREATE_ALWAYS || disposition == TRUNCATE_EXISTING;
}

struct Descriptor {
  int fd = -1;
  bool lockable = false;  // open for reading, so it can take read locks
};

// Opens with the access mode the rights need. Write access also asks for read access, which the
// share locks need; a file the caller may write but not read is opened write-only. An open
// without data rights reads nothing; when even that is refused it keeps only a path reference.
Descriptor OpenDescriptor(const std::string& path, unsigned rights, int flags, mode_t mode) {
  const sys::SyscallTable& calls = sys::Syscalls();
  const bool read = (rights & kRightRead) != 0;
  const bool write = (rights & kRightWrite) != 0;
  flags |= O_CLOEXEC;
  if (write) {
    int fd = calls.open(path.c_str(), flags | O_RDWR, mode);
    if (fd >= 0) return {fd, true};
    if (errno != EACCES || read) return {};
    return {calls.open(path.c_str(), flags | O_WRONLY, mode), false};
  }
  if (read) return {calls.open(path.c_str(), flags | O_RDONLY, mode), true};
  int fd = calls.open(path.c_str(), flags | O_RDONLY | O_NONBLOCK, mode);
  if (fd >= 0 || errno != EACCES || (flags & O_CREAT) != 0) return {fd, true};
  return {calls.open(path.c_str(), O_PATH | O_CLOEXEC, 0), false};
}

OpenOutcome Failure(DWORD error) {
  OpenOutcome outcome;
  outcome.error = error;
  return outcome;
}

OpenOutcome FailAndClose(int fd, DWORD error) {
  sys::Syscalls().close(fd);
  return Failure(error);
}

}  // namespace

FileObject::~FileObject() {
  claim_ = ShareClaim();  // the share entry goes first (and with it a pending deletion)
  sys::Syscalls().close(fd_);
}

OpenOutcome OpenFileObject(const std::string& posixPath, const OpenRequest& request) {
  const sys::SyscallTable& calls = sys::Syscalls();
  const unsigned rights = request.rights | (request.deleteOnClose ? kRightDelete : 0);
  const int flags = request.writeThrough ? O_DSYNC : 0;
  const mode_t permissions = request.createReadOnly ? (kNewFilePermissions & ~0222) : kNewFilePermissions;

  Descriptor opened;
  bool existed = false;
  for (int attempt = 0; attempt < kAttempts && opened.fd < 0; ++attempt) {
    if (Creates(request.disposition)) {
      opened = OpenDescriptor(posixPath, rights, flags | O_CREAT | O_EXCL, permissions);
      if (opened.fd >= 0) break;
      if (errno != EEXIST) return Failure(PathError(errno, posixPath));
      if (request.disposition == CREATE_NEW) return Failure(ERROR_FILE_EXISTS);
    }
    opened = OpenDescriptor(posixPath, rights, flags, 0);
    if (opened.fd >= 0) {
      existed = true;
      break;
    }
    // A file that vanished after O_EXCL saw it is created on the next round.
    if (errno != ENOENT || !Creates(request.disposition)) {
      return Failure(PathError(errno, posixPath));
    }
  }
  if (opened.fd < 0) return Failure(PathError(errno, posixPath));

  struct stat info {};
  if (calls.fstat(opened.fd, &info) != 0) return FailAndClose(opened.fd, ErrorFromErrno(errno));
  if (S_ISDIR(info.st_mode)) return FailAndClose(opened.fd, ERROR_ACCESS_DENIED);
  // The read-only attribute binds everyone on Windows, administrators included.
  const bool changes = (rights & kRightWrite) != 0 || request.deleteOnClose ||
                       Truncates(request.disposition);
  if (existed && changes && (info.st_mode & S_IWUSR) == 0) {
    return FailAndClose(opened.fd, ERROR_ACCESS_DENIED);
  }

  ShareClaim claim;
  const DWORD shared = ShareClaim::Take(opened.fd, opened.lockable,
                                        FileId{info.st_dev, info.st_ino}, rights, request.share,
                                        &claim);
  if (shared != ERROR_SUCCESS) return FailAndClose(opened.fd, shared);
  auto file = std::make_shared<FileObject>(opened.fd, rights, std::move(claim));

  if (existed && Truncates(request.disposition) && info.st_size != 0) {
    FileSizeSignalGuard guard;
    if (calls.ftruncate(file->fd(), 0) != 0) return Failure(ErrorFromErrno(errno));
  }
  // Marked only now that the open has succeeded: a failed open deletes nothing. The path is made
  // absolute so that a change of the current folder does not send the deletion elsewhere.
  if (request.deleteOnClose) file->DeleteWhenLastCloses(AbsolutePath(posixPath));
  if (request.advice != 0) calls.fadvise(file->fd(), 0, 0, request.advice);

  OpenOutcome outcome;
  outcome.file = std::move(file);
  outcome.existed = existed;
  return outcome;
}

}  // namespace win32::detail
