// Mutex ownership between threads of one process, for unnamed and named mutexes alike: recursion,
// release by a non-owner, timeouts, abandonment by a thread that ends holding it, and mutual
// exclusion under contention (run under ThreadSanitizer too).

#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>
#include <string>
#include <thread>
#include <vector>

#include "file_test_helpers.h"
#include "win32/last_error.h"
#include "win32/sync.h"

namespace {

using namespace win32;
using vyn::test::ScopedHandle;

// Every test runs on an unnamed and on a named mutex.
class MutexThreads : public testing::TestWithParam<bool> {
 protected:
  HANDLE NewMutex(BOOL initialOwner = FALSE) {
    const std::string name = "Vyn.Threads." + std::to_string(getpid());
    const std::u16string wide(name.begin(), name.end());
    return CreateMutexW(nullptr, initialOwner, GetParam() ? wide.c_str() : nullptr);
  }
};

// What another thread gets from a wait (and it releases what it got).
DWORD WaitElsewhere(HANDLE mutex, DWORD timeout) {
  DWORD result = WAIT_FAILED;
  std::thread([&] {
    result = WaitForSingleObject(mutex, timeout);
    if (result == WAIT_OBJECT_0 || result == WAIT_ABANDONED) ReleaseMutex(mutex);
  }).join();
  return result;
}

}  // namespace

INSTANTIATE_TEST_SUITE_P(UnnamedAndNamed, MutexThreads, testing::Bool(),
                         [](const auto& info) { return info.param ? "Named" : "Unnamed"; });

TEST_P(MutexThreads, OwnerWaitsRecursivelyAndReleasesAsOften) {
  ScopedHandle mutex(NewMutex(TRUE));
  for (int i = 0; i < 2; ++i) ASSERT_EQ(WaitForSingleObject(mutex.get(), INFINITE), WAIT_OBJECT_0);
  for (int held = 3; held > 0; --held) {
    EXPECT_EQ(WaitElsewhere(mutex.get(), 0), WAIT_TIMEOUT) << held << " levels held";
    EXPECT_TRUE(ReleaseMutex(mutex.get()));
  }
  EXPECT_EQ(WaitElsewhere(mutex.get(), 0), WAIT_OBJECT_0);
  // ReleaseMutex page: a thread that does not own the mutex cannot release it.
  EXPECT_FALSE(ReleaseMutex(mutex.get()));
  EXPECT_EQ(GetLastError(), ERROR_NOT_OWNER);
  ASSERT_EQ(WaitForSingleObject(mutex.get(), 0), WAIT_OBJECT_0);
  std::thread([&] {
    EXPECT_FALSE(ReleaseMutex(mutex.get()));
    EXPECT_EQ(GetLastError(), ERROR_NOT_OWNER);
  }).join();
  EXPECT_TRUE(ReleaseMutex(mutex.get()));
}

TEST_P(MutexThreads, TimedWaitEndsOnTimeWhileTheOwnerHoldsIt) {
  ScopedHandle mutex(NewMutex(TRUE));
  std::thread([&] {
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(WaitForSingleObject(mutex.get(), 150), WAIT_TIMEOUT);
    const auto waited = std::chrono::steady_clock::now() - start;
    EXPECT_GE(waited, std::chrono::milliseconds(150));
    EXPECT_LT(waited, std::chrono::milliseconds(1500));
  }).join();
  EXPECT_TRUE(ReleaseMutex(mutex.get()));
}

TEST_P(MutexThreads, ThreadThatEndsHoldingItAbandonsIt) {
  ScopedHandle mutex(NewMutex());
  std::thread([&] { EXPECT_EQ(WaitForSingleObject(mutex.get(), INFINITE), WAIT_OBJECT_0); }).join();
  EXPECT_EQ(WaitForSingleObject(mutex.get(), INFINITE), WAIT_ABANDONED);
  EXPECT_EQ(WaitElsewhere(mutex.get(), 0), WAIT_TIMEOUT) << "the waiter owns it";
  EXPECT_TRUE(ReleaseMutex(mutex.get()));
  EXPECT_EQ(WaitForSingleObject(mutex.get(), 0), WAIT_OBJECT_0) << "abandoned only once";
  EXPECT_TRUE(ReleaseMutex(mutex.get()));
}

TEST_P(MutexThreads, ExcludesOtherThreads) {
  ScopedHandle mutex(NewMutex());
  long counter = 0;  // guarded by the mutex alone
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([&, t] {
      for (int i = 0; i < 2000; ++i) {
        DWORD result;
        while ((result = WaitForSingleObject(mutex.get(), (t + i) % 3 == 0 ? 0 : (t % 2 ? 5 : INFINITE))) == WAIT_TIMEOUT) {
        }
        ASSERT_EQ(result, WAIT_OBJECT_0);
        ++counter;
        ASSERT_TRUE(ReleaseMutex(mutex.get()));
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(counter, 8000);
}
