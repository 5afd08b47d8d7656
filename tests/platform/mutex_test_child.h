#pragma once
// A second process for the cross-process mutex tests: this test program again, running only
// MutexChild.Run, which acts on one named mutex as its environment says and talks over its
// standard input and output while the test goes on.

#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <string>
#include <utility>
#include <vector>

extern char** environ;

namespace vyn::test {

// What the child does with the mutex it opens with CreateMutexW (an ASCII name):
//   "hold": waits for it without end, writes "held <result>", and exits when its input ends,
//           holding it, with its handle open;
//   "try":  waits VYN_MUTEX_CHILD_TIMEOUT ms, writes "<last error of CreateMutexW> <result>",
//           and releases what it got.
inline constexpr char kMutexChildAction[] = "VYN_MUTEX_CHILD_ACTION";
inline constexpr char kMutexChildName[] = "VYN_MUTEX_CHILD_NAME";
inline constexpr char kMutexChildTimeout[] = "VYN_MUTEX_CHILD_TIMEOUT";

class MutexChild {
 public:
  MutexChild(const std::string& action, const std::string& name, unsigned timeout = 0) {
    std::vector<std::string> texts{"vyn_mutex_child", "--gtest_filter=MutexChild.Run"};
    for (char** entry = environ; *entry != nullptr; ++entry) {
      if (std::strncmp(*entry, "GTEST_", 6) != 0) texts.emplace_back(*entry);
    }
    texts.push_back(std::string(kMutexChildAction) + "=" + action);
    texts.push_back(std::string(kMutexChildName) + "=" + name);
    texts.push_back(std::string(kMutexChildTimeout) + "=" + std::to_string(timeout));
    std::vector<char*> pointers;
    for (std::string& text : texts) pointers.push_back(text.data());
    pointers.insert(pointers.begin() + 2, nullptr);  // ends argv; envp starts after it
    pointers.push_back(nullptr);
    int in[2], out[2];
    if (pipe(in) != 0 || pipe(out) != 0) return;
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, in[0], STDIN_FILENO);
    posix_spawn_file_actions_adddup2(&actions, out[1], STDOUT_FILENO);
    for (int fd : {in[0], in[1], out[0], out[1]}) posix_spawn_file_actions_addclose(&actions, fd);
    if (posix_spawn(&pid_, "/proc/self/exe", &actions, nullptr, pointers.data(), pointers.data() + 3) != 0) pid_ = -1;
    posix_spawn_file_actions_destroy(&actions);
    close(in[0]);
    close(out[1]);
    input_ = in[1];
    output_ = out[0];
  }
  ~MutexChild() {
    EndInput();
    if (pid_ > 0) Wait();
    close(output_);
  }
  MutexChild(const MutexChild&) = delete;
  MutexChild& operator=(const MutexChild&) = delete;

  // The child's next line of the protocol above, GoogleTest's own skipped; "" when none came
  // within 20 s or the child ended.
  std::string ReadLine() {
    for (;;) {
      for (std::size_t end; (end = buffered_.find('\n')) != std::string::npos;) {
        const std::string line = buffered_.substr(0, end);
        buffered_.erase(0, end + 1);
        if (line.starts_with("held") || (!line.empty() && line[0] >= '0' && line[0] <= '9')) return line;
      }
      pollfd ready{output_, POLLIN, 0};
      char chunk[512];
      const ssize_t got = poll(&ready, 1, 20000) > 0 ? read(output_, chunk, sizeof(chunk)) : 0;
      if (got <= 0) return "";
      buffered_.append(chunk, static_cast<std::size_t>(got));
    }
  }

  void EndInput() {
    if (input_ >= 0) close(input_);
    input_ = -1;
  }
  void Kill() { kill(pid_, SIGKILL); }
  // The exit status, or 128 + the signal that ended the child.
  int Wait() {
    const pid_t pid = std::exchange(pid_, -1);
    int status = 0;
    while (waitpid(pid, &status, 0) < 0 && errno == EINTR) {
    }
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
  }

 private:
  pid_t pid_ = -1;
  int input_ = -1;
  int output_ = -1;
  std::string buffered_;
};

}  // namespace vyn::test
