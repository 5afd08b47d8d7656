// Child processes of the test executable: spawned with posix_spawn, output read through a pipe.

#include "support/child_process.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>

extern char** environ;

namespace vyn::test {

namespace {

constexpr const char* kChildMarker = "VYN_TEST_CHILD";

std::string NameOf(const char* entry) {
  const char* eq = std::strchr(entry, '=');
  return eq ? std::string(entry, eq) : std::string(entry);
}

// The inherited environment without GoogleTest's variables and without those env sets, then env.
std::vector<std::string> ChildEnvironment(const EnvironmentVariables& env) {
  std::vector<std::string> entries;
  for (char** p = environ; *p; ++p) {
    const std::string name = NameOf(*p);
    bool replaced = name.rfind("GTEST_", 0) == 0;
    for (const auto& [key, value] : env) replaced = replaced || key == name;
    if (!replaced) entries.emplace_back(*p);
  }
  for (const auto& [key, value] : env) entries.push_back(key + "=" + value);
  return entries;
}

std::vector<char*> PointersTo(std::vector<std::string>& texts) {
  std::vector<char*> pointers;
  for (std::string& text : texts) pointers.push_back(text.data());
  pointers.push_back(nullptr);
  return pointers;
}

std::string ReadAll(int fd) {
  std::string out;
  char chunk[4096];
  for (;;) {
    const ssize_t n = read(fd, chunk, sizeof(chunk));
    if (n > 0) {
      out.append(chunk, static_cast<std::size_t>(n));
    } else if (n == 0 || errno != EINTR) {
      return out;
    }
  }
}

}  // namespace

ChildResult RunChild(const std::string& program, const std::vector<std::string>& args,
                     const EnvironmentVariables& env) {
  int pipeFds[2];
  if (pipe(pipeFds) != 0) return {-1, std::string("pipe: ") + std::strerror(errno)};
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_adddup2(&actions, pipeFds[1], STDOUT_FILENO);
  posix_spawn_file_actions_adddup2(&actions, pipeFds[1], STDERR_FILENO);
  posix_spawn_file_actions_addclose(&actions, pipeFds[0]);
  posix_spawn_file_actions_addclose(&actions, pipeFds[1]);

  std::vector<std::string> argTexts = args;
  std::vector<std::string> envTexts = ChildEnvironment(env);
  std::vector<char*> argv = PointersTo(argTexts);
  std::vector<char*> envp = PointersTo(envTexts);
  pid_t pid = 0;
  const int spawnError = posix_spawn(&pid, program.c_str(), &actions, nullptr, argv.data(), envp.data());
  posix_spawn_file_actions_destroy(&actions);
  close(pipeFds[1]);
  if (spawnError != 0) {
    close(pipeFds[0]);
    return {-1, "posix_spawn " + program + ": " + std::strerror(spawnError)};
  }
  ChildResult result{0, ReadAll(pipeFds[0])};
  close(pipeFds[0]);
  result.exitCode = WaitForChild(pid);
  return result;
}

testing::AssertionResult RunCurrentTestInChild(const EnvironmentVariables& env) {
  const testing::TestInfo* test = testing::UnitTest::GetInstance()->current_test_info();
  if (!test) return testing::AssertionFailure() << "no test is running";
  const std::string name = std::string(test->test_suite_name()) + "." + test->name();
  EnvironmentVariables childEnv = env;
  childEnv.emplace_back(kChildMarker, "1");
  const ChildResult child = RunChild("/proc/self/exe", {"vyn_test_child", "--gtest_filter=" + name}, childEnv);
  // The filter must have matched: a child that ran nothing would pass without checking anything.
  const bool ranOne = child.output.find("[  PASSED  ] 1 test.") != std::string::npos;
  if (child.exitCode == 0 && ranOne) return testing::AssertionSuccess();
  return testing::AssertionFailure() << "child run of " << name << " exited with " << child.exitCode
                                     << ":\n" << child.output;
}

int StartCurrentTestInChild(const EnvironmentVariables& env) {
  const testing::TestInfo* test = testing::UnitTest::GetInstance()->current_test_info();
  if (!test) return -1;
  EnvironmentVariables childEnv = env;
  childEnv.emplace_back(kChildMarker, "1");
  std::vector<std::string> argTexts{"vyn_test_child",
                                    std::string("--gtest_filter=") + test->test_suite_name() + "." + test->name()};
  std::vector<std::string> envTexts = ChildEnvironment(childEnv);
  std::vector<char*> argv = PointersTo(argTexts);
  std::vector<char*> envp = PointersTo(envTexts);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
  posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
  pid_t pid = -1;
  const int spawnError = posix_spawn(&pid, "/proc/self/exe", &actions, nullptr, argv.data(), envp.data());
  posix_spawn_file_actions_destroy(&actions);
  return spawnError == 0 ? pid : -1;
}

int WaitForChild(int pid) {
  int status = 0;
  while (waitpid(pid, &status, 0) < 0) {
    if (errno != EINTR) return -1;
  }
  return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

bool InChildProcess() {
  const char* marker = std::getenv(kChildMarker);
  return marker && marker[0] == '1';
}

}  // namespace vyn::test
