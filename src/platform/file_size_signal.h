#pragma once
// A call that may grow a file past the process's file-size limit (RLIMIT_FSIZE) would raise
// SIGXFSZ, whose default action ends the process. While a FileSizeSignalGuard lives, the signal
// is blocked in the calling thread, so the call fails with EFBIG instead; a signal the call
// raised is taken back before the thread's mask is restored. errno survives the guard's end.

#include <signal.h>

namespace win32::detail {

class FileSizeSignalGuard {
 public:
  FileSizeSignalGuard() noexcept;
  ~FileSizeSignalGuard();
  FileSizeSignalGuard(const FileSizeSignalGuard&) = delete;
  FileSizeSignalGuard& operator=(const FileSizeSignalGuard&) = delete;

 private:
  sigset_t saved_;
  bool wasBlocked_ = false;
};

}  // namespace win32::detail
