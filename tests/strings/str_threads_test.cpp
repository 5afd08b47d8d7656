// Strings shared between threads: CStr, WStr and UTF8Str holders of one block copied, converted,
// written and released at once, and VynString blocks asked for their forms by racing threads.
// Each block ends with one form per encoding and its reference count balanced.

#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

#include "vynutil/strclass.h"

using VynSDK::Util::VynString;
using VynSDK::Util::VynStringInternal;

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

TEST(StrThreads, HoldersSharingABlockAcrossThreads) {
  const MCHAR* const text = u"shared caf\u00E9 \U0001F600";
  // Lengths of the other forms, measured on blocks of their own.
  const int narrowLength = WStr(text).ToCStr().Length();
  const int utf8Length = UTF8Str::FromUTF16(text).Length();
  for (int trial = 0; trial < 5; ++trial) {
    const WStr shared(text);
    std::atomic<int> failures{0};
    RaceThreads(8, [&](int t) {
      for (int i = 0; i < 2000; ++i) {
        WStr copy = shared;
        CStr narrow = copy.ToCStr();
        UTF8Str utf8 = UTF8Str::FromWStr(copy);
        WStr back = (i + t) % 2 ? narrow.ToWStr() : utf8.ToWStr();
        copy.dataForWrite(6)[0] = u'S';  // a write through a shared holder goes to a private copy
        copy += WStr(u"!");
        if (back != shared || copy != u"Shared!" || narrow.Length() != narrowLength ||
            utf8.Length() != utf8Length) {
          failures.fetch_add(1);
        }
        WStr assigned;
        assigned = back;
        assigned = shared;
      }
    });
    EXPECT_EQ(failures.load(), 0);
    EXPECT_EQ(shared, text);
    EXPECT_EQ(shared.ToVynString().ConversionCount(), 3u) << "UTF-16, narrow and UTF-8, once each";
    // Only `shared` still holds the block: one more reference makes two.
    EXPECT_EQ(VynStringInternal::IncRef(shared.data()), 2);
    VynStringInternal::DecRef(shared.data());
  }
}

TEST(StrThreads, RacingRequestsMakeEachFormOnce) {
  // A UTF-16 block asked for UTF-8; a UTF-8 block asked for 1252 and UTF-32, both of which must
  // first make its UTF-16 form.
  for (int round = 0; round < 50; ++round) {
    VynString wide = VynString::FromUTF16(u"shared text \u00E9\u00E8");
    VynString utf8 = VynString::FromUTF8("caf\xC3\xA9");
    std::vector<const char*> seen(8);
    RaceThreads(8, [&](int i) {
      VynString mine = wide, other = utf8;  // each thread holds its own handles to the blocks
      seen[i] = mine.ToUTF8();
      if (i % 2) {
        EXPECT_STREQ(other.ToCP(1252), "caf\xE9");
      } else {
        EXPECT_EQ(other.ToUTF32()[3], 0xE9u);
      }
    });
    EXPECT_EQ(wide.ConversionCount(), 2u);
    for (const char* p : seen) EXPECT_EQ(p, seen[0]);
    EXPECT_EQ(utf8.ConversionCount(), 4u);
  }
}
