// Char: surrogates, double-byte and UTF-8 characters, code-page conversion, a Japanese process,
// character sets and strings.

#include "vynutil/char.h"

#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <string>

#include "support/process_code_pages.h"
#include "win32/codepage.h"
#include "win32/last_error.h"

using VynSDK::Util::Char;
using VynSDK::Util::VynString;

TEST(Char, SurrogatesFromWideText) {
  // U+1F600 GRINNING FACE is D83D DE00 in UTF-16.
  EXPECT_EQ(Char(MCHAR(0xD83D)).CharCode(), u'?') << "a lead surrogate alone";
  EXPECT_EQ(Char(MCHAR(0xDE00)).CharCode(), 0xDE00u) << "a lone trail surrogate is kept";
  EXPECT_EQ(Char(u"\U0001F600x").CharCode(), 0x1F600u);
  EXPECT_EQ(Char(u"a\U0001F600").CharCode(), u'a');
  EXPECT_EQ(Char(static_cast<const MCHAR*>(nullptr)).CharCode(), 0u);
  Char c;
  c = MCHAR(0xDBFF);
  EXPECT_EQ(c.CharCode(), u'?');
}

TEST(Char, ToUTF16BufferSizes) {
  const Char smile(0x1F600u);
  MCHAR buf[4] = {0x7777, 0x7777, 0x7777, 0x7777};
  EXPECT_EQ(smile.ToUTF16(nullptr, 0), 2u) << "measuring";

  win32::SetLastError(0);
  EXPECT_EQ(smile.ToUTF16(buf, 1), 0u);
  EXPECT_EQ(win32::GetLastError(), win32::ERROR_INSUFFICIENT_BUFFER);
  EXPECT_EQ(buf[0], 0) << "buf[0] is cleared first";

  EXPECT_EQ(smile.ToUTF16(buf, 2), 2u) << "exactly the two units, no room for a terminator";
  EXPECT_EQ(buf[2], 0x7777);
  EXPECT_EQ(smile.ToMCHAR(buf, 3), 2u);
  EXPECT_EQ(std::u16string(buf), u"\U0001F600");

  win32::SetLastError(0);
  EXPECT_EQ(smile.ToUTF16(nullptr, 3), 0u);
  EXPECT_EQ(win32::GetLastError(), win32::ERROR_INVALID_PARAMETER);
}

TEST(Char, Utf16AndStringRoundTripsOfEveryPlane) {
  for (unsigned int c = 1; c <= 0x10FFFF; c += 0x1F1) {
    if (c >= 0xD800 && c <= 0xDFFF) continue;
    MCHAR units[3];
    ASSERT_EQ(Char(c).ToUTF16(units, 3), c < 0x10000 ? 1u : 2u);
    EXPECT_EQ(Char(static_cast<const MCHAR*>(units)).CharCode(), c);
    EXPECT_EQ(Char(VynString::FromUTF16(units)).CharCode(), c);
  }
  EXPECT_EQ(Char(VynString()).CharCode(), 0u);
  EXPECT_EQ(Char(VynString::FromUTF8("\xF0\x9F\x98\x80!")).CharCode(), 0x1F600u);
  EXPECT_EQ(std::u16string(Char(0x1F600u).ToVynString().ToUTF16()), u"\U0001F600");
  EXPECT_EQ(Char().ToVynString().Length(CP_UTF16), 0u) << "the null character gives an empty string";
}

TEST(Char, Utf8Characters) {
  const struct {
    const char* name;
    const char* text;
    unsigned int expected;
  } rows[] = {
      {"ASCII", "A", 'A'},
      {"two bytes, U+00E9", "\xC3\xA9z", 0xE9},
      {"three bytes, U+20AC", "\xE2\x82\xAC", 0x20AC},
      {"four bytes, U+1F600", "\xF0\x9F\x98\x80", 0x1F600},
      {"stray continuation byte", "\x80" "A", 0xFFFD},
      {"lead byte followed by ASCII", "\xC3" "A", 0xFFFD},
      {"empty", "", 0},
      // Five- and six-byte forms are not UTF-8 any more: each byte is a U+FFFD of its own.
      {"six-byte form", "\xFC\x80\x80\x80\x80\x80" "tail", 0xFFFD},
      {"five-byte form", "\xF8\x88\x80\x80\x80", 0xFFFD},
      // The sequence a lead byte announces is never read past the terminator.
      {"three-byte lead alone", "\xE2", 0xFFFD},
      {"three-byte sequence cut", "\xE2\x82", 0xFFFD},
      {"four-byte sequence cut", "\xF0\x9F\x98", 0xFFFD},
      {"six-byte lead alone", "\xFC", 0xFFFD},
      {"six-byte form cut", "\xFC\x80", 0xFFFD},
  };
  for (const auto& row : rows) {
    // A heap copy of exactly the bytes and the terminator: AddressSanitizer sees any read beyond.
    const std::size_t size = std::strlen(row.text) + 1;
    std::unique_ptr<char[]> copy(new char[size]);
    std::memcpy(copy.get(), row.text, size);
    EXPECT_EQ(Char(CP_UTF8, copy.get()).CharCode(), row.expected) << row.name;
  }
}

TEST(Char, CodePageConversion) {
  // Windows-1252 0x80 is U+20AC EURO SIGN.
  EXPECT_EQ(Char(1252, "\x80").CharCode(), 0x20ACu);
  EXPECT_EQ(Char('\x80').CharCode(), 0x20ACu) << "the active code page is 1252 in the tests";

  char buf[8];
  EXPECT_EQ(Char(0x20ACu).ToACP(buf, sizeof buf), 1u);
  EXPECT_STREQ(buf, "\x80");
  EXPECT_EQ(Char(0x1F600u).ToCP(CP_UTF8, nullptr, 0), 4u) << "measuring";
  EXPECT_EQ(Char(0x1F600u).ToCP(CP_UTF8, buf, sizeof buf), 4u);
  EXPECT_STREQ(buf, "\xF0\x9F\x98\x80");
  EXPECT_EQ(Char(0x4E00u).ToACP(buf, sizeof buf), 1u) << "not in 1252: the default character";
  EXPECT_STREQ(buf, "?");

  std::memset(buf, 0x55, sizeof buf);
  win32::SetLastError(0);
  EXPECT_EQ(Char(0x20ACu).ToCP(CP_UTF8, buf, 2), 0u) << "three bytes do not fit in two";
  EXPECT_EQ(win32::GetLastError(), win32::ERROR_INSUFFICIENT_BUFFER);
  EXPECT_EQ(Char(u'A').ToCP(1252, buf, 1), 1u);
  EXPECT_EQ(buf[1], 0x55) << "no room, no terminator";
}

TEST(Char, DoubleByteAndUtf8ActiveCodePages) {
  {
    const ProcessCodePages japanese(932, 932);
    // Shift-JIS 82 A0 is U+3042 HIRAGANA LETTER A; 0x82 is a lead byte, 0xB1 a half-width
    // katakana (U+FF71) and a character of its own.
    EXPECT_EQ(Char("\x82\xA0").CharCode(), 0x3042u);
    EXPECT_EQ(Char('\x82').CharCode(), u'?') << "a lead byte alone";
    EXPECT_TRUE(Char(u'?') == '\x82');
    EXPECT_FALSE(Char(0x3042u) == '\x82');
    EXPECT_EQ(Char('\xB1').CharCode(), 0xFF71u);
    EXPECT_EQ(Char(1252, "\x82").CharCode(), 0x201Au) << "an explicit code page wins over the process's";
    char buf[4];
    EXPECT_EQ(Char(0x3042u).ToACP(nullptr, 0), 2u);
    EXPECT_EQ(Char(0x3042u).ToACP(buf, sizeof buf), 2u);
    EXPECT_STREQ(buf, "\x82\xA0");
    // A lead byte just before the terminator is converted alone, never with what lies beyond.
    std::unique_ptr<char[]> copy(new char[2]{'\x82', '\0'});
    EXPECT_NE(Char(copy.get()).CharCode(), 0x3042u);
  }
  const ProcessCodePages utf8(CP_UTF8, CP_UTF8);
  EXPECT_EQ(Char("\xC3\xA9").CharCode(), 0xE9u) << "CP_ACP is UTF-8: the whole sequence";
  EXPECT_EQ(Char('\xC3').CharCode(), u'?') << "one byte of a sequence is no character";
  EXPECT_EQ(Char('z').CharCode(), u'z');
}

TEST(Char, CharacterSets) {
  const MCHAR set[] = u"ab\U0001F600c\U0001F601";
  EXPECT_EQ(Char(u'c').IsInCharacterSet(set), set + 4);
  EXPECT_EQ(Char(0x1F600u).IsInCharacterSet(set), set + 2);
  EXPECT_EQ(Char(0x1F601u).IsInCharacterSet(set), set + 5);
  EXPECT_EQ(Char(u'z').IsInCharacterSet(set), nullptr);
  EXPECT_EQ(Char(0xDE00u).IsInCharacterSet(set), nullptr) << "the trail half of a pair is no character of the set";
  EXPECT_EQ(Char().IsInCharacterSet(set), nullptr);
  EXPECT_EQ(Char(u'a').IsInCharacterSet(nullptr), nullptr);

  // A lead surrogate as the last unit of the set ends the walk at the terminator.
  std::unique_ptr<MCHAR[]> odd(new MCHAR[3]{u'a', 0xD83D, 0});
  EXPECT_EQ(Char(u'b').IsInCharacterSet(odd.get()), nullptr);
  EXPECT_EQ(Char(0xD83Du).IsInCharacterSet(odd.get()), odd.get() + 1);
}
