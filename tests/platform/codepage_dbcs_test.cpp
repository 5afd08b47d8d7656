// Double-byte code pages (932, 936, 949, 950) against ICU, their lead bytes and invalid input,
// and the stateful code pages (ISO-2022-JP 50222, ISO-2022-KR 50225, UTF-7).

#include <gtest/gtest.h>
#include <unicode/ucnv.h>

#include <string>

#include "codepage_test_support.h"

namespace {

using namespace win32;
using codepage_test::Decode;
using codepage_test::Encode;

struct DoubleBytePage {
  UINT codePage;
  const char* icuName;
  char16_t unicodeDefault;  // CPINFO line of Microsoft's bestfit9xx.txt
};

const DoubleBytePage kPages[] = {
    {932, "ibm-943_P15A-2003", 0x30FB},  // bestfit932.txt: KATAKANA MIDDLE DOT
    {936, "windows-936-2000", u'?'},
    {949, "windows-949-2000", u'?'},
    {950, "windows-950-2000", u'?'},
};

// Lead bytes as ICU's converter has them, in IsDBCSLeadByteEx and in GetCPInfo's ranges. Every
// lead/trail pair: where ICU (with its fallbacks) has a character, the same one; where it has
// none, the code page's default character, or failure with MB_ERR_INVALID_CHARS. Every character
// converts back to bytes that decode to it again.
TEST(CodePageDoubleByte, LeadBytesAndEveryPairAgainstIcu) {
  for (const DoubleBytePage& page : kPages) {
    SCOPED_TRACE(page.codePage);
    UErrorCode error = U_ZERO_ERROR;
    UConverter* cnv = ucnv_open(page.icuName, &error);
    UBool starters[256];
    ucnv_getStarters(cnv, starters, &error);
    ucnv_setFallback(cnv, TRUE);
    ucnv_setToUCallBack(cnv, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
    ASSERT_TRUE(U_SUCCESS(error));
    CPINFO info;
    ASSERT_TRUE(GetCPInfo(page.codePage, &info));
    EXPECT_EQ(info.MaxCharSize, 2u);
    EXPECT_EQ(info.DefaultChar[0], '?');
    int mapped = 0;
    for (int lead = 0; lead < 256; ++lead) {
      SCOPED_TRACE(lead);
      bool inRanges = false;
      for (int i = 0; i + 1 < static_cast<int>(MAX_LEADBYTES) && info.LeadByte[i] != 0; i += 2) {
        inRanges |= lead >= info.LeadByte[i] && lead <= info.LeadByte[i + 1];
      }
      EXPECT_EQ(inRanges, bool(starters[lead]));
      ASSERT_EQ(IsDBCSLeadByteEx(page.codePage, static_cast<BYTE>(lead)) != FALSE, bool(starters[lead]));
      if (!starters[lead]) continue;
      for (int trail = 1; trail < 256; ++trail) {
        const char pair[2] = {static_cast<char>(lead), static_cast<char>(trail)};
        UChar reference[4];
        error = U_ZERO_ERROR;
        ucnv_reset(cnv);
        const int32_t n = ucnv_toUChars(cnv, reference, 4, pair, 2, &error);
        MCHAR got[2] = {0, 0};
        ASSERT_EQ(MultiByteToWideChar(page.codePage, 0, pair, 2, got, 2), 1) << trail;
        if (U_SUCCESS(error) && n == 1) {
          ++mapped;
          ASSERT_EQ(got[0], reference[0]) << trail;
          ASSERT_EQ(Decode(page.codePage, Encode(page.codePage, std::u16string(1, got[0]))), std::u16string(1, got[0]));
        } else {
          ASSERT_EQ(got[0], page.unicodeDefault) << trail;
          ASSERT_EQ(MultiByteToWideChar(page.codePage, MB_ERR_INVALID_CHARS, pair, 2, got, 2), 0);
          ASSERT_EQ(GetLastError(), ERROR_NO_UNICODE_TRANSLATION);
        }
      }
    }
    ucnv_close(cnv);
    EXPECT_GT(mapped, 7000);
  }
  // Known ranges: 932 0x81-0x9F and 0xE0-0xFC; the others 0x81-0xFE.
  CPINFO info;
  ASSERT_TRUE(GetCPInfo(932, &info));
  EXPECT_EQ(std::string(reinterpret_cast<char*>(info.LeadByte), 6), std::string("\x81\x9F\xE0\xFC\0\0", 6));
  EXPECT_FALSE(IsDBCSLeadByteEx(1252, 0x81));
  EXPECT_FALSE(IsDBCSLeadByteEx(CP_UTF8, 0xE3));
}

TEST(CodePageDoubleByte, InvalidSequences) {
  struct Row {
    const char* name;
    UINT codePage;
    std::string bytes;
    std::u16string expected;
  };
  const Row rows[] = {
      {"hiragana A", 932, "\x82\xA0", u"\u3042"},
      // bestfit932.txt MBTABLE: single bytes Windows adds to ICU's table.
      {"932 single 0x80", 932, "\x80", u"\u0080"},
      {"932 single 0xA0", 932, "\xA0", u"\uF8F0"},
      {"932 single 0xFD-0xFF", 932, "\xFD\xFE\xFF", u"\uF8F1\uF8F2\uF8F3"},
      {"932 halfwidth katakana", 932, "\xB1", u"\uFF71"},
      {"932 user-defined area", 932, "\xF0\x40", u"\uE000"},
      {"undefined pair", 932, "\x81\xAD", u"\u30FB"},
      {"trail byte out of range takes the pair", 932, "\x81\x20x", u"\u30FBx"},
      {"lone lead byte at the end", 932, "a\x81", u"a\u30FB"},
      {"lone lead byte before NUL", 932, std::string("\x81\0b", 3),
       std::u16string(u"\u30FB\0b", 3)},
      {"936 euro", 936, "\x80", u"\u20AC"},
      {"936 undefined 0xFF", 936, "\xFF", u"\uF8F5"},
      {"936 lone lead byte", 936, "\xB0", u"?"},
      {"949 hangul", 949, "\xB0\xA1", u"\uAC00"},
      {"950 big5", 950, "\xA4\x40", u"\u4E00"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(Decode(row.codePage, row.bytes), row.expected);
    const bool valid = row.expected.find(u'\u30FB') == std::u16string::npos &&
                       row.expected.find(u'?') == std::u16string::npos;
    SetLastError(0);
    const int strict = MultiByteToWideChar(row.codePage, MB_ERR_INVALID_CHARS, row.bytes.data(),
                                           static_cast<int>(row.bytes.size()), nullptr, 0);
    EXPECT_EQ(strict, valid ? static_cast<int>(row.expected.size()) : 0);
    if (!valid) {
      EXPECT_EQ(GetLastError(), ERROR_NO_UNICODE_TRANSLATION);
    }
  }
}

TEST(CodePageDoubleByte, EncodingAndDefaultCharacters) {
  EXPECT_EQ(Encode(932, u"a\u3042\uFF71\u4E00"), "a\x82\xA0\xB1\x88\xEA");
  EXPECT_EQ(Encode(936, u"\u4E2D\u6587"), "\xD6\xD0\xCE\xC4");
  BOOL used = FALSE;
  char out[8];
  // A double-byte default character is written whole.
  EXPECT_EQ(WideCharToMultiByte(932, 0, u"x\U0001F600", 3, out, 8, "\x81\x45", &used), 5);
  EXPECT_EQ(std::string(out, 5), "x\x81\x45\x81\x45");
  EXPECT_TRUE(used);
}

TEST(CodePageStateful, RoundTripsAndRules) {
  const std::u16string japanese = u"ABC \u65E5\u672C\u8A9E \uFF71\uFF72 xyz";
  const std::string jis = Encode(50222, japanese);
  EXPECT_NE(jis.find("\x1B$B"), std::string::npos);  // JIS X 0208 designation
  EXPECT_NE(jis.find('\x0E'), std::string::npos);    // halfwidth katakana shifted in with SO
  EXPECT_EQ(Decode(50222, jis), japanese);
  // Characters outside JIS X 0208 become the default character rather than ISO-2022-JP-2 sets.
  EXPECT_EQ(Encode(50222, u"\u00E9"), "?");

  const std::u16string korean = u"Korean \uD55C\uAD6D\uC5B4.";
  const std::string kr = Encode(50225, korean);
  EXPECT_EQ(kr.substr(0, 4), "\x1B$)C");
  EXPECT_EQ(Decode(50225, kr), korean);

  const std::u16string mixed = u"Hi \u00E9\u20AC \U0001F600!";
  EXPECT_EQ(Decode(CP_UTF7, Encode(CP_UTF7, mixed)), mixed);
  EXPECT_EQ(Decode(CP_UTF7, "Hi Mom -+Jjo--!"), u"Hi Mom -\u263A-!");  // RFC 2152 example
  // A shift into base64 with nothing after it (found by the fuzzer): the conversion still
  // succeeds, with a replacement character, instead of returning 0 without an error.
  EXPECT_EQ(Decode(CP_UTF7, "+"), u"\uFFFD");
  // NUL passes through UTF-7 (a terminated text stays terminated); a buffer filled up to a
  // final piece that converts to nothing is big enough (also found by the fuzzer).
  EXPECT_EQ(Decode(CP_UTF7, std::string("\xFF\0+", 3)), std::u16string(u"\uFFFD\0", 2));

}

}  // namespace
