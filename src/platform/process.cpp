// Process and thread services: yielding, debugger detection and breaks, identifiers.

#include "win32/process.h"

#include <fcntl.h>
#include <sched.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>

namespace win32 {

namespace {

// The TracerPid field of /proc/self/status: nonzero while a debugger (any ptrace tracer) is
// attached. Read afresh on every call, since a debugger may attach at any time.
bool HasTracer() noexcept {
  const int fd = ::open("/proc/self/status", O_RDONLY | O_CLOEXEC);
  if (fd < 0) return false;
  char text[4096];
  std::size_t used = 0;
  for (;;) {
    const ssize_t got = ::read(fd, text + used, sizeof text - 1 - used);
    if (got < 0 && errno == EINTR) continue;
    if (got <= 0) break;
    used += static_cast<std::size_t>(got);
    if (used == sizeof text - 1) break;
  }
  ::close(fd);
  text[used] = '\0';
  const char* field = std::strstr(text, "\nTracerPid:");
  return field != nullptr && std::strtol(field + 11, nullptr, 10) != 0;
}

}  // namespace

BOOL SwitchToThread() noexcept {
  // The kernel does not say whether another thread ran; a successful yield is reported as one.
  return ::sched_yield() == 0 ? TRUE : FALSE;
}

BOOL IsDebuggerPresent() noexcept { return HasTracer() ? TRUE : FALSE; }

void DebugBreak() noexcept {
  if (HasTracer()) std::raise(SIGTRAP);
}

DWORD GetCurrentProcessId() noexcept { return static_cast<DWORD>(::getpid()); }

DWORD GetCurrentThreadId() noexcept { return static_cast<DWORD>(::gettid()); }

}  // namespace win32
