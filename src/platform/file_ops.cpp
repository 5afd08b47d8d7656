// DeleteFileW, CopyFileW and MoveFileExW: file-system calls wrapped in Windows' checks (share
// modes, read-only files, folders) and Windows' error codes.

#include "win32/file_ops.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <string>

#include "file_copy.h"
#include "file_object.h"
#include "path_errors.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/file_handle.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

constexpr DWORD kMoveFlags = MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED |
                             MOVEFILE_WRITE_THROUGH;

BOOL Fail(DWORD error) {
  SetLastError(error);
  return FALSE;
}

bool SameFile(const struct stat& a, const struct stat& b) {
  return a.st_dev == b.st_dev && a.st_ino == b.st_ino;
}

bool IsReadOnly(const struct stat& info) { return (info.st_mode & S_IWUSR) == 0; }

// Holds delete access to a regular file while it is renamed or removed, so that a handle that
// denies deletion (here or in another process) makes the operation fail; error on a violation.
DWORD ClaimDeletion(const std::string& path, const struct stat& info,
                    std::shared_ptr<detail::FileObject>* claim) {
  if (!S_ISREG(info.st_mode)) return ERROR_SUCCESS;  // links, folders: no share modes
  detail::OpenRequest request;
  request.rights = detail::kRightDelete;
  request.share = detail::kAllRights;
  request.disposition = OPEN_EXISTING;
  detail::OpenOutcome outcome = detail::OpenFileObject(path, request);
  *claim = std::move(outcome.file);
  return *claim != nullptr ? ERROR_SUCCESS : outcome.error;
}

// Removes path when it still names the file described by info.
void RemoveIfSame(const std::string& path, const struct stat& info) {
  struct stat now {};
  if (sys::Syscalls().lstat(path.c_str(), &now) == 0 && SameFile(now, info)) {
    sys::Syscalls().unlink(path.c_str());
  }
}

void FlushFolderOf(const std::string& path) {
  const sys::SyscallTable& calls = sys::Syscalls();
  const int fd = calls.open(detail::ParentFolder(path).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC, 0);
  if (fd < 0) return;
  calls.fsync(fd);
  calls.close(fd);
}

// rename that replaces the target only when asked; file systems without the no-replace rename
// fall back to a check first.
int Rename(const std::string& from, const std::string& to, bool replace) {
  const sys::SyscallTable& calls = sys::Syscalls();
  if (replace) return calls.rename(from.c_str(), to.c_str());
  if (calls.renameNoReplace(from.c_str(), to.c_str()) == 0) return 0;
  if (errno != EINVAL) return -1;
  struct stat info {};
  if (calls.lstat(to.c_str(), &info) == 0) {
    errno = EEXIST;
    return -1;
  }
  return calls.rename(from.c_str(), to.c_str());
}

// A name beside target for a copy in progress; unique within the process and across processes.
std::string TemporaryBeside(const std::string& target) {
  static std::atomic<unsigned> counter{0};
  return detail::ParentFolder(target) + "/.vyn-move-" + std::to_string(::getpid()) + "-" +
         std::to_string(counter++);
}

// A move to another file system: copy beside the target, flush, rename over it, then delete the
// source. Until the rename the target is untouched; the source goes only after it.
DWORD MoveAcrossDevices(const std::string& from, const std::string& to, bool replace,
                        const struct stat& sourceInfo) {
  const sys::SyscallTable& calls = sys::Syscalls();
  const int source = calls.open(from.c_str(), O_RDONLY | O_CLOEXEC, 0);
  if (source < 0) return detail::PathError(errno, from);
  std::string temporary;
  int target = -1;
  for (int attempt = 0; attempt < 16 && target < 0; ++attempt) {
    temporary = TemporaryBeside(to);
    target = calls.open(temporary.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600);
    if (target < 0 && errno != EEXIST) break;
  }
  if (target < 0) {
    const DWORD error = detail::PathError(errno, to);
    calls.close(source);
    return error;
  }
  DWORD error = detail::CopyBytes(source, target);
  if (error == ERROR_SUCCESS) error = detail::CopyMetadata(sourceInfo, target);
  if (error == ERROR_SUCCESS && calls.fsync(target) != 0) error = ErrorFromErrno(errno);
  calls.close(source);
  calls.close(target);
  if (error == ERROR_SUCCESS && Rename(temporary, to, replace) != 0) {
    error = errno == EEXIST ? ERROR_ALREADY_EXISTS : detail::PathError(errno, to);
  }
  if (error != ERROR_SUCCESS) {
    calls.unlink(temporary.c_str());
    return error;
  }
  calls.unlink(from.c_str());  // as on Windows, a source that cannot go stays, and that is all
  return ERROR_SUCCESS;
}

DWORD RenameError(int error, bool sourceIsFolder) {
  switch (error) {
    case EEXIST: return ERROR_ALREADY_EXISTS;
    case ENOENT:
    case ENOTDIR: return ERROR_PATH_NOT_FOUND;  // the source exists: the target's folder is missing
    case EISDIR:
    case ENOTEMPTY: return ERROR_ACCESS_DENIED;
    case EXDEV: return ERROR_NOT_SAME_DEVICE;
    default: return sourceIsFolder && error == EINVAL ? ERROR_ACCESS_DENIED : ErrorFromErrno(error);
  }
}

}  // namespace

BOOL DeleteFileW(LPCWSTR lpFileName) {
  std::string path;
  if (!detail::MapPathArgument(lpFileName, &path)) return FALSE;
  const sys::SyscallTable& calls = sys::Syscalls();
  struct stat info {};
  if (calls.lstat(path.c_str(), &info) != 0) return Fail(detail::PathError(errno, path));
  if (S_ISDIR(info.st_mode)) return Fail(ERROR_ACCESS_DENIED);
  if (S_ISREG(info.st_mode) && IsReadOnly(info)) return Fail(ERROR_ACCESS_DENIED);
  std::shared_ptr<detail::FileObject> claim;
  const DWORD claimed = ClaimDeletion(path, info, &claim);
  if (claimed != ERROR_SUCCESS) return Fail(claimed);
  if (calls.unlink(path.c_str()) != 0) return Fail(detail::PathError(errno, path));
  return TRUE;
}

BOOL CopyFileW(LPCWSTR lpExistingFileName, LPCWSTR lpNewFileName, BOOL bFailIfExists) {
  std::string from, to;
  if (!detail::MapPathArgument(lpExistingFileName, &from) ||
      !detail::MapPathArgument(lpNewFileName, &to)) {
    return FALSE;
  }
  const sys::SyscallTable& calls = sys::Syscalls();
  detail::OpenRequest reading;
  reading.rights = detail::kRightRead;
  reading.share = detail::kAllRights;
  reading.disposition = OPEN_EXISTING;
  reading.advice = POSIX_FADV_SEQUENTIAL;
  detail::OpenOutcome source = detail::OpenFileObject(from, reading);
  if (source.file == nullptr) return Fail(source.error);
  struct stat sourceInfo {}, targetInfo {};
  if (calls.fstat(source.file->fd(), &sourceInfo) != 0) return Fail(ErrorFromErrno(errno));
  // Copying a file onto itself would cut it before reading it.
  if (calls.stat(to.c_str(), &targetInfo) == 0 && SameFile(sourceInfo, targetInfo)) {
    return Fail(ERROR_SHARING_VIOLATION);
  }

  detail::OpenRequest writing;
  writing.rights = detail::kRightWrite;
  writing.disposition = bFailIfExists ? CREATE_NEW : CREATE_ALWAYS;
  detail::OpenOutcome target = detail::OpenFileObject(to, writing);
  if (target.file == nullptr) return Fail(target.error);
  if (calls.fstat(target.file->fd(), &targetInfo) != 0) return Fail(ErrorFromErrno(errno));
  DWORD error = detail::CopyBytes(source.file->fd(), target.file->fd());
  if (error == ERROR_SUCCESS) error = detail::CopyMetadata(sourceInfo, target.file->fd());
  if (error == ERROR_SUCCESS) return TRUE;
  RemoveIfSame(to, targetInfo);
  return Fail(error);
}

BOOL MoveFileExW(LPCWSTR lpExistingFileName, LPCWSTR lpNewFileName, DWORD dwFlags) {
  if (lpNewFileName == nullptr || (dwFlags & ~kMoveFlags) != 0) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  std::string from, to;
  if (!detail::MapPathArgument(lpExistingFileName, &from) ||
      !detail::MapPathArgument(lpNewFileName, &to)) {
    return FALSE;
  }
  const bool replace = (dwFlags & MOVEFILE_REPLACE_EXISTING) != 0;
  const sys::SyscallTable& calls = sys::Syscalls();
  struct stat sourceInfo {}, targetInfo {};
  if (calls.lstat(from.c_str(), &sourceInfo) != 0) return Fail(detail::PathError(errno, from));
  const bool sourceIsFolder = S_ISDIR(sourceInfo.st_mode);

  std::shared_ptr<detail::FileObject> targetClaim, sourceClaim;
  if (calls.lstat(to.c_str(), &targetInfo) == 0) {
    if (!replace) return Fail(ERROR_ALREADY_EXISTS);
    if (SameFile(sourceInfo, targetInfo)) {
      // Two names of one file: rename would keep both; the move leaves only the target's name.
      if (from == to) return TRUE;
      if (calls.unlink(from.c_str()) != 0) return Fail(detail::PathError(errno, from));
      return TRUE;
    }
    if (sourceIsFolder || S_ISDIR(targetInfo.st_mode) ||
        (S_ISREG(targetInfo.st_mode) && IsReadOnly(targetInfo))) {
      return Fail(ERROR_ACCESS_DENIED);
    }
    const DWORD claimed = ClaimDeletion(to, targetInfo, &targetClaim);
    if (claimed != ERROR_SUCCESS) return Fail(claimed);
  }
  const DWORD claimed = ClaimDeletion(from, sourceInfo, &sourceClaim);
  if (claimed != ERROR_SUCCESS) return Fail(claimed);

  if (Rename(from, to, replace) != 0) {
    const int error = errno;
    if (error != EXDEV || (dwFlags & MOVEFILE_COPY_ALLOWED) == 0 || !S_ISREG(sourceInfo.st_mode)) {
      return Fail(RenameError(error, sourceIsFolder));
    }
    const DWORD moved = MoveAcrossDevices(from, to, replace, sourceInfo);
    if (moved != ERROR_SUCCESS) return Fail(moved);
  }
  if ((dwFlags & MOVEFILE_WRITE_THROUGH) != 0) FlushFolderOf(to);
  return TRUE;
}

}  // namespace win32
