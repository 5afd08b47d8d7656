// Named mutexes between real processes: sharing by name, waiting, abandonment by a killed or
// ended owner, and the shared-memory object living exactly as long as some process has it open.

#include <gtest/gtest.h>
#include <unistd.h>

#include <QCryptographicHash>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <thread>

#include "file_test_helpers.h"
#include "mutex_test_child.h"
#include "win32/last_error.h"
#include "win32/sync.h"

namespace {

using namespace win32;
using vyn::test::MutexChild;
using vyn::test::ScopedHandle;
using Clock = std::chrono::steady_clock;
namespace fs = std::filesystem;

// A name no other test run uses, with upper case and '/' in it (ASCII: the child takes it so).
std::string UniqueName(const std::string& stem) { return stem + "/Pid" + std::to_string(getpid()); }
std::u16string Wide(const std::string& ascii) { return std::u16string(ascii.begin(), ascii.end()); }

// What a "try" child reports: "<last error of CreateMutexW> <wait result>".
std::string Try(const std::string& name, unsigned timeout = 0) { return MutexChild("try", name, timeout).ReadLine(); }
std::string Line(DWORD error, DWORD result) { return std::to_string(error) + " " + std::to_string(result); }

// Where sync.h says the object of a local name lives.
fs::path ObjectFile(const std::string& fileName) {
  return "/dev/shm/vyn-mutex.1." + std::to_string(geteuid()) + ".L." + fileName;
}

}  // namespace

// The other side of the tests below (see mutex_test_child.h).
TEST(MutexChild, Run) {
  const char* action = std::getenv(vyn::test::kMutexChildAction);
  if (action == nullptr) GTEST_SKIP() << "runs only as the second process of the mutex tests";
  ScopedHandle mutex(CreateMutexW(nullptr, FALSE, Wide(std::getenv(vyn::test::kMutexChildName)).c_str()));
  const DWORD created = GetLastError();
  ASSERT_TRUE(mutex.valid());
  if (std::string(action) == "try") {
    const DWORD result = WaitForSingleObject(mutex.get(), std::atoi(std::getenv(vyn::test::kMutexChildTimeout)));
    std::printf("%s\n", Line(created, result).c_str());
    if (result == WAIT_OBJECT_0 || result == WAIT_ABANDONED) ReleaseMutex(mutex.get());
    return;
  }
  std::printf("held %u\n", WaitForSingleObject(mutex.get(), INFINITE));
  std::fflush(stdout);
  while (std::fgetc(stdin) != EOF) {
  }
  std::exit(0);  // holding the mutex, with the handle open
}

TEST(MutexAcrossProcesses, SecondProcessWaitsForTheHolder) {
  const std::string name = UniqueName("Vyn/Mutex/Wait");
  ScopedHandle mutex(CreateMutexW(nullptr, TRUE, Wide(name).c_str()));
  ASSERT_TRUE(mutex.valid());
  EXPECT_EQ(GetLastError(), ERROR_SUCCESS);
  EXPECT_EQ(Try(name), Line(ERROR_ALREADY_EXISTS, WAIT_TIMEOUT)) << "timeout 0 only tries";
  EXPECT_EQ(Try(UniqueName("vyn/mutex/wait")), Line(ERROR_SUCCESS, WAIT_OBJECT_0)) << "names keep their case";

  MutexChild waiter("try", name, 20000);
  std::this_thread::sleep_for(std::chrono::milliseconds(300));
  const auto released = Clock::now();
  ASSERT_TRUE(ReleaseMutex(mutex.get()));
  EXPECT_EQ(waiter.ReadLine(), Line(ERROR_ALREADY_EXISTS, WAIT_OBJECT_0));
  EXPECT_LT(Clock::now() - released, std::chrono::seconds(5));
}

TEST(MutexAcrossProcesses, OwnerThatDiesAbandonsItToTheNextWaiter) {
  const std::string name = UniqueName("Vyn/Mutex/Abandon");
  ScopedHandle mutex(CreateMutexW(nullptr, FALSE, Wide(name).c_str()));
  for (const bool killed : {true, false}) {
    SCOPED_TRACE(killed ? "killed with SIGKILL" : "ended normally");
    MutexChild holder("hold", name);
    ASSERT_EQ(holder.ReadLine(), "held 0");
    // While the owner lives, a wait lasts as long as asked, no longer.
    const auto start = Clock::now();
    EXPECT_EQ(WaitForSingleObject(mutex.get(), 300), WAIT_TIMEOUT);
    EXPECT_GE(Clock::now() - start, std::chrono::milliseconds(300));
    EXPECT_LT(Clock::now() - start, std::chrono::milliseconds(1300));

    std::thread ender([&] {
      std::this_thread::sleep_for(std::chrono::milliseconds(200));
      killed ? holder.Kill() : holder.EndInput();
    });
    const auto waited = Clock::now();
    EXPECT_EQ(WaitForSingleObject(mutex.get(), 30000), WAIT_ABANDONED);
    EXPECT_LT(Clock::now() - waited, std::chrono::seconds(10));
    ender.join();
    // The waiter owns it now, once, and its release frees it for good.
    EXPECT_EQ(Try(name), Line(ERROR_ALREADY_EXISTS, WAIT_TIMEOUT));
    EXPECT_TRUE(ReleaseMutex(mutex.get()));
    EXPECT_EQ(Try(name), Line(ERROR_ALREADY_EXISTS, WAIT_OBJECT_0));
  }
}

TEST(MutexAcrossProcesses, ObjectLivesWhileAProcessHasItOpen) {
  // Object names longer than a file name may be are hashed; the whole name still counts.
  const std::string stem = UniqueName("Vyn/Mutex/Long");
  const std::string name = stem + std::string(259 - stem.size(), 'X');
  const std::u16string units = Wide(name);
  const QByteArray bytes(reinterpret_cast<const char*>(units.data()), static_cast<qsizetype>(units.size() * 2));
  const fs::path file = ObjectFile("#" + QCryptographicHash::hash(bytes, QCryptographicHash::Sha256).toHex().toStdString());
  {
    ScopedHandle mutex(CreateMutexW(nullptr, TRUE, units.c_str()));
    EXPECT_TRUE(fs::exists(file));
    EXPECT_EQ(Try(name), Line(ERROR_ALREADY_EXISTS, WAIT_TIMEOUT));
    EXPECT_EQ(Try(name.substr(0, 258) + "Y"), Line(ERROR_SUCCESS, WAIT_OBJECT_0));
    ReleaseMutex(mutex.get());
  }
  EXPECT_FALSE(fs::exists(file)) << "the last handle removes the object";
  EXPECT_EQ(OpenMutexW(SYNCHRONIZE, FALSE, units.c_str()), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);

  // A process killed holding the only handle leaves its object behind; the next process to open
  // the name must get a new, free mutex, as on Windows, and remove the object when done.
  const std::string left = UniqueName("Vyn-Left");
  const fs::path leftFile = ObjectFile("Vyn-Left%2FPid" + std::to_string(getpid()));
  MutexChild killed("hold", left);
  ASSERT_EQ(killed.ReadLine(), "held 0");
  killed.Kill();
  killed.Wait();
  EXPECT_TRUE(fs::exists(leftFile));
  {
    ScopedHandle mutex(CreateMutexW(nullptr, FALSE, Wide(left).c_str()));
    EXPECT_EQ(GetLastError(), ERROR_SUCCESS);
    EXPECT_EQ(WaitForSingleObject(mutex.get(), 0), WAIT_OBJECT_0);
    ReleaseMutex(mutex.get());
  }
  EXPECT_FALSE(fs::exists(leftFile));

  // A process that exits with its handle open takes the object along when nobody else uses it.
  MutexChild exiting("hold", left);
  ASSERT_EQ(exiting.ReadLine(), "held 0");
  EXPECT_TRUE(fs::exists(leftFile));
  exiting.EndInput();
  EXPECT_EQ(exiting.Wait(), 0);
  EXPECT_FALSE(fs::exists(leftFile));
}
