#pragma once
// Running a test again in a child process of the test executable, for behaviour that is fixed
// once per process (the narrow code page, process-wide settings read at start-up) or that needs
// several processes.

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace vyn::test {

// Variables set in the child, over the inherited environment. An empty value sets the variable
// to the empty text, which the library's readers take as unset.
using EnvironmentVariables = std::vector<std::pair<std::string, std::string>>;

struct ChildResult {
  int exitCode;        // the exit status, or 128 + the signal number when a signal ended it
  std::string output;  // standard output and standard error, interleaved
};

// Runs program with arguments args (args[0] included) and the current environment changed by
// env. GoogleTest's own variables (GTEST_*) are not passed on, so a child never writes the
// parent's reports or runs another shard. Waits for the child to end.
ChildResult RunChild(const std::string& program, const std::vector<std::string>& args,
                     const EnvironmentVariables& env);

// Runs the test that is running now again, alone, in a new process of this executable
// (--gtest_filter=<its full name>) with env set and VYN_TEST_CHILD=1. Succeeds when the child
// ran that one test and it passed; a failure carries the child's output. The test body tells the
// two runs apart with InChildProcess().
testing::AssertionResult RunCurrentTestInChild(const EnvironmentVariables& env);

// Starts the running test again in a new process as RunCurrentTestInChild does, without
// waiting for it and with its output discarded. Returns its process id, -1 on failure.
int StartCurrentTestInChild(const EnvironmentVariables& env);
// Waits for a child started by StartCurrentTestInChild: its exit status, or 128 + the signal
// number when a signal ended it.
int WaitForChild(int pid);

// True inside a child started by RunCurrentTestInChild.
bool InChildProcess();

}  // namespace vyn::test
