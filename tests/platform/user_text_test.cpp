// CharLowerBuffW against ICU's simple lower-case mapping of every character.

#include <gtest/gtest.h>
#include <unicode/uchar.h>
#include <unicode/utf16.h>

#include <string>

#include "win32/user_text.h"

TEST(CharLowerBuff, MapsEveryCharacterAsIcuDoes) {
  // Every code point once, as UTF-16, with lone surrogates (which stay) between them.
  std::u16string text;
  std::u16string expected;
  for (UChar32 c = 0; c <= 0x10FFFF; ++c) {
    UChar units[2];
    int32_t length = 0;
    U16_APPEND_UNSAFE(units, length, c);
    if (U_IS_SURROGATE(c)) {
      text += static_cast<char16_t>(c);
      expected += static_cast<char16_t>(c);
      text += u'x';  // keeps a lead surrogate from pairing with the next trail
      expected += u'x';
      continue;
    }
    text.append(units, units + length);
    length = 0;
    U16_APPEND_UNSAFE(units, length, u_tolower(c));
    expected.append(units, units + length);
  }
  EXPECT_EQ(win32::CharLowerBuffW(text.data(), static_cast<DWORD>(text.size())), text.size());
  EXPECT_TRUE(text == expected);
}

TEST(CharLowerBuff, ProcessesExactlyTheGivenUnits) {
  // A fixed buffer is lowered whole, zero units included; nothing after it is touched, and a
  // pair cut by the end stays as it is.
  using namespace std::string_literals;
  std::u16string text = u"AB\0CD\U00010400E"s;  // U+10400 DESERET CAPITAL LONG I
  EXPECT_EQ(win32::CharLowerBuffW(text.data(), 6), 6u);
  EXPECT_EQ(text, u"ab\0cd\U00010400E"s);
  EXPECT_EQ(win32::CharLowerBuffW(text.data(), 8), 8u);
  EXPECT_EQ(text, u"ab\0cd\U00010428e"s);  // U+10428 DESERET SMALL LONG I
  EXPECT_EQ(win32::CharLowerBuffW(nullptr, 4), 0u);
}
