// Encoding detection: the static Detect on samples, the charset names, and what Open makes of
// real files in each encoding (the text read back is compared with the text written).

#include <gtest/gtest.h>

#include <cstdint>
#include <string>

#include "files/text_reader_test_support.h"
#include "support/process_code_pages.h"

namespace {

using namespace vyn::test::text;
using VynSDK::Util::TextFile::EncodingPreferUTF8;
using VynSDK::Util::TextFile::GetCodePageNumberFromString;

// Sample texts. The Japanese one mixes kanji, kana, ASCII and ideographic punctuation.
const std::u16string kEnglish = u"Hello, world.\r\nSecond line\r\n";
const std::u16string kJapanese = u"日本語のテキストです。\r\n設定ファイル version 2\r\n";
const std::u16string kFrench = u"Caf\u00e9 cr\u00e8me br\u00fbl\u00e9e\r\nna\u00efve\r\n";

std::string NoiseBytes(std::size_t n) {
  std::string bytes;
  std::uint32_t state = 12345;
  for (std::size_t i = 0; i < n; ++i) {
    state = state * 1103515245u + 12345u;
    bytes += static_cast<char>(state >> 24);
  }
  return bytes;
}

struct DetectRow {
  const char* name;
  std::string sample;
  UINT defaultEncoding;
  UINT expected;
  bool decided;
  std::size_t mark;
};

TEST(TextReaderDetect, Samples) {
  const std::string ascii = "plain ASCII text\r\n";
  const DetectRow rows[] = {
      // Byte-order marks.
      {"UTF-8 mark", "\xEF\xBB\xBFtext", 1252, 0x2000FDE9, true, 3},
      {"UTF-16 big-endian mark", std::string("\xFE\xFF\0A", 4), 0, 0xA000FDF4, true, 2},
      {"UTF-16 little-endian mark", std::string("\xFF\xFE" "A\0", 4), 0, 0x2000FDF4, true, 2},
      {"two bytes of the UTF-8 mark are no mark", "\xEF\xBB", 1252, 1252, false, 0},
      // "coding" declarations.
      {"coding: directly before the name", "# coding:iso-8859-15\n", 0, 0x40006FBD, true, 0},
      {"blank between colon and name", "# coding: iso-8859-15\n", 1252, 1252, false, 0},
      {"equals sign and quotation mark", "coding=\"shift_jis\"", 0, 0x400003A4, true, 0},
      {"XML declaration", "<?xml version=\"1.0\" encoding=\"windows-1252\"?>", 0, 0x400004E4, true, 0},
      {"blank lines before the declaration", "\r\n\n \t coding:utf-8\n", 0, 0x4000FDE9, true, 0},
      {"declaration in the second line is not seen", "first line\ncoding:utf-8\n", 1252, 1252, false, 0},
      {"Coding with a capital is not the word", "Coding:utf-8", 1252, 1252, false, 0},
      {"names compare without regard to case", "coding:UTF-8", 0, 0x4000FDE9, true, 0},
      {"also in their last letter", "coding:SHIFT_JIS", 0, 0x400003A4, true, 0},
      {"name followed by a semicolon", "coding:iso-8859-1;", 0, 0x40006FAF, true, 0},
      {"name followed by an Emacs line-end suffix", "coding:utf-8-unix", 0, 0x4000FDE9, true, 0},
      {"a longer name is another charset", "coding:iso-8859-10\n", 1252, 1252, false, 0},
      {"unknown name is ignored", "coding:latin-1\n", 1252, 1252, false, 0},
      {"declaration cut by the end of the sample", "coding:", 1252, 1252, false, 0},
      {"declaration wins over the UTF-8 test", "coding:big5\n\xC3\xA9", 0, 0x400003B6, true, 0},
      // UTF-8.
      {"UTF-8 with accents", Encode(65001, kFrench), 1252, 65001, true, 0},
      {"UTF-8 Japanese", Encode(65001, kJapanese), 932, 65001, true, 0},
      {"UTF-8 cut inside a sequence stays undecided", "caf\xC3", 1252, 1252, false, 0},
      {"pure ASCII keeps the default", ascii, 1252, 1252, false, 0},
      {"pure ASCII with the UTF-8 preference", ascii, 0x100004E4, 65001, false, 0},
      {"invalid UTF-8 keeps the preference flag", "\xE9t\xE9", 0x100004E4, 0x100004E4, false, 0},
      {"empty sample with the UTF-8 preference", "", EncodingPreferUTF8, 65001, false, 0},
      // UTF-16 without a mark.
      {"UTF-16 LE English", Utf16Bytes(kEnglish), 0, 65012, true, 0},
      {"UTF-16 BE English", Utf16Bytes(kEnglish, true), 0, 0x8000FDF4, true, 0},
      {"UTF-16 LE Japanese", Utf16Bytes(kJapanese), 932, 65012, true, 0},
      {"UTF-16 BE Japanese", Utf16Bytes(kJapanese, true), 932, 0x8000FDF4, true, 0},
      {"UTF-16 of one character", std::string("a\0", 2), 0, 65012, true, 0},
      {"UTF-16 of odd length is not UTF-16", Utf16Bytes(kEnglish) + "x", 1252, 1252, false, 0},
      // u"00 ": ASCII16 reads it little-endian, the controls test ('0' swapped is U+3000's
      // swapped form, U+0030) big-endian: the default's byte order is asked first.
      {"both orders pass: little-endian first", Utf16Bytes(u"00 "), 0, 65012, true, 0},
      {"both orders pass: big-endian default first", Utf16Bytes(u"00 "), 0x8000FDF4, 0x8000FDF4, true, 0},
      // 8-bit text holds no zero byte, so no UTF-16 test can pass on it.
      {"1252 text with CR LF", Encode(1252, kFrench), 1252, 1252, false, 0},
      {"Shift_JIS text", Encode(932, kJapanese), 932, 932, false, 0},
      {"binary noise", NoiseBytes(4096), 1252, 1252, false, 0},
      // Short samples.
      {"empty", "", 1252, 1252, false, 0},
      {"one byte", "a", 1252, 1252, false, 0},
      {"one byte that is no UTF-8", "\xFF", 1252, 1252, false, 0},
      {"three bytes", "abc", 1252, 1252, false, 0},
  };
  for (const DetectRow& row : rows) {
    SCOPED_TRACE(row.name);
    UINT encoding = row.defaultEncoding;
    std::size_t mark = 99;
    EXPECT_EQ(Reader::Detect(row.sample.data(), row.sample.size(), encoding, &mark), row.decided);
    EXPECT_EQ(encoding, row.expected) << std::hex << encoding;
    EXPECT_EQ(mark, row.mark);
  }
  UINT encoding = 1252;
  EXPECT_FALSE(Reader::Detect(nullptr, 10, encoding, nullptr)) << "a null sample is empty";
  EXPECT_EQ(encoding, 1252u);
}

TEST(TextReaderDetect, DoubleByteTextIsNotUtf16OnAJapaneseSystem) {
  ProcessCodePages japanese(932, 932);
  // Pure kanji in Shift_JIS, two bytes each: read big-endian, every pair is a CJK character.
  const std::string sjis = Encode(932, u"日本語");
  UINT encoding = 932;
  EXPECT_FALSE(Reader::Detect(sjis.data(), sjis.size(), encoding, nullptr));
  EXPECT_EQ(encoding, 932u);
}

TEST(TextReaderCharsetNames, EveryNameAndCase) {
  const struct {
    const char16_t* name;
    UINT codepage;
  } table[] = {
      {u"utf-8", 65001},       {u"windows-1252", 1252}, {u"iso-8859-13", 28603}, {u"iso-8859-15", 28605},
      {u"iso-8859-1", 28591},  {u"iso-8859-2", 28592},  {u"iso-8859-3", 28593},  {u"iso-8859-4", 28594},
      {u"iso-8859-5", 28595},  {u"iso-8859-6", 28596},  {u"iso-8859-7", 28597},  {u"iso-8859-8", 28598},
      {u"iso-8859-9", 28599},  {u"koi8-r", 20866},      {u"iso-2022-kr", 50225}, {u"iso-2022-jp", 50222},
      {u"shift_jis", 932},     {u"gb2312", 936},        {u"ks_c_5601", 949},     {u"big5", 950},
      {u"utf-16", 65012},      {u"UTF-8", 65001},       {u"Shift_JIS", 932},     {u"ISO-8859-15", 28605},
  };
  for (const auto& row : table) {
    UINT codepage = 0;
    EXPECT_TRUE(GetCodePageNumberFromString(row.name, codepage)) << std::u16string(row.name).size();
    EXPECT_EQ(codepage, row.codepage);
  }
  for (const char16_t* unknown : {u"utf8", u"utf-8 ", u"", u"iso-8859", u"latin-1"}) {
    UINT codepage = 7;
    EXPECT_FALSE(GetCodePageNumberFromString(unknown, codepage));
    EXPECT_EQ(codepage, 7u) << "left alone";
  }
  UINT codepage = 7;
  EXPECT_FALSE(GetCodePageNumberFromString(nullptr, codepage));
  EXPECT_EQ(codepage, 7u);
}

struct FileRow {
  const char* name;
  std::string bytes;
  UINT defaultEncoding;
  UINT encoding;
  std::size_t mark;
  std::u16string text;
};

// Real files: Open detects, skips the mark, and the whole text reads back as written, whole and
// one byte per read.
TEST(TextReaderDetect, FilesReadBackInTheirEncoding) {
  const FileRow rows[] = {
      {"UTF-16 BE with mark", "\xFE\xFF" + Utf16Bytes(kJapanese, true), 0, 0xA000FDF4, 2, kJapanese},
      {"UTF-16 BE without mark", Utf16Bytes(kJapanese, true), 0, 0x8000FDF4, 0, kJapanese},
      {"UTF-8 without mark", Encode(65001, kFrench), 1252, 65001, 0, kFrench},
      {"Shift_JIS by default", Encode(932, kJapanese), 932, 932, 0, kJapanese},
      {"Shift_JIS by declaration", "coding:shift_jis\r\n" + Encode(932, kJapanese), 1252,
       0x400003A4, 0, u"coding:shift_jis\r\n" + kJapanese},
      {"empty file", "", 1252, 1252, 0, u""},
      {"one byte", "a", 1252, 1252, 0, u"a"},
      {"three bytes", "ab\xE9", 1252, 1252, 0, u"ab\u00e9"},
      {"one UTF-16 character", std::string("a\0", 2), 1252, 65012, 0, u"a"},
      {"mark alone", "\xEF\xBB\xBF", 0, 0x2000FDE9, 3, u""},
  };
  vyn::test::TempDir dir;
  for (const FileRow& row : rows) {
    SCOPED_TRACE(row.name);
    const std::u16string path = dir.Write("sample.txt", row.bytes);
    for (const std::size_t blockSize : {std::size_t(4096), std::size_t(1)}) {
      Reader reader;
      reader.SetReadBufferSize(blockSize);
      ASSERT_TRUE(reader.Open(path.c_str(), row.defaultEncoding, VynSDK::Util::TextFile::LineEndNone));
      EXPECT_EQ(reader.Encoding(), row.encoding) << std::hex << reader.Encoding();
      EXPECT_EQ(reader.PositionBytes(), row.mark) << "the mark is passed before any read";
      EXPECT_EQ(reader.Position(), 0u);
      EXPECT_EQ(Text(reader.ReadFull()), row.text);
      EXPECT_TRUE(reader.IsEndOfFile());
    }
  }
}

}  // namespace
