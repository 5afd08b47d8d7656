// IsTextUnicode: each test on buffers made to pass or fail it, the result rule, and the
// statistics on real-world samples (English, Japanese and Russian UTF-16 in both byte orders
// against 8-bit text in 1252, Shift_JIS and UTF-8, and noise).

#include <gtest/gtest.h>

#include <cstdint>
#include <string>

#include "codepage_test_support.h"
#include "support/process_code_pages.h"
#include "win32/text_unicode.h"

namespace {

using namespace win32;

std::string Utf16(const std::u16string& text, bool bigEndian = false) {
  std::string bytes;
  for (const char16_t u : text) {
    bytes += static_cast<char>(bigEndian ? u >> 8 : u & 0xFF);
    bytes += static_cast<char>(bigEndian ? u & 0xFF : u >> 8);
  }
  return bytes;
}

std::string Narrow(UINT codepage, const std::u16string& text) { return codepage_test::Encode(codepage, text); }

// The tests of mask that bytes passes.
INT Passed(const std::string& bytes, INT mask) {
  INT result = mask;
  IsTextUnicode(bytes.data(), static_cast<int>(bytes.size()), &result);
  return result;
}

// Definitions of the tests (Win32 documentation, IsTextUnicode), one buffer each way.
TEST(IsTextUnicode, EachTest) {
  const struct {
    const char* name;
    std::string bytes;
    INT test;
    bool passes;
  } rows[] = {
      {"ASCII16: zero-extended ASCII", Utf16(u"Text\t1"), IS_TEXT_UNICODE_ASCII16, true},
      {"ASCII16: a unit above 0x7F", Utf16(u"Caf\u00e9"), IS_TEXT_UNICODE_ASCII16, false},
      {"ASCII16: a zero unit", Utf16(std::u16string(u"a\0b", 3)), IS_TEXT_UNICODE_ASCII16, false},
      {"REVERSE_ASCII16", Utf16(u"Text", true), IS_TEXT_UNICODE_REVERSE_ASCII16, true},
      {"REVERSE_ASCII16 on little-endian text", Utf16(u"Text"), IS_TEXT_UNICODE_REVERSE_ASCII16, false},
      {"CONTROLS: LF", Utf16(u"\u65e5\n"), IS_TEXT_UNICODE_CONTROLS, true},
      {"CONTROLS: IDEOGRAPHIC SPACE", Utf16(u"\u65e5\u3000\u672c"), IS_TEXT_UNICODE_CONTROLS, true},
      {"CONTROLS: big-endian digit zero reads as U+3000 but its space outweighs it",
       Utf16(u"0 0 ", true), IS_TEXT_UNICODE_CONTROLS, false},
      {"REVERSE_CONTROLS", Utf16(u"a b\r\n", true), IS_TEXT_UNICODE_REVERSE_CONTROLS, true},
      {"CONTROLS: none in 8-bit text", "two words\r\n", IS_TEXT_UNICODE_CONTROLS, false},
      {"SIGNATURE", Utf16(u"\ufeffx"), IS_TEXT_UNICODE_SIGNATURE, true},
      {"SIGNATURE only first", Utf16(u"x\ufeff"), IS_TEXT_UNICODE_SIGNATURE, false},
      {"REVERSE_SIGNATURE", Utf16(u"\ufeffx", true), IS_TEXT_UNICODE_REVERSE_SIGNATURE, true},
      {"ILLEGAL_CHARS: UNICODE_NUL", Utf16(std::u16string(u"ab\0", 3)), IS_TEXT_UNICODE_ILLEGAL_CHARS, true},
      {"ILLEGAL_CHARS: 0xFFFF", Utf16(u"a\uffff"), IS_TEXT_UNICODE_ILLEGAL_CHARS, true},
      {"ILLEGAL_CHARS: embedded reversed mark", Utf16(u"a\ufffe"), IS_TEXT_UNICODE_ILLEGAL_CHARS, true},
      {"ILLEGAL_CHARS: reversed mark first is a signature", Utf16(u"\ufffea"), IS_TEXT_UNICODE_ILLEGAL_CHARS, false},
      {"ILLEGAL_CHARS: CR LF packed into a unit", "ab\r\ncd", IS_TEXT_UNICODE_ILLEGAL_CHARS, true},
      {"ILLEGAL_CHARS: CR LF at an odd offset", "abc\r\nd", IS_TEXT_UNICODE_ILLEGAL_CHARS, false},
      {"ILLEGAL_CHARS: none", Utf16(u"a\r\n"), IS_TEXT_UNICODE_ILLEGAL_CHARS, false},
      {"ODD_LENGTH", "abc", IS_TEXT_UNICODE_ODD_LENGTH, true},
      {"ODD_LENGTH: even", "ab", IS_TEXT_UNICODE_ODD_LENGTH, false},
      {"NULL_BYTES", std::string("a\0", 2), IS_TEXT_UNICODE_NULL_BYTES, true},
      {"NULL_BYTES: none", "ab", IS_TEXT_UNICODE_NULL_BYTES, false},
      {"DBCS_LEADBYTE: not with a single-byte active code page", Narrow(932, u"日本語"), IS_TEXT_UNICODE_DBCS_LEADBYTE, false},
  };
  ProcessCodePages western(1252, 850);
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(Passed(row.bytes, row.test), row.passes ? row.test : 0);
  }
}

TEST(IsTextUnicode, DoubleByteLeadBytesUnderADoubleByteCodePage) {
  ProcessCodePages japanese(932, 932);
  EXPECT_EQ(Passed(Narrow(932, u"日本語のテキスト"), IS_TEXT_UNICODE_DBCS_LEADBYTE), IS_TEXT_UNICODE_DBCS_LEADBYTE);
  EXPECT_EQ(Passed(Narrow(932, u"日本語") + "\x93", IS_TEXT_UNICODE_DBCS_LEADBYTE), IS_TEXT_UNICODE_DBCS_LEADBYTE)
      << "a pair cut by the end of the sample";
  EXPECT_EQ(Passed("plain ASCII", IS_TEXT_UNICODE_DBCS_LEADBYTE), 0) << "no lead byte";
  EXPECT_EQ(Passed("\x93\x0A", IS_TEXT_UNICODE_DBCS_LEADBYTE), 0) << "LF is no trail byte";
  EXPECT_EQ(Passed(Utf16(u"日本語\r\n"), IS_TEXT_UNICODE_DBCS_LEADBYTE), 0) << "zero bytes";
}

TEST(IsTextUnicode, ResultRule) {
  const std::string le = Utf16(u"Hello\r\n");
  INT result = IS_TEXT_UNICODE_UNICODE_MASK;
  EXPECT_TRUE(IsTextUnicode(le.data(), static_cast<int>(le.size()), &result));
  EXPECT_EQ(result, IS_TEXT_UNICODE_ASCII16 | IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_CONTROLS);
  result = IS_TEXT_UNICODE_REVERSE_MASK;
  EXPECT_FALSE(IsTextUnicode(le.data(), static_cast<int>(le.size()), &result));
  EXPECT_EQ(result, 0);
  // A not-Unicode test that passes vetoes the Unicode tests asked with it.
  const std::string odd = le + "x";
  result = IS_TEXT_UNICODE_ASCII16 | IS_TEXT_UNICODE_ODD_LENGTH;
  EXPECT_FALSE(IsTextUnicode(odd.data(), static_cast<int>(odd.size()), &result));
  EXPECT_EQ(result, IS_TEXT_UNICODE_ASCII16 | IS_TEXT_UNICODE_ODD_LENGTH);
  // Not-Unicode tests alone: TRUE when one passes.
  result = IS_TEXT_UNICODE_NOT_UNICODE_MASK;
  EXPECT_TRUE(IsTextUnicode(odd.data(), static_cast<int>(odd.size()), &result));
  result = IS_TEXT_UNICODE_NOT_UNICODE_MASK;
  EXPECT_FALSE(IsTextUnicode(le.data(), static_cast<int>(le.size()), &result));
  // Without a request every test runs: UTF-16 in either order.
  EXPECT_TRUE(IsTextUnicode(le.data(), static_cast<int>(le.size()), nullptr));
  const std::string be = Utf16(u"Hello\r\n", true);
  EXPECT_TRUE(IsTextUnicode(be.data(), static_cast<int>(be.size()), nullptr));
  EXPECT_FALSE(IsTextUnicode("Hello\r\n", 7, nullptr));
  // Nothing to test.
  result = -1;
  EXPECT_FALSE(IsTextUnicode(nullptr, 10, &result));
  EXPECT_EQ(result, 0);
  result = IS_TEXT_UNICODE_ODD_LENGTH;
  EXPECT_FALSE(IsTextUnicode("a", 0, &result));
  EXPECT_EQ(result, 0);
}

// The statistics test must tell UTF-16 of real text from 8-bit text of the same words.
TEST(IsTextUnicode, StatisticsOnRealWorldSamples) {
  const std::u16string english = u"The quick brown fox jumps over the lazy dog.\r\nSecond line, 42 items.";
  const std::u16string japanese =
      u"日本語のテキストです。設定ファイルを読み込みます。漢字とかなが混ざった文章。";
  const std::u16string russian = u"Съешь же ещё этих мягких французских булок, да выпей чаю.";
  const std::u16string kanjiOnly = u"日本語文章";
  ProcessCodePages western(1252, 850);
  for (const std::u16string* text : {&english, &japanese, &russian, &kanjiOnly}) {
    SCOPED_TRACE(text->size());
    EXPECT_EQ(Passed(Utf16(*text), IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_REVERSE_STATISTICS),
              IS_TEXT_UNICODE_STATISTICS);
    EXPECT_EQ(Passed(Utf16(*text, true), IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_REVERSE_STATISTICS),
              IS_TEXT_UNICODE_REVERSE_STATISTICS);
  }
  const INT both = IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_REVERSE_STATISTICS;
  EXPECT_EQ(Passed(Utf16(u"\u00c4\u00c4\u00c4\u00c4"), both), IS_TEXT_UNICODE_STATISTICS)
      << "Latin-1 range text that never varies";
  const struct {
    const char* name;
    std::string bytes;
  } eightBit[] = {
      {"English", Narrow(1252, english)},
      {"the classic false positive", "Bush hid the facts"},
      {"1252 with accents and CR LF", Narrow(1252, u"Caf\u00e9 cr\u00e8me br\u00fbl\u00e9e\r\nna\u00efve gar\u00e7on\r\n")},
      {"German", Narrow(1252, u"Gr\u00fc\u00dfe aus M\u00fcnchen, sch\u00f6ne Stra\u00dfe")},
      {"Shift_JIS with ASCII", Narrow(932, u"設定: value = 12\r\n名前 = テスト\r\n")},
      {"UTF-8 Japanese", Narrow(65001, japanese)},
      {"UTF-8 Russian", Narrow(65001, russian)},
  };
  for (const auto& row : eightBit) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(Passed(row.bytes, both), 0);
    EXPECT_EQ(Passed(row.bytes + " ", both), 0) << "shifted by one byte";
  }
  std::string noise;
  std::uint32_t state = 7;
  for (int i = 0; i < 4096; ++i) noise += static_cast<char>((state = state * 1664525u + 1013904223u) >> 24);
  EXPECT_EQ(Passed(noise, IS_TEXT_UNICODE_UNICODE_MASK | IS_TEXT_UNICODE_REVERSE_MASK), 0)
      << "no test passes on noise";
  // Noise that happens to hold more control units one way than the other is still no text.
  noise += Utf16(u"\n\n\n\n");
  EXPECT_EQ(Passed(noise, IS_TEXT_UNICODE_CONTROLS), 0);
}

}  // namespace
