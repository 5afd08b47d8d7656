// Process services: identifiers, yielding, and debugger detection under a real tracer.

#include "win32/process.h"

#include <gtest/gtest.h>
#include <sys/ptrace.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <thread>

namespace {

using namespace win32;

TEST(Process, ThreadIdentifiersDiffer) {
  const DWORD mine = GetCurrentThreadId();
  DWORD other = mine;
  std::thread([&] { other = GetCurrentThreadId(); }).join();
  EXPECT_TRUE(other != mine && other != 0u);
  EXPECT_NE(SwitchToThread(), FALSE);
}

// Runs body in a child process that a tracer (this process) is attached to; returns the child's
// exit status, or -1 when tracing is not permitted here. SIGTRAP stops of the child are counted in
// *traps and the child is resumed without the signal.
int RunTraced(void (*body)(), int* traps) {
  const pid_t child = fork();
  if (child == 0) {
    if (ptrace(PTRACE_TRACEME, 0, nullptr, nullptr) != 0) _exit(77);
    body();
    _exit(0);
  }
  *traps = 0;
  for (;;) {
    int status = 0;
    if (waitpid(child, &status, 0) != child) return -1;
    if (WIFEXITED(status)) return WEXITSTATUS(status) == 77 ? -1 : WEXITSTATUS(status);
    if (WIFSIGNALED(status)) return 128 + WTERMSIG(status);
    const int signal = WSTOPSIG(status);  // otherwise the child stopped
    *traps += signal == SIGTRAP;
    ptrace(PTRACE_CONT, child, nullptr, signal == SIGTRAP ? 0 : signal);
  }
}

TEST(Process, DebuggerPresenceAndBreaks) {
  EXPECT_EQ(IsDebuggerPresent(), FALSE) << "the tests do not run under a debugger";
  DebugBreak();  // without a debugger: returns, no signal

  int traps = 0;
  const int status = RunTraced(
      [] {
        if (!IsDebuggerPresent()) _exit(3);
        DebugBreak();
        DebugBreak();
      },
      &traps);
  if (status == -1) GTEST_SKIP() << "ptrace is not permitted here";
  EXPECT_EQ(status, 0) << "the traced child sees its debugger";
  EXPECT_EQ(traps, 2) << "each break stops in the debugger";
}

}  // namespace
