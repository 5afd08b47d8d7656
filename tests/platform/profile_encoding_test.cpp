// Profile files in the ANSI code page (single- and double-byte) and in UTF-16 LE: decoded by the
// process code page, written back in the file's own encoding, untouched bytes kept as they were.
// Expected characters are checked against the code pages' published tables (windows-1252,
// Shift-JIS 932) by their Unicode names.

#include <gtest/gtest.h>

#include "support/process_code_pages.h"
#include "profile_test_support.h"
#include "win32/profile.h"

namespace {

using namespace vyn::test;
using namespace win32;

std::string Utf16Le(std::u16string_view text) {
  std::string bytes = "\xFF\xFE";
  for (char16_t unit : text) {
    bytes += static_cast<char>(unit & 0xFF);
    bytes += static_cast<char>(unit >> 8);
  }
  return bytes;
}

BOOL Set(const MCHAR* section, const MCHAR* key, const MCHAR* value, const std::u16string& file) {
  return WritePrivateProfileStringW(section, key, value, file.c_str());
}

}  // namespace

// [docs] WritePrivateProfileString: a file created with Unicode characters gets Unicode ones.
TEST(ProfileEncoding, Utf16FilesStayUtf16) {
  TempDir dir;
  // LATIN SMALL LETTER U WITH DIAERESIS, SHARP S; CJK "day" "book"; GRINNING FACE (a pair).
  const std::u16string text = u"[Gr\u00FC\u00DFe]\r\nname=\u65E5\u672C \U0001F600\r\n; \u00E9\r\n[b]\r\n";
  const std::u16string file = dir.Write("u.ini", Utf16Le(text));
  EXPECT_EQ(Value(u"GR\u00DC\u00DFE", u"NAME", file), u"\u65E5\u672C \U0001F600");
  const std::u16string names = u"Gr\u00FC\u00DFe\0b\0\0"s;
  EXPECT_EQ(Prefix(GetString(nullptr, nullptr, nullptr, 20, file).buffer, names.size()), names);

  // A lone surrogate is stored as it is and reads back the same.
  ASSERT_TRUE(Set(u"gr\u00FC\u00DFe", u"new", u"\u00E9\xD800x", file));
  EXPECT_EQ(Bytes(dir, "u.ini"),
            Utf16Le(u"[Gr\u00FC\u00DFe]\r\nname=\u65E5\u672C \U0001F600\r\nnew=\u00E9\xD800x\r\n; \u00E9\r\n[b]\r\n"));
  EXPECT_EQ(Value(u"Gr\u00FC\u00DFe", u"new", file), u"\u00E9\xD800x");
}

TEST(ProfileEncoding, Windows1252Files) {
  ProcessCodePages pin(1252, 850);
  TempDir dir;
  const std::string before = "[Stra\xDF" "e]\r\nk=\xE4\r\n";
  const std::u16string file = dir.Write("a.ini", before);
  EXPECT_EQ(Value(u"stra\u00DFe", u"k", file), u"\u00E4");  // LATIN SMALL LETTER A WITH DIAERESIS
  // Text the code page cannot hold is refused: Windows writes '?' for it and reports success.
  SetLastError(0);
  EXPECT_FALSE(Set(u"Stra\u00DFe", u"k", u"\u00FC\u65E5", file));
  EXPECT_EQ(GetLastError(), ERROR_NO_UNICODE_TRANSLATION);
  EXPECT_FALSE(Set(u"\u0101", u"k", u"v", file));  // LATIN SMALL LETTER A WITH MACRON: no best fit
  EXPECT_EQ(Bytes(dir, "a.ini"), before);
  ASSERT_TRUE(Set(u"Stra\u00DFe", u"k", u"\u00FC", file));  // LATIN SMALL LETTER U WITH DIAERESIS
  EXPECT_EQ(Bytes(dir, "a.ini"), "[Stra\xDF" "e]\r\nk=\xFC\r\n");
  // A new file is ANSI text, without a byte-order mark.
  ASSERT_TRUE(Set(u"s", u"k", u"\u00FC", dir.File("new.ini")));
  EXPECT_EQ(Bytes(dir, "new.ini"), "[s]\r\nk=\xFC\r\n");

  // [re] A UTF-8 mark spoils the first line; the rest is read as ANSI, and stays as it was.
  const std::string utf8 = "\xEF\xBB\xBF[first]\r\nk=1\r\n[second]\r\nk=\xC3\xA4\r\n";
  const std::u16string marked = dir.Write("m.ini", utf8);
  EXPECT_EQ(Value(u"first", u"k", marked), u"<default>");
  EXPECT_EQ(Value(u"second", u"k", marked), u"\u00C3\u00A4");
  ASSERT_TRUE(Set(u"second", u"j", u"x", marked));
  EXPECT_EQ(Bytes(dir, "m.ini"), utf8 + "j=x\r\n");
}

// Shift-JIS: 0x83 0x5D is KATAKANA LETTER ZO, whose second byte is ']'; 0x83 0x5C is KATAKANA
// LETTER SO and 0x95 0x5C the CJK ideograph "table", whose second bytes are '\'. Lines are
// understood after decoding, so the ']' inside a character does not end a section name.
TEST(ProfileEncoding, DoubleByteCodePage) {
  TempDir dir;
  const std::string before = "; \x81\r\n[\x83\x5D]\r\nkey=\x83\x5C\x95\x5C\r\nbad=\x81\r\n";
  const std::u16string file = dir.Write("j.ini", before);
  {
    ProcessCodePages pin(932, 932);
    EXPECT_EQ(Value(u"\u30BE", u"key", file), u"\u30BD\u8868");
    EXPECT_EQ(Prefix(GetString(nullptr, nullptr, nullptr, 10, file).buffer, 3), u"\u30BE\0\0"s);
    ASSERT_TRUE(Set(u"\u30BE", u"k2", u"\u8868", file));
    // The lone lead bytes stay exactly as they were.
    EXPECT_EQ(Bytes(dir, "j.ini"), before + "k2=\x95\x5C\r\n");
  }
  // The same unchanged file under another code page is decoded anew, not served from the cache.
  ProcessCodePages pin(1252, 850);
  // LATIN SMALL LETTER F WITH HOOK, then ']' ends the name.
  EXPECT_EQ(Value(u"\u0192", u"key", file), u"\u0192\\\u2022\\");  // U+2022 BULLET
}
