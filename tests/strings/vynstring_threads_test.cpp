// VynString blocks shared between threads: one cached form per encoding, whatever the race.

#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "vynutil/vynstring.h"

using VynSDK::Util::VynString;

namespace {

// Starts n threads that wait for one signal and then run body(i).
template <class Body>
void RaceThreads(int n, Body body) {
  std::atomic<bool> go{false};
  std::vector<std::thread> threads;
  for (int i = 0; i < n; ++i) {
    threads.emplace_back([&, i] {
      while (!go.load(std::memory_order_acquire)) std::this_thread::yield();
      body(i);
    });
  }
  go.store(true, std::memory_order_release);
  for (auto& t : threads) t.join();
}

}  // namespace

TEST(VynStringThreads, ManyThreadsAskingForOneFormMakeItOnce) {
  for (int round = 0; round < 50; ++round) {
    VynString s = VynString::FromUTF16(u"shared text \u00E9\u00E8");
    std::vector<const char*> seen(8);
    RaceThreads(8, [&](int i) {
      VynString mine = s;  // each thread holds its own handle to the one block
      seen[i] = mine.ToUTF8();
    });
    EXPECT_EQ(s.ConversionCount(), 2u);
    for (const char* p : seen) EXPECT_EQ(p, seen[0]);
  }
}

TEST(VynStringThreads, FormsThatNeedUtf16FirstAreNotDuplicated) {
  // A UTF-8 block asked for 1252 and UTF-32 must first make its UTF-16 form; threads racing on
  // that path still end with one form per encoding.
  for (int round = 0; round < 50; ++round) {
    VynString s = VynString::FromUTF8("caf\xC3\xA9");
    RaceThreads(6, [&](int i) {
      VynString mine = s;
      if (i % 2) {
        EXPECT_STREQ(mine.ToCP(1252), "caf\xE9");
      } else {
        EXPECT_EQ(mine.ToUTF32()[3], 0xE9u);
      }
    });
    EXPECT_EQ(s.ConversionCount(), 4u);
  }
}

TEST(VynStringThreads, CopiesAndReleasesAcrossThreadsBalance) {
  VynString s = VynString::FromUTF8("counted");
  RaceThreads(8, [&](int) {
    for (int k = 0; k < 10000; ++k) {
      VynString copy = s;
      VynString other = copy;
      other.SetNull();
    }
  });
  // The block is still alive with exactly one reference: a second handle and a release leave it.
  const char* ref = static_cast<const char*>(VynSDK::Util::VynStringInternal::ToRef(s, CP_UTF8));
  EXPECT_EQ(VynSDK::Util::VynStringInternal::DecRef(ref), 1);
}
