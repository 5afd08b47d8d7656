// CStr, WStr and UTF8Str holders sharing one block, used from several threads at once: copies,
// conversions, writes and releases leave the shared text unchanged, one form per encoding, and
// the reference count balanced.

#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

#include "vynutil/strclass.h"

using VynSDK::Util::VynStringInternal;

TEST(StrThreads, HoldersSharingABlockAcrossThreads) {
  constexpr int kThreads = 8;
  constexpr int kRounds = 2000;
  for (int trial = 0; trial < 5; ++trial) {
    const MCHAR* const text = u"shared caf\u00E9 \U0001F600";
    const WStr shared(text);
    // Lengths of the other forms, measured on a block of their own.
    const int narrowLength = WStr(text).ToCStr().Length();
    const int utf8Length = UTF8Str::FromUTF16(text).Length();
    std::atomic<bool> go{false};
    std::atomic<int> failures{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < kThreads; ++t) {
      threads.emplace_back([&, t] {
        while (!go.load(std::memory_order_acquire)) std::this_thread::yield();
        for (int i = 0; i < kRounds; ++i) {
          WStr copy = shared;
          CStr narrow = copy.ToCStr();
          UTF8Str utf8 = UTF8Str::FromWStr(copy);
          WStr back = (i + t) % 2 ? narrow.ToWStr() : utf8.ToWStr();
          // A write through a shared holder goes to a private copy.
          copy.dataForWrite(6)[0] = u'S';
          copy += WStr(u"!");
          if (back != shared || copy != u"Shared!" || narrow.Length() != narrowLength || utf8.Length() != utf8Length) {
            failures.fetch_add(1);
          }
          WStr assigned;
          assigned = back;
          assigned = shared;
        }
      });
    }
    go.store(true, std::memory_order_release);
    for (auto& thread : threads) thread.join();
    EXPECT_EQ(failures.load(), 0);
    EXPECT_EQ(shared, text);
    EXPECT_EQ(shared.ToVynString().ConversionCount(), 3u) << "UTF-16, narrow and UTF-8, once each";
    // Only `shared` still holds the block: one more reference makes two.
    EXPECT_EQ(VynStringInternal::IncRef(shared.data()), 2);
    VynStringInternal::DecRef(shared.data());
  }
}
