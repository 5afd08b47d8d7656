// Blocking and taking back SIGXFSZ around file-growing calls.

#include "file_size_signal.h"

#include <pthread.h>

#include <cerrno>
#include <ctime>

namespace win32::detail {

namespace {

sigset_t FileSizeSignal() {
  sigset_t set;
  sigemptyset(&set);
  sigaddset(&set, SIGXFSZ);
  return set;
}

}  // namespace

FileSizeSignalGuard::FileSizeSignalGuard() noexcept {
  const sigset_t block = FileSizeSignal();
  pthread_sigmask(SIG_BLOCK, &block, &saved_);
  wasBlocked_ = sigismember(&saved_, SIGXFSZ) == 1;
}

FileSizeSignalGuard::~FileSizeSignalGuard() {
  if (wasBlocked_) return;  // the caller blocks it for reasons of its own
  const int savedErrno = errno;
  const sigset_t signal = FileSizeSignal();
  sigset_t pending;
  if (sigpending(&pending) == 0 && sigismember(&pending, SIGXFSZ) == 1) {
    const timespec noWait{};
    while (sigtimedwait(&signal, nullptr, &noWait) == SIGXFSZ) {
    }
  }
  pthread_sigmask(SIG_SETMASK, &saved_, nullptr);
  errno = savedErrno;
}

}  // namespace win32::detail
