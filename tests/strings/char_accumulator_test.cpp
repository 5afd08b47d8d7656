// CharAccumulator: linear growth, surrogate pairs, last-character removal, Reset, zero units and
// the buffer made by the pointer conversion.

#include <gtest/gtest.h>

#include <string>

#include "vynutil/char.h"

using VynSDK::Util::Char;
using VynSDK::Util::CharAccumulator;

TEST(CharAccumulator, GrowsBy63UnitsAStep) {
  CharAccumulator acc;
  EXPECT_EQ(acc.Get(), nullptr);
  EXPECT_EQ(acc.Capacity(), 0u);
  std::u16string expected;
  for (int i = 0; i < 63; ++i) {
    acc += Char(MCHAR(u'a' + i % 26));
    expected.push_back(static_cast<char16_t>(u'a' + i % 26));
    if (i == 0 || i == 61) {
      EXPECT_EQ(acc.Capacity(), 63u) << "after the first append, and with 62 units still below it";
    }
  }
  EXPECT_EQ(acc.Capacity(), 126u) << "after the 63rd append";
  EXPECT_EQ(std::u16string(acc.Get()), expected);
  // A pair that reaches the capacity grows it to capacity - 2 + 64.
  while (acc.Length() < 125) acc += Char(u'x');
  EXPECT_EQ(acc.Capacity(), 126u);
  acc += Char(0x1F600u);
  EXPECT_EQ(acc.Capacity(), 188u);
  EXPECT_EQ(acc.Length(), 127u);
  EXPECT_EQ(acc.Get()[127], 0) << "terminated";
}

TEST(CharAccumulator, LastCharacterAndRemoval) {
  CharAccumulator acc;
  EXPECT_TRUE(acc.LastCharacter().IsNull()) << "no buffer";
  EXPECT_TRUE(acc.RemoveLastCharacter().IsNull());
  acc += Char(u'a');
  acc += Char(0x1F600u);
  acc += Char(0xD83Du);  // a lone lead surrogate, appended as its own unit
  EXPECT_EQ(std::u16string(acc.Get()), std::u16string(u"a\U0001F600") + char16_t(0xD83D));
  EXPECT_EQ(acc.RemoveLastCharacter().CharCode(), 0xD83Du) << "what was appended comes back";
  EXPECT_EQ(acc.LastCharacter().CharCode(), 0x1F600u) << "a pair is one character";
  EXPECT_EQ(acc.RemoveLastCharacter().CharCode(), 0x1F600u);
  EXPECT_EQ(std::u16string(acc.Get()), u"a");
  EXPECT_EQ(acc.RemoveLastCharacter().CharCode(), u'a');
  EXPECT_TRUE(acc.RemoveLastCharacter().IsNull());
  EXPECT_EQ(std::u16string(acc.Get()), u"");

  // A zero unit is counted but ends the visible text.
  acc += Char(u'a');
  acc += Char();
  acc += Char(u'b');
  EXPECT_EQ(acc.Length(), 3u);
  EXPECT_EQ(std::u16string(acc.Get()), u"a");
  EXPECT_EQ(acc.RemoveLastCharacter().CharCode(), u'b');
  EXPECT_TRUE(acc.RemoveLastCharacter().IsNull());
  EXPECT_EQ(acc.Length(), 1u);
}

TEST(CharAccumulator, ResetAndThePointerBeforeTheFirstAppend) {
  CharAccumulator acc;
  for (int i = 0; i < 100; ++i) acc += Char(u'q');
  const MCHAR* buffer = acc.Get();
  const std::size_t capacity = acc.Capacity();
  acc.Reset();
  EXPECT_EQ(acc.Get(), buffer) << "Reset keeps the buffer";
  EXPECT_EQ(acc.Capacity(), capacity);
  EXPECT_EQ(std::u16string(acc.Get()), u"");
  EXPECT_TRUE(acc.RemoveLastCharacter().IsNull());
  acc += Char(u'z');
  EXPECT_EQ(std::u16string(acc.Get()), u"z");

  // The conversion makes an empty buffer without counting a character, so text appended later
  // is read through the same pointer.
  CharAccumulator fresh;
  MCHAR* text = fresh;
  ASSERT_NE(text, nullptr);
  EXPECT_EQ(text[0], 0);
  EXPECT_EQ(fresh.Length(), 0u);
  EXPECT_TRUE(fresh.LastCharacter().IsNull());
  fresh += Char(u'h');
  fresh += Char(u'i');
  EXPECT_EQ(std::u16string(static_cast<MCHAR*>(fresh)), u"hi");
  EXPECT_EQ(fresh.Capacity(), 63u) << "the same room a first append makes";
}
