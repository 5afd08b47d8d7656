// _fseeki64, _ftelli64, _fileno and _chsize_s over the C library's streams and ftruncate.

#include "win32/crt_file.h"

#include <cerrno>

#include "file_size_signal.h"
#include "syscalls.h"

namespace win32 {
namespace {

// The runtime reports a write stopped by a quota or the file-size limit as a full disk.
void DiskFullAsENOSPC() {
  if (errno == EFBIG || errno == EDQUOT) errno = ENOSPC;
}

}  // namespace

std::size_t fread(void* buffer, std::size_t size, std::size_t count, FILE* stream) {
  if (stream == nullptr) {
    errno = EINVAL;
    return 0;
  }
  return sys::Syscalls().fread(buffer, size, count, stream);
}

std::size_t fwrite(const void* data, std::size_t size, std::size_t count, FILE* stream) {
  if (stream == nullptr) {
    errno = EINVAL;
    return 0;
  }
  detail::FileSizeSignalGuard guard;
  const std::size_t written = sys::Syscalls().fwrite(data, size, count, stream);
  if (written < count) DiskFullAsENOSPC();
  return written;
}

int fflush(FILE* stream) {
  detail::FileSizeSignalGuard guard;
  const int result = sys::Syscalls().fflush(stream);
  if (result != 0) DiskFullAsENOSPC();
  return result;
}

int fclose(FILE* stream) {
  if (stream == nullptr) {
    errno = EINVAL;
    return EOF;
  }
  detail::FileSizeSignalGuard guard;
  const int result = sys::Syscalls().fclose(stream);
  if (result != 0) DiskFullAsENOSPC();
  return result;
}

int _fseeki64(FILE* stream, LONGLONG offset, int origin) {
  if (stream == nullptr || (origin != SEEK_SET && origin != SEEK_CUR && origin != SEEK_END)) {
    errno = EINVAL;
    return -1;
  }
  detail::FileSizeSignalGuard guard;  // a seek writes what is buffered
  if (sys::Syscalls().fseeko(stream, offset, origin) == 0) return 0;
  DiskFullAsENOSPC();
  return -1;
}

LONGLONG _ftelli64(FILE* stream) {
  if (stream == nullptr) {
    errno = EINVAL;
    return -1;
  }
  return sys::Syscalls().ftello(stream);
}

int _fileno(FILE* stream) {
  if (stream == nullptr) {
    errno = EINVAL;
    return -1;
  }
  return ::fileno(stream);
}

errno_t _chsize_s(int fd, LONGLONG size) {
  errno_t error = 0;
  if (size < 0) {
    error = EINVAL;
  } else {
    detail::FileSizeSignalGuard guard;
    if (sys::Syscalls().ftruncate(fd, size) != 0) error = errno;
  }
  switch (error) {
    case EINVAL:
      // ftruncate says EINVAL for a descriptor not open for writing; the runtime says EBADF.
      if (size >= 0) error = EBADF;
      break;
    case EFBIG:
    case EDQUOT: error = ENOSPC; break;
    default: break;
  }
  if (error != 0) errno = error;
  return error;
}

}  // namespace win32
