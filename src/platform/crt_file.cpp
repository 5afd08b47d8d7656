// _fseeki64, _ftelli64, _fileno and _chsize_s over the C library's streams and ftruncate.

#include "win32/crt_file.h"

#include <cerrno>

#include "file_size_signal.h"
#include "syscalls.h"

namespace win32 {

int _fseeki64(FILE* stream, LONGLONG offset, int origin) {
  if (stream == nullptr || (origin != SEEK_SET && origin != SEEK_CUR && origin != SEEK_END)) {
    errno = EINVAL;
    return -1;
  }
  return sys::Syscalls().fseeko(stream, offset, origin) == 0 ? 0 : -1;
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
