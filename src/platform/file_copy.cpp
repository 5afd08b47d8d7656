// Byte and metadata copies between descriptors.

#include "file_copy.h"

#include <cerrno>
#include <ctime>
#include <vector>

#include "file_size_signal.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {
constexpr std::size_t kCopyBlock = std::size_t{1} << 20;
}

DWORD CopyBytes(int source, int target) {
  const sys::SyscallTable& calls = sys::Syscalls();
  std::vector<char> block(kCopyBlock);
  FileSizeSignalGuard guard;
  for (;;) {
    const ssize_t got = calls.read(source, block.data(), block.size());
    if (got < 0 && errno == EINTR) continue;
    if (got < 0) return ErrorFromErrno(errno);
    if (got == 0) return ERROR_SUCCESS;
    for (ssize_t done = 0; done < got;) {
      const ssize_t put = calls.write(target, block.data() + done, static_cast<size_t>(got - done));
      if (put < 0 && errno == EINTR) continue;
      if (put <= 0) return put < 0 ? ErrorFromErrno(errno) : ERROR_DISK_FULL;
      done += put;
    }
  }
}

DWORD CopyMetadata(const struct stat& sourceInfo, int target) {
  const sys::SyscallTable& calls = sys::Syscalls();
  if (calls.fchmod(target, sourceInfo.st_mode & 07777) != 0) return ErrorFromErrno(errno);
  const timespec times[2] = {sourceInfo.st_atim, sourceInfo.st_mtim};
  if (calls.futimens(target, times) != 0) return ErrorFromErrno(errno);
  return ERROR_SUCCESS;
}

}  // namespace win32::detail
