// Reading, writing, seeking, cutting and flushing through file handles.

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstddef>

#include "file_object.h"
#include "file_size_signal.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/file_handle.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

// The most one read or write call is asked to move; larger transfers loop.
constexpr std::size_t kChunk = std::size_t{1} << 30;

BOOL Fail(DWORD error) {
  SetLastError(error);
  return FALSE;
}

std::shared_ptr<detail::FileObject> FileOf(HANDLE handle) {
  std::shared_ptr<detail::FileObject> file = detail::FindHandleOf<detail::FileObject>(handle);
  if (file == nullptr) SetLastError(ERROR_INVALID_HANDLE);
  return file;
}

}  // namespace

BOOL ReadFile(HANDLE hFile, void* lpBuffer, DWORD nNumberOfBytesToRead, DWORD* lpNumberOfBytesRead,
              OVERLAPPED* lpOverlapped) {
  std::shared_ptr<detail::FileObject> file = FileOf(hFile);
  if (file == nullptr) return FALSE;
  if (lpNumberOfBytesRead != nullptr) *lpNumberOfBytesRead = 0;
  if (lpOverlapped != nullptr || lpNumberOfBytesRead == nullptr ||
      (lpBuffer == nullptr && nNumberOfBytesToRead != 0)) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  if (!file->CanRead()) return Fail(ERROR_ACCESS_DENIED);
  auto* bytes = static_cast<std::byte*>(lpBuffer);
  std::size_t done = 0;
  while (done < nNumberOfBytesToRead) {
    const ssize_t got = sys::Syscalls().read(
        file->fd(), bytes + done, std::min<std::size_t>(nNumberOfBytesToRead - done, kChunk));
    if (got < 0 && errno == EINTR) continue;
    if (got < 0) {
      *lpNumberOfBytesRead = static_cast<DWORD>(done);
      return Fail(ErrorFromErrno(errno));
    }
    if (got == 0) break;
    done += static_cast<std::size_t>(got);
  }
  *lpNumberOfBytesRead = static_cast<DWORD>(done);
  return TRUE;
}

BOOL WriteFile(HANDLE hFile, const void* lpBuffer, DWORD nNumberOfBytesToWrite,
               DWORD* lpNumberOfBytesWritten, OVERLAPPED* lpOverlapped) {
  std::shared_ptr<detail::FileObject> file = FileOf(hFile);
  if (file == nullptr) return FALSE;
  if (lpNumberOfBytesWritten != nullptr) *lpNumberOfBytesWritten = 0;
  if (lpOverlapped != nullptr || lpNumberOfBytesWritten == nullptr ||
      (lpBuffer == nullptr && nNumberOfBytesToWrite != 0)) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  if (!file->CanWrite()) return Fail(ERROR_ACCESS_DENIED);
  const auto* bytes = static_cast<const std::byte*>(lpBuffer);
  std::size_t done = 0;
  detail::FileSizeSignalGuard guard;
  while (done < nNumberOfBytesToWrite) {
    const ssize_t put = sys::Syscalls().write(
        file->fd(), bytes + done, std::min<std::size_t>(nNumberOfBytesToWrite - done, kChunk));
    if (put < 0 && errno == EINTR) continue;
    if (put <= 0) {
      // A write that moves nothing without an error is a full device as well.
      *lpNumberOfBytesWritten = static_cast<DWORD>(done);
      return Fail(put < 0 ? ErrorFromErrno(errno) : ERROR_DISK_FULL);
    }
    done += static_cast<std::size_t>(put);
  }
  *lpNumberOfBytesWritten = static_cast<DWORD>(done);
  return TRUE;
}

BOOL SetFilePointerEx(HANDLE hFile, LARGE_INTEGER liDistanceToMove, PLARGE_INTEGER lpNewFilePointer,
                      DWORD dwMoveMethod) {
  std::shared_ptr<detail::FileObject> file = FileOf(hFile);
  if (file == nullptr) return FALSE;
  static constexpr int kWhence[] = {SEEK_SET, SEEK_CUR, SEEK_END};
  if (dwMoveMethod > FILE_END) return Fail(ERROR_INVALID_PARAMETER);
  const off_t position =
      sys::Syscalls().lseek(file->fd(), liDistanceToMove.QuadPart, kWhence[dwMoveMethod]);
  if (position < 0) {
    // With a valid origin, lseek refuses only a result before the start.
    return Fail(errno == EINVAL ? ERROR_NEGATIVE_SEEK : ErrorFromErrno(errno));
  }
  if (lpNewFilePointer != nullptr) lpNewFilePointer->QuadPart = position;
  return TRUE;
}

BOOL SetEndOfFile(HANDLE hFile) {
  std::shared_ptr<detail::FileObject> file = FileOf(hFile);
  if (file == nullptr) return FALSE;
  if (!file->CanWrite()) return Fail(ERROR_ACCESS_DENIED);
  const sys::SyscallTable& calls = sys::Syscalls();
  const off_t position = calls.lseek(file->fd(), 0, SEEK_CUR);
  if (position < 0) return Fail(ErrorFromErrno(errno));
  detail::FileSizeSignalGuard guard;
  if (calls.ftruncate(file->fd(), position) != 0) return Fail(ErrorFromErrno(errno));
  return TRUE;
}

BOOL FlushFileBuffers(HANDLE hFile) {
  std::shared_ptr<detail::FileObject> file = FileOf(hFile);
  if (file == nullptr) return FALSE;
  if (!file->CanWrite()) return Fail(ERROR_ACCESS_DENIED);
  if (sys::Syscalls().fsync(file->fd()) != 0) return Fail(ErrorFromErrno(errno));
  return TRUE;
}

BOOL GetFileSizeEx(HANDLE hFile, PLARGE_INTEGER lpFileSize) {
  std::shared_ptr<detail::FileObject> file = FileOf(hFile);
  if (file == nullptr) return FALSE;
  if (lpFileSize == nullptr) return Fail(ERROR_INVALID_PARAMETER);
  struct stat info {};
  if (sys::Syscalls().fstat(file->fd(), &info) != 0) return Fail(ErrorFromErrno(errno));
  lpFileSize->QuadPart = info.st_size;
  return TRUE;
}

}  // namespace win32
