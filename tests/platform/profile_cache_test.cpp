// The profile cache: an unchanged file is not read again, every change is seen (also changes
// that keep the size and the modification second), many threads at once lose nothing, and a
// writer killed at any moment leaves a whole file.

#include <gtest/gtest.h>
#include <signal.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <cstdlib>
#include <fstream>
#include <random>
#include <string>
#include <thread>
#include <vector>

#include "profile_test_support.h"
#include "support/child_process.h"
#include "syscalls.h"
#include "win32/profile.h"

extern char** environ;

namespace {

using namespace vyn::test;
using namespace win32;
namespace fs = std::filesystem;

std::u16string Number(long value) {
  const std::string text = std::to_string(value);
  return std::u16string(text.begin(), text.end());
}

// Replaces the file's content in place: same inode, and the same size when the text has it.
void Overwrite(const fs::path& path, const std::string& bytes) {
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out << bytes;
}

// Waits until the file's time stamps lie far enough back for a copy read now to be trusted
// without a look at its bytes (one clock step; two seconds where stamps keep whole seconds).
void LetTheFileSettle(const fs::path& path) {
  struct stat info {};
  stat(path.c_str(), &info);
  const bool wholeSeconds = info.st_mtim.tv_nsec == 0 && info.st_ctim.tv_nsec == 0;
  std::this_thread::sleep_for(std::chrono::milliseconds(wholeSeconds ? 2300 : 120));
}

std::atomic<int> g_reads{0};

}  // namespace

TEST(ProfileCache, UnchangedFileCostsOnlyAStat) {
  TempDir dir;
  const std::u16string file = dir.Write("c.ini", "[s]\r\nk=1\r\n");
  LetTheFileSettle(dir.path() / "c.ini");
  ASSERT_EQ(Value(u"s", u"k", file), u"1");
  sys::ScopedSyscalls scoped;
  scoped.table().open = [](const char* path, int flags, mode_t mode) {
    ++g_reads;
    return sys::DefaultSyscalls().open(path, flags, mode);
  };
  for (int i = 0; i < 100; ++i) ASSERT_EQ(Value(u"s", u"k", file), u"1");
  EXPECT_EQ(g_reads.load(), 0);
}

TEST(ProfileCache, SeesEveryChange) {
  TempDir dir;
  const fs::path path = dir.path() / "c.ini";
  const std::u16string file = dir.Write("c.ini", "[s]\r\nk=0\r\n");
  // Rewritten in place within one tick of the clock, size, inode and time stamps can all stay
  // the same. The stamps are pinned here, an hour ahead (as after the clock was set back), so
  // that only the bytes tell.
  static struct stat pinned;
  stat(path.c_str(), &pinned);
  pinned.st_mtim.tv_sec += 3600;
  pinned.st_ctim = pinned.st_mtim;
  {
    sys::ScopedSyscalls scoped;
    scoped.table().stat = [](const char*, struct stat* info) { return *info = pinned, 0; };
    scoped.table().fstat = [](int, struct stat* info) { return *info = pinned, 0; };
    for (int i = 1; i < 20; ++i) {
      Overwrite(path, "[s]\r\nk=" + std::to_string(i % 10) + "\r\n");
      ASSERT_EQ(Value(u"s", u"k", file), Number(i % 10)) << "round " << i;
    }
  }
  // A settled file changed in place, with its old modification time put back but for the
  // nanoseconds.
  LetTheFileSettle(path);
  ASSERT_EQ(Value(u"s", u"k", file), u"9");
  struct stat old {};
  stat(path.c_str(), &old);
  Overwrite(path, "[s]\r\nk=A\r\n");
  timespec times[2] = {old.st_atim, old.st_mtim};
  times[1].tv_nsec = (times[1].tv_nsec + 1) % 1000000000;
  utimensat(AT_FDCWD, path.c_str(), times, 0);
  EXPECT_EQ(Value(u"s", u"k", file), u"A");
  // Replaced by another file of the same size carrying the very same times: another inode.
  LetTheFileSettle(path);
  ASSERT_EQ(Value(u"s", u"k", file), u"A");
  stat(path.c_str(), &old);
  Overwrite(dir.path() / "next.ini", "[s]\r\nk=B\r\n");
  const timespec same[2] = {old.st_atim, old.st_mtim};
  utimensat(AT_FDCWD, (dir.path() / "next.ini").c_str(), same, 0);
  fs::rename(dir.path() / "next.ini", path);
  EXPECT_EQ(Value(u"s", u"k", file), u"B");
  // Another process writes it.
  const ChildResult child =
      RunChild("/bin/sh", {"sh", "-c", "printf '[s]\\r\\nk=C\\r\\n' > \"$1\"", "sh", path.string()}, {});
  ASSERT_EQ(child.exitCode, 0) << child.output;
  EXPECT_EQ(Value(u"s", u"k", file), u"C");
  // Gone: the default, not the last content.
  fs::remove(path);
  EXPECT_EQ(Value(u"s", u"k", file), u"<default>");
  EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
}

// Writers never lose each other's changes; readers only ever see values that were written, in
// the order they were written.
TEST(ProfileCache, ManyThreadsAtOnce) {
  TempDir dir;
  const std::u16string file = dir.Write("t.ini", "; shared\r\n");
  constexpr int kWriters = 2;
  constexpr int kReaders = 4;
  constexpr long kWrites = 60;
  std::atomic<bool> done{false};
  std::atomic<int> failures{0};
  std::vector<std::thread> threads;
  for (int w = 0; w < kWriters; ++w) {
    threads.emplace_back([&, w] {
      const std::u16string key = u"w" + Number(w);
      for (long i = 0; i < kWrites; ++i) {
        if (!WritePrivateProfileStringW(u"s", key.c_str(), Number(i).c_str(), file.c_str())) ++failures;
      }
    });
  }
  for (int r = 0; r < kReaders; ++r) {
    threads.emplace_back([&] {
      std::vector<long> last(kWriters, -1);
      while (!done) {
        for (int w = 0; w < kWriters; ++w) {
          const std::u16string key = u"w" + Number(w);
          const UINT value = GetPrivateProfileIntW(u"s", key.c_str(), -1, file.c_str());
          const long seen = value == 0xFFFFFFFFu ? -1 : static_cast<long>(value);
          if (seen < last[w] || seen >= kWrites) ++failures;
          last[w] = seen;
        }
        MCHAR names[64];
        if (GetPrivateProfileSectionNamesW(names, 64, file.c_str()) > 2) ++failures;
      }
    });
  }
  for (int w = 0; w < kWriters; ++w) threads[static_cast<std::size_t>(w)].join();
  done = true;
  for (std::size_t t = kWriters; t < threads.size(); ++t) threads[t].join();
  EXPECT_EQ(failures.load(), 0);
  for (int w = 0; w < kWriters; ++w) {
    EXPECT_EQ(GetPrivateProfileIntW(u"s", (u"w" + Number(w)).c_str(), -1, file.c_str()), kWrites - 1u);
  }
  EXPECT_EQ(Bytes(dir, "t.ini").substr(0, 13), "; shared\r\n[s]");
}

// A child process writes a growing value over and over; it is killed (SIGKILL) at a random
// moment, many times. The file must always be one of the states a write leaves.
TEST(ProfileAtomicWrite, KilledWriterLeavesAWholeFile) {
  if (InChildProcess()) {
    const char* path = std::getenv("VYN_PROFILE_KILL_FILE");
    const std::u16string file(path, path + std::char_traits<char>::length(path));
    for (long i = 0; i < 200000; ++i) {
      const std::u16string value = Number(i) + u":" + std::u16string(static_cast<std::size_t>(i % 4000), u'x');
      WritePrivateProfileStringW(u"s", u"counter", value.c_str(), file.c_str());
    }
    return;
  }
  TempDir dir;
  const std::string path = (dir.path() / "k.ini").string();
  const std::u16string file = dir.Write("k.ini", "[s]\r\ncounter=start\r\n");
  std::vector<std::string> environment;
  for (char** e = environ; *e != nullptr; ++e) {
    if (std::string(*e).rfind("GTEST_", 0) != 0) environment.emplace_back(*e);
  }
  environment.push_back("VYN_TEST_CHILD=1");
  environment.push_back("VYN_PROFILE_KILL_FILE=" + path);
  std::vector<char*> envp;
  for (std::string& entry : environment) envp.push_back(entry.data());
  envp.push_back(nullptr);
  std::string program = "vyn_test_child";
  std::string filter = "--gtest_filter=ProfileAtomicWrite.KilledWriterLeavesAWholeFile";
  char* argv[] = {program.data(), filter.data(), nullptr};

  std::mt19937 random(12345);
  int killedWhileWriting = 0;
  for (int round = 0; round < 25; ++round) {
    const std::string before = Bytes(dir, "k.ini");
    pid_t child = 0;
    ASSERT_EQ(posix_spawn(&child, "/proc/self/exe", nullptr, nullptr, argv, envp.data()), 0);
    // Once the child is writing, let it run a little longer, then kill it mid-stream.
    bool writing = false;
    for (int wait = 0; wait < 5000 && !writing; ++wait) {
      std::this_thread::sleep_for(std::chrono::milliseconds(2));
      writing = Bytes(dir, "k.ini") != before;
    }
    std::this_thread::sleep_for(std::chrono::microseconds(random() % 30000));
    kill(child, SIGKILL);
    int status = 0;
    waitpid(child, &status, 0);
    killedWhileWriting += WIFSIGNALED(status) && writing;

    const std::string bytes = Bytes(dir, "k.ini");
    SCOPED_TRACE(bytes.substr(0, 40));
    const std::u16string value = GetString(u"s", u"counter", u"", 8192, file).buffer.c_str();
    ASSERT_EQ(bytes, "[s]\r\ncounter=" + std::string(value.begin(), value.end()) + "\r\n");
    if (value == u"start") continue;
    const std::size_t colon = value.find(u':');
    ASSERT_NE(colon, std::u16string::npos);
    const long i = std::stol(std::string(value.begin(), value.begin() + static_cast<long>(colon)));
    EXPECT_EQ(value.substr(colon + 1), std::u16string(static_cast<std::size_t>(i % 4000), u'x'));
  }
  EXPECT_GT(killedWhileWriting, 20) << "the writer should still be writing when it is killed";
}
