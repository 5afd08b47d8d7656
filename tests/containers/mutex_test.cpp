// MutexObject, AutoMutex and FileMutexObject over real named mutexes, with real child processes
// for the cross-process cases.

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <string>
#include <thread>

#include "support/child_process.h"
#include "vynutil/mutex.h"

namespace {

using VynSDK::Util::AutoMutex;
using VynSDK::Util::FileMutexObject;
using VynSDK::Util::MutexObject;

// A name no other test run uses.
std::u16string UniqueName(const std::string& what) {
  const std::string text = "vyn-test-" + what + "-" + std::to_string(getpid());
  return std::u16string(text.begin(), text.end());
}

std::string ChildRole() {
  const char* role = std::getenv("VYN_MUTEX_ROLE");
  return role != nullptr ? role : "";
}

TEST(MutexObject, RecursiveOwnershipAndFailedCreation) {
  MutexObject mutex(UniqueName("recursive").c_str());
  EXPECT_EQ(mutex.Acquire(0), WAIT_OBJECT_0);
  EXPECT_EQ(mutex.Acquire(0), WAIT_OBJECT_0) << "the owner may acquire again";
  std::thread([&] {
    EXPECT_EQ(mutex.Acquire(0), WAIT_TIMEOUT);
    EXPECT_EQ(mutex.Release(), 288u) << "ERROR_NOT_OWNER";
  }).join();
  EXPECT_EQ(mutex.Release(), 0u);
  EXPECT_EQ(mutex.Release(), 0u);
  EXPECT_EQ(mutex.Release(), 288u) << "released as often as acquired";

  // A '\' other than a namespace prefix cannot be created: no handle, and neither call waits.
  MutexObject broken(u"no\\such\\folder");
  EXPECT_EQ(broken.Acquire(INFINITE), 6u);
  EXPECT_EQ(broken.Release(), 6u);
  MutexObject narrow("vyn-test-narrow");
  EXPECT_EQ(narrow.Acquire(0), WAIT_OBJECT_0);
  EXPECT_EQ(narrow.Release(), 0u);
}

TEST(AutoMutex, ReleasesOnlyWhatItOwns) {
  MutexObject mutex(UniqueName("auto").c_str());
  ASSERT_EQ(mutex.Acquire(0), WAIT_OBJECT_0);
  std::thread([&] {
    AutoMutex guard(mutex, 0);
    EXPECT_EQ(guard.GetWaitResult(), WAIT_TIMEOUT);
  }).join();  // the guard did not release the main thread's ownership
  std::thread([&] { EXPECT_EQ(mutex.Acquire(0), WAIT_TIMEOUT); }).join();
  EXPECT_EQ(mutex.Release(), 0u);
  {
    AutoMutex guard(mutex, 0);
    EXPECT_EQ(guard.GetWaitResult(), WAIT_OBJECT_0);
  }
  std::thread([&] {
    EXPECT_EQ(mutex.Acquire(0), WAIT_OBJECT_0) << "the guard released it";
    EXPECT_EQ(mutex.Release(), 0u);
  }).join();
}

TEST(AutoMutex, AnAbandonedMutexIsReleasedByItsGuard) {
  MutexObject mutex(UniqueName("auto-abandoned").c_str());
  std::thread([&] { EXPECT_EQ(mutex.Acquire(0), WAIT_OBJECT_0); }).join();  // ends holding it
  {
    AutoMutex guard(mutex, INFINITE);
    EXPECT_EQ(guard.GetWaitResult(), WAIT_ABANDONED);
  }
  std::thread([&] {
    EXPECT_EQ(mutex.Acquire(0), WAIT_OBJECT_0) << "not left locked for everyone else";
    EXPECT_EQ(mutex.Release(), 0u);
  }).join();
}

TEST(FileMutexObject, NothingToLockCountsAsAcquired) {
  FileMutexObject none(nullptr, 0);
  FileMutexObject empty(u"", 0);
  EXPECT_TRUE(none.MutexAquired());
  EXPECT_TRUE(empty.MutexAquired());
  none.ReleaseMutex();
  EXPECT_FALSE(none.MutexAquired());
}

TEST(FileMutexObject, SpellingsOfOnePathShareOneMutexAcrossProcesses) {
  const std::string pid = vyn::test::InChildProcess() ? std::getenv("VYN_MUTEX_PARENT") : std::to_string(getpid());
  const std::string upper = "C:\\Work\\Settings-" + pid + "\\App.INI";
  const std::string lower = "c:/work/settings-" + pid + "/app.ini";
  if (vyn::test::InChildProcess()) {
    const std::u16string path(lower.begin(), lower.end());
    FileMutexObject second(path.c_str(), 0);
    EXPECT_EQ(second.MutexAquired(), ChildRole() == "free");
    return;
  }
  {
    const std::u16string path(upper.begin(), upper.end());
    FileMutexObject first(path.c_str(), INFINITE);
    ASSERT_TRUE(first.MutexAquired());
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild({{"VYN_MUTEX_PARENT", pid}, {"VYN_MUTEX_ROLE", "held"}}));
    first.ReleaseMutex();
    EXPECT_FALSE(first.MutexAquired());
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild({{"VYN_MUTEX_PARENT", pid}, {"VYN_MUTEX_ROLE", "free"}}));
  }
}

TEST(FileMutexObject, AProcessThatDiedHoldingItDoesNotBlockTheNext) {
  const std::string pid = vyn::test::InChildProcess() ? std::getenv("VYN_MUTEX_PARENT") : std::to_string(getpid());
  const std::string text = "/tmp/vyn-abandoned-" + pid + ".ini";
  const std::u16string path(text.begin(), text.end());
  if (vyn::test::InChildProcess()) {
    FileMutexObject held(path.c_str(), INFINITE);
    if (held.MutexAquired()) _exit(0);  // dies holding it
    _exit(1);
  }
  ASSERT_EQ(vyn::test::WaitForChild(vyn::test::StartCurrentTestInChild({{"VYN_MUTEX_PARENT", pid}})), 0);
  {
    FileMutexObject next(path.c_str(), 2000);
    EXPECT_TRUE(next.MutexAquired()) << "an abandoned mutex is acquired";
  }
  FileMutexObject after(path.c_str(), 0);
  EXPECT_TRUE(after.MutexAquired()) << "and released again";
}

TEST(FileMutexObject, LongPathsStillLockAndStayDistinct) {
  const std::u16string base = u"/tmp/" + std::u16string(300, u'd');
  FileMutexObject first((base + u"/a.ini").c_str(), 0);
  ASSERT_TRUE(first.MutexAquired());
  std::thread([&] {
    FileMutexObject same((base + u"/A.INI").c_str(), 0);
    EXPECT_FALSE(same.MutexAquired());
    FileMutexObject other((base + u"/b.ini").c_str(), 0);
    EXPECT_TRUE(other.MutexAquired()) << "paths that differ after 260 characters differ";
  }).join();
}

}  // namespace
